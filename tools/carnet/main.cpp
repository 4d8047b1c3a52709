// carnet: command-line access to land-surveying field books.
//
// Exit status of every command: 0 when all went well, 1 when lines of a
// book were rejected, 2 when a file could not be read or written.
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include <CLI/CLI.hpp>

#include <carnet/carnet.h>

#include "terminal.h"

namespace {

using carnet_tool::Encoding;
using carnet_tool::ScratchStore;
using carnet_tool::StreamWnd;

constexpr int kOk = 0;
constexpr int kRejected = 1;
constexpr int kUnreadable = 2;

Encoding g_encoding = Encoding::Cp1252;

// The tool's own messages, on standard error.
void Say(const std::string& text) {
    std::fflush(stdout);
    std::string line = "carnet: " + carnet_tool::ForOutput(text, g_encoding) + "\n";
    std::fwrite(line.data(), 1, line.size(), stderr);
}

std::string Plural(int n, const char* word) {
    return std::to_string(n) + " " + word + (n == 1 ? "" : "s");
}

// Whether the file can be opened for reading, with the reason when not; the
// library would only say that it cannot.
bool Readable(const std::string& path) {
    std::FILE* f = std::fopen(path.c_str(), "rb");
    if (!f) {
        Say("cannot read " + path + ": " + std::strerror(errno));
        return false;
    }
    struct stat st;
    const bool folder = ::fstat(fileno(f), &st) == 0 && S_ISDIR(st.st_mode);
    std::fclose(f);
    if (folder) Say("cannot read " + path + ": " + std::strerror(EISDIR));
    return !folder;
}

// Loads a book, its diagnostics on standard error, each after the file's
// name. Its option lines go to the scratch store.
int LoadBook(const std::string& path, const ScratchStore& store, CCarnet& book, int& rejected) {
    rejected = 0;
    if (!Readable(path)) return kUnreadable;
    StreamWnd diagnostics(stderr, g_encoding, path + ": ");
    std::fflush(stdout);
    book.Load(&diagnostics, path, store.Location(), 0, nullptr);
    rejected = diagnostics.Rejected();
    return rejected > 0 ? kRejected : kOk;
}

int Check(const std::vector<std::string>& files, const ScratchStore& store) {
    int status = kOk;
    for (const std::string& path : files) {
        CCarnet book;
        int rejected = 0;
        const int result = LoadBook(path, store, book, rejected);
        status = std::max(status, result);
        if (result == kUnreadable)
            std::printf("%s: not read\n", path.c_str());
        else
            std::printf("%s: %s loaded, %s rejected\n", path.c_str(), Plural(book.length(), "element").c_str(),
                        Plural(rejected, "line").c_str());
        std::fflush(stdout);
    }
    return status;
}

int List(const std::string& path, bool numbers, const ScratchStore& store) {
    CCarnet book;
    int rejected = 0;
    const int status = LoadBook(path, store, book, rejected);
    if (status == kUnreadable) return status;
    StreamWnd listing(stdout, g_encoding);
    book.Print(&listing, numbers ? 1 : 0);
    return status;
}

std::string Contents(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// The library's backup says nothing when it fails; here a failed backup
// must stop the save that would overwrite the only copy.
bool BackUpDone(CCarnet& book) {
    const std::string target = book.m_FileName.str();
    struct stat st;
    if (::stat(target.c_str(), &st) != 0 || !S_ISREG(st.st_mode)) return true;  // nothing to keep
    book.BackUp();
    const std::string backup = target.size() < 3 ? "sbk" : target.substr(0, target.size() - 3) + "sbk";
    if (Contents(backup) == Contents(target)) return true;
    Say("cannot back up " + target + " to " + backup + "; nothing written");
    return false;
}

int Format(const std::string& path, const std::string& output, bool backup, const std::string& params,
           const ScratchStore& store) {
    CCarnet book;
    int rejected = 0;
    const int status = LoadBook(path, store, book, rejected);
    if (status == kUnreadable) return status;
    if (rejected > 0) {
        Say(path + ": " + Plural(rejected, "line") + " rejected; nothing written, they would be lost");
        return kRejected;
    }
    const std::string target = output.empty() ? path : output;
    book.m_FileName = target;
    if (backup && !BackUpDone(book)) return kUnreadable;
    if (!params.empty()) book.m_ParamFile = params;
    return book.Save(target, nullptr, false) ? kOk : kUnreadable;
}

}  // namespace

int main(int argc, char** argv) {
    CLI::App app{"carnet: inspect and maintain land-surveying field books (.geo files)"};
    app.set_version_flag("--version", "carnet 0.1.0");
    app.require_subcommand(0, 1);
    app.fallthrough();
    app.footer("Exit status: 0 when all went well, 1 when lines of a book were rejected,\n"
               "2 when a file could not be read or written.");
    std::string encoding = "auto";
    app.add_option("--encoding", encoding,
                   "Output texts as the file's code page 1252 bytes (cp1252) or as UTF-8 (utf8); "
                   "auto follows the locale")
        ->check(CLI::IsMember({"auto", "cp1252", "utf8"}))
        ->capture_default_str();

    std::vector<std::string> checkFiles;
    CLI::App* check = app.add_subcommand("check", "Load each book, report every rejected line and sum up");
    check->add_option("files", checkFiles, "Field-book files")->required();

    std::string listFile;
    bool numbers = false;
    CLI::App* list = app.add_subcommand("list", "Print the lines of a book");
    list->add_option("file", listFile, "Field-book file")->required();
    list->add_flag("-n,--numbers", numbers, "Number the lines as a saved file does");

    std::string formatFile, output, params;
    bool backup = false;
    CLI::App* format = app.add_subcommand(
        "format", "Load a book and save it again in the standard layout, its options first");
    format->add_option("file", formatFile, "Field-book file")->required();
    format->add_option("-o,--output", output, "Write here instead of over the file");
    format->add_flag("--backup", backup, "Copy the file to be overwritten to its .sbk backup first");
    format->add_option("--params", params,
                       "Write the options stored at this parameter location (a profile file or a "
                       "registry key) instead of the book's own");

    CLI11_PARSE(app, argc, argv);

    g_encoding = encoding == "utf8"     ? Encoding::Utf8
                 : encoding == "cp1252" ? Encoding::Cp1252
                                        : carnet_tool::EncodingOfLocale();
    SetMessageBoxHandler([](CWnd*, const char* text, const char*, unsigned int flags) {
        Say(text);
        return (flags & MB_YESNO) ? IDNO : IDOK;
    });

    if (app.get_subcommands().empty()) {
        std::printf("%s", app.help().c_str());
        return kOk;
    }
    ScratchStore store;
    if (!store.IsReady()) {
        Say(std::string("cannot create a temporary folder: ") + std::strerror(errno));
        return kUnreadable;
    }
    if (check->parsed()) return Check(checkFiles, store);
    if (list->parsed()) return List(listFile, numbers, store);
    return Format(formatFile, output, backup, params, store);
}
