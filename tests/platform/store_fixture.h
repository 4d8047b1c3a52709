// A scratch folder for the tests of the stored parameters, with HOME,
// XDG_CONFIG_HOME and the registry folder pointed into it, so that no test
// reads or writes the settings of the user running it.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>
#include <iterator>
#include <string>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

#include <carnet/registry.h>

namespace store_test {

inline std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

inline void WriteFile(const std::string& path, const std::string& data) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out << data;
}

// Names of the entries of a folder, to see that no temporary file is left.
inline std::vector<std::string> Entries(const std::string& folder) {
    std::vector<std::string> names;
    for (const auto& entry : std::filesystem::directory_iterator(folder)) names.push_back(entry.path().filename());
    std::sort(names.begin(), names.end());
    return names;
}

// Runs fn in a child process in which no file may grow beyond limit bytes,
// the way a full disk stops a write halfway; returns what fn returned (an
// errno, under 256).
inline int WithFileSizeLimit(rlim_t limit, const std::function<int()>& fn) {
    pid_t pid = ::fork();
    if (pid == 0) {
        std::signal(SIGXFSZ, SIG_IGN);
        struct rlimit rl = {limit, limit};
        if (::setrlimit(RLIMIT_FSIZE, &rl) != 0) ::_exit(255);
        ::_exit(fn() & 0xFF);
    }
    int status = 0;
    if (pid < 0 || ::waitpid(pid, &status, 0) != pid || !WIFEXITED(status)) return -1;
    return WEXITSTATUS(status);
}

class StoreTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string pattern = (std::filesystem::temp_directory_path() / "carnet-store-XXXXXX").string();
        ASSERT_NE(::mkdtemp(&pattern[0]), nullptr);
        m_dir = pattern;
        Keep("HOME");
        Keep("XDG_CONFIG_HOME");
        ::setenv("HOME", Path("home").c_str(), 1);
        ::setenv("XDG_CONFIG_HOME", Path("config").c_str(), 1);
        SetRegistryFolder(Path("registry").c_str());
    }

    void TearDown() override {
        SetRegistryFolder(nullptr);
        for (const auto& kept : m_env) {
            if (kept.second.first)
                ::setenv(kept.first.c_str(), kept.second.second.c_str(), 1);
            else
                ::unsetenv(kept.first.c_str());
        }
        std::error_code ec;
        std::filesystem::remove_all(m_dir, ec);
    }

    std::string Path(const std::string& name) const { return m_dir + "/" + name; }
    const std::string& Dir() const { return m_dir; }

private:
    void Keep(const char* name) {
        const char* value = std::getenv(name);
        m_env.emplace_back(name, std::make_pair(value != nullptr, std::string(value ? value : "")));
    }

    std::string m_dir;
    std::vector<std::pair<std::string, std::pair<bool, std::string>>> m_env;
};

}  // namespace store_test
