// Temporary files and message capture for the loading tests.
#pragma once

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <string>
#include <vector>

#include <carnet/carnet.h>

class TempDir {
public:
    TempDir() {
        char tmpl[] = "/tmp/carnet-test-XXXXXX";
        const char* made = mkdtemp(tmpl);
        EXPECT_NE(made, nullptr);
        m_path = made ? made : "/tmp";
    }
    ~TempDir() { std::system(("rm -rf '" + m_path + "'").c_str()); }
    const std::string& path() const { return m_path; }
    std::string File(const std::string& name, const std::string& bytes) const {
        std::string p = m_path + "/" + name;
        std::FILE* f = std::fopen(p.c_str(), "wb");
        EXPECT_NE(f, nullptr);
        if (f) {
            std::fwrite(bytes.data(), 1, bytes.size(), f);
            std::fclose(f);
        }
        return p;
    }

private:
    std::string m_path;
};

// Collects the boxes shown while it lives and answers them.
class BoxCapture {
public:
    explicit BoxCapture(int answer = IDOK) {
        m_previous = SetMessageBoxHandler([this, answer](CWnd*, const char* text, const char* caption, unsigned) {
            boxes.push_back(std::string(caption) + "|" + text);
            return answer;
        });
    }
    ~BoxCapture() { SetMessageBoxHandler(m_previous); }
    std::vector<std::string> boxes;

private:
    MessageBoxHandler m_previous;
};

// Installs a file-dialog answer while it lives.
class DialogAnswer {
public:
    DialogAnswer(bool confirm, std::string path) {
        m_previous = SetFileDialogHandler([this, confirm, path](const FileDialogRequest& r, std::string& out) {
            requests.push_back(r);
            if (confirm) out = path;
            return confirm;
        });
    }
    ~DialogAnswer() { SetFileDialogHandler(m_previous); }
    std::vector<FileDialogRequest> requests;

private:
    FileDialogHandler m_previous;
};
