// What every fuzz target shares: a scratch folder for the files and stores
// it touches, silent message boxes, property checks that stop the run with
// the broken property on standard error, and small helpers over the input.
#pragma once

#include <unistd.h>

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <string>
#include <string_view>

#include <carnet/carnet.h>

#include "host/params_internal.h"

namespace carnet_fuzz {

// Printable form of a text for a report: bytes outside ASCII as \xNN.
inline std::string Shown(std::string_view s) {
    std::string out;
    for (unsigned char c : s) {
        if (c >= 0x20 && c < 0x7F && c != '\\') {
            out += static_cast<char>(c);
        } else {
            static const char hex[] = "0123456789ABCDEF";
            out += "\\x";
            out += hex[c >> 4];
            out += hex[c & 0xF];
        }
    }
    return out;
}

[[noreturn]] inline void Broken(const char* what, const char* file, int line, const std::string& detail) {
    std::fprintf(stderr, "%s:%d: property broken: %s\n%s", file, line, what, detail.c_str());
    std::fflush(stderr);
    std::abort();
}

// The folder every target works in, made once per process in memory when
// the machine offers it (the stores sync each file they write), or under
// $CARNET_FUZZ_SCRATCH, and removed at exit.
class Scratch {
public:
    static Scratch& Get() {
        static Scratch scratch;
        return scratch;
    }
    const std::string& Dir() const { return m_dir; }
    std::string Path(const char* name) const { return m_dir + "/" + name; }

    // Forgets every stored parameter and the store's memory of failures, so
    // that each input starts from the same state.
    void ResetStores() const {
        std::error_code ec;
        std::filesystem::remove(Path("params.ini"), ec);
        std::filesystem::remove_all(Path("registry"), ec);
        carnet_params::ForgetLastLocation();
    }

    // Writes bytes to a file of the scratch folder and returns its path.
    std::string File(const char* name, const uint8_t* data, size_t size) const {
        const std::string path = Path(name);
        std::FILE* f = std::fopen(path.c_str(), "wb");
        if (!f) Broken("scratch file cannot be written", __FILE__, __LINE__, path + "\n");
        if (size > 0 && std::fwrite(data, 1, size, f) != size)
            Broken("scratch file cannot be written", __FILE__, __LINE__, path + "\n");
        std::fclose(f);
        return path;
    }

private:
    Scratch() {
        std::error_code ec;
        std::filesystem::path base =
            std::filesystem::is_directory("/dev/shm", ec) ? "/dev/shm" : std::filesystem::temp_directory_path(ec);
        // A run that aborts on a finding cannot clean up: fuzz/run.sh names
        // a folder of its own and removes it afterwards.
        if (const char* chosen = std::getenv("CARNET_FUZZ_SCRATCH"); chosen && *chosen) {
            base = chosen;
            std::filesystem::create_directories(base, ec);
        }
        std::string pattern = (base / "carnet-fuzz-XXXXXX").string();
        if (!::mkdtemp(&pattern[0])) Broken("no scratch folder", __FILE__, __LINE__, pattern + "\n");
        m_dir = pattern;
        SetRegistryFolder(Path("registry").c_str());
        // Boxes answer at once and say nothing: a fuzz run shows thousands.
        SetMessageBoxHandler([](CWnd*, const char*, const char*, unsigned int flags) {
            return (flags & MB_YESNO) == MB_YESNO ? IDNO : IDOK;
        });
    }
    ~Scratch() {
        std::error_code ec;
        std::filesystem::remove_all(m_dir, ec);
    }

    std::string m_dir;
};

// Takes the input from the front: single bytes for choices, then texts.
class Input {
public:
    Input(const uint8_t* data, size_t size) : m_data(reinterpret_cast<const char*>(data), size) {}

    // The next byte, or 0 once the input is used up.
    unsigned int Byte() {
        if (m_data.empty()) return 0;
        const unsigned char c = static_cast<unsigned char>(m_data.front());
        m_data.remove_prefix(1);
        return c;
    }
    // The text up to the next separator byte (dropped), or the rest.
    std::string_view Until(char sep) {
        const size_t at = m_data.find(sep);
        std::string_view part = m_data.substr(0, at);
        m_data.remove_prefix(at == std::string_view::npos ? m_data.size() : at + 1);
        return part;
    }
    std::string_view Rest() {
        std::string_view rest = m_data;
        m_data = {};
        return rest;
    }
    bool Empty() const { return m_data.empty(); }

private:
    std::string_view m_data;
};

// Everything Write puts in a stream, as bytes.
inline std::string Written(CCarnet& book, int n) {
    char* buffer = nullptr;
    size_t size = 0;
    std::FILE* f = ::open_memstream(&buffer, &size);
    if (!f) Broken("no memory stream", __FILE__, __LINE__, "");
    book.Write(f, n);
    std::fclose(f);
    std::string out(buffer, size);
    std::free(buffer);
    return out;
}

// Every reading member on every element: none may fail or touch memory that
// is not its own, whatever the element holds.
inline void QueryEveryElement(CCarnet& book) {
    CNorvexTxtWnd wnd;
    book.Print(&wnd, 1);
    for (int i = 0; i < book.length(); ++i) {
        const CString np = book.matAt(i);
        book.symAt(i);
        book.parAt(i);
        book.cmdAt(i);
        book.xAt(i);
        book.zAt(i);
        book.hpAt(i);
        book.dhAt(i);
        book.findER(i, 0);
        book.findAppAt(i);
        CString station;
        book.findRepAt(i, station);
        book.isObsAltiAt(i, 1);
        book.hasXYZ(i);
        book.zFor(i);
        book.Find(book.typAt(i), np, 0, 0);
    }
}

}  // namespace carnet_fuzz

#define FUZZ_CHECK(cond)                                                     \
    do {                                                                     \
        if (!(cond)) ::carnet_fuzz::Broken(#cond, __FILE__, __LINE__, ""); \
    } while (0)

// Two texts that must be equal; both are shown when they are not.
#define FUZZ_CHECK_SAME(a, b)                                                                             \
    do {                                                                                                  \
        const std::string fuzzA_{a}, fuzzB_{b};                                                           \
        if (fuzzA_ != fuzzB_)                                                                             \
            ::carnet_fuzz::Broken(#a " == " #b, __FILE__, __LINE__,                                       \
                                  "  " + ::carnet_fuzz::Shown(fuzzA_) + "\n  " + ::carnet_fuzz::Shown(fuzzB_) + "\n"); \
    } while (0)
