#include "session.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iterator>

namespace carnet_tool {
namespace {

// Line of a byte offset, counted from 1.
long LineOf(const std::string& text, size_t offset) {
    return 1 + static_cast<long>(std::count(text.begin(), text.begin() + static_cast<long>(offset), '\n'));
}

std::string HexByte(unsigned char c) {
    static const char digits[] = "0123456789ABCDEF";
    return std::string("0x") + digits[c >> 4] + digits[c & 15];
}

std::string CodePoint(unsigned long cp) {
    std::string text = "U+";
    char digits[16];
    int n = 0;
    do {
        digits[n++] = "0123456789ABCDEF"[cp & 15];
        cp >>= 4;
    } while (cp != 0 || n < 4);
    while (n > 0) text += digits[--n];
    return text;
}

// The refusal of a character that code page 1252 cannot hold: its code
// point, and the character itself when the terminal can show it.
void SayUnheld(const std::string& context, const std::string& what, const Unheld& unheld) {
    Say(context, what + "code page 1252 has no place for the character " + CodePoint(unheld.codePoint),
        CurrentSession().output == Encoding::Utf8 ? " \"" + unheld.character + "\"" : std::string());
}

bool Fail(const std::string& context, const std::string& text) {
    Say(context, text);
    return false;
}

}  // namespace

Session& CurrentSession() {
    static Session session;
    return session;
}

void Say(const std::string& context, std::string_view text, std::string_view shown) {
    std::fflush(stdout);
    std::string line = context + ": " + ForOutput(text, CurrentSession().output);
    std::replace(line.begin(), line.end(), '\n', ' ');
    line += shown;
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), stderr);
}

std::string Plural(long n, const char* word) {
    return std::to_string(n) + " " + word + (n == 1 ? "" : "s");
}

bool Readable(const std::string& path) {
    std::FILE* f = std::fopen(path.c_str(), "rb");
    if (!f) return Fail(path, std::string("cannot read: ") + std::strerror(errno));
    struct stat st;
    const bool folder = ::fstat(fileno(f), &st) == 0 && S_ISDIR(st.st_mode);
    std::fclose(f);
    if (folder) return Fail(path, std::string("cannot read: ") + std::strerror(EISDIR));
    return true;
}

int ReadInput(const std::string& path, std::string& cp1252, bool& converted) {
    converted = false;
    if (!Readable(path)) return kUnreadable;
    std::ifstream in(path, std::ios::binary);
    std::string bytes((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
    if (in.bad()) {
        Say(path, std::string("cannot read: ") + std::strerror(errno));
        return kUnreadable;
    }
    const Encoding encoding = CurrentSession().input;
    size_t bad = 0;
    const bool utf8 = IsUtf8(bytes, bad);
    if (encoding == Encoding::Utf8 && !utf8) {
        Say(path + ":" + std::to_string(LineOf(bytes, bad)),
            "not UTF-8 (byte " + HexByte(static_cast<unsigned char>(bytes[bad])) +
                "); --encoding cp1252 reads a code page 1252 file");
        return kRejected;
    }
    if (encoding == Encoding::Cp1252 || !utf8 || !HasHighBytes(bytes)) {
        cp1252 = std::move(bytes);
        return kOk;
    }
    // A byte order mark says UTF-8 and is no part of the text.
    std::string_view text(bytes);
    if (text.compare(0, 3, "\xEF\xBB\xBF") == 0) text.remove_prefix(3);
    Unheld unheld;
    if (!Cp1252Of(text, cp1252, unheld)) {
        SayUnheld(path + ":" + std::to_string(LineOf(bytes, unheld.offset + (bytes.size() - text.size()))),
                  "stopped, nothing written: ", unheld);
        return kRejected;
    }
    converted = true;
    return kOk;
}

bool FromTerminal(const std::string& what, const std::string& arg, std::string& cp1252) {
    size_t bad = 0;
    if (!HasHighBytes(arg) || !IsUtf8(arg, bad)) {
        cp1252 = arg;
        return true;
    }
    Unheld unheld;
    if (Cp1252Of(arg, cp1252, unheld)) return true;
    SayUnheld("carnet", what + ": ", unheld);
    return false;
}

int SourceOf(const std::string& path, std::string& source) {
    std::string bytes;
    bool converted = false;
    const int read = ReadInput(path, bytes, converted);
    source = path;
    if (read != kOk || !converted) return read;
    source = CurrentSession().store.PathOf("converted.geo");
    std::ofstream out(source, std::ios::binary | std::ios::trunc);
    out << bytes;
    if (!out.flush()) {
        Say(path, std::string("cannot convert in the scratch folder: ") + std::strerror(errno));
        return kUnreadable;
    }
    return kOk;
}

int LoadBook(const std::string& path, CCarnet& book, int& rejected) {
    rejected = 0;
    std::string source;
    const int read = SourceOf(path, source);
    if (read != kOk) return read;
    Session& session = CurrentSession();
    StreamWnd diagnostics(stderr, session.output, path + ": ");
    std::fflush(stdout);
    session.context = path;
    book.Load(&diagnostics, source, session.store.Location(), 0, nullptr);
    book.m_FileName = path;
    rejected = diagnostics.Rejected();
    return rejected > 0 ? kRejected : kOk;
}

int WriteOutput(const std::string& target, const std::function<bool(const std::string& path)>& write) {
    const std::string where = target.empty() ? std::string("standard output") : target;
    // A link is followed, so that the file it names is replaced, not the link.
    std::string file = target;
    struct stat st;
    if (!file.empty() && ::lstat(file.c_str(), &st) == 0 && S_ISLNK(st.st_mode)) {
        if (char* real = ::realpath(file.c_str(), nullptr)) {
            file = real;
            std::free(real);
        }
    }
    // Standard output, a device or a pipe cannot be replaced: the output is
    // made in the scratch folder and then copied into it.
    const bool stream =
        file.empty() || (::stat(file.c_str(), &st) == 0 && !S_ISREG(st.st_mode) && !S_ISDIR(st.st_mode));
    // Otherwise beside the target, so that the finished file takes its place
    // in one step.
    std::string temp = stream ? CurrentSession().store.PathOf("output-XXXXXX") : file + ".XXXXXX";
    const int fd = ::mkstemp(&temp[0]);
    if (fd < 0) {
        Say(where, std::string("cannot write: ") + std::strerror(errno));
        return kUnreadable;
    }
    ::close(fd);
    errno = 0;
    bool ok = write(temp);
    if (ok && stream) {
        std::fflush(stdout);
        std::FILE* out = file.empty() ? stdout : std::fopen(file.c_str(), "wb");
        std::ifstream in(temp, std::ios::binary);
        char chunk[1 << 16];
        ok = out != nullptr;
        while (ok && in) {
            in.read(chunk, sizeof chunk);
            const size_t n = static_cast<size_t>(in.gcount());
            ok = std::fwrite(chunk, 1, n, out) == n;
        }
        if (out) ok = (out == stdout ? std::fflush(out) : std::fclose(out)) == 0 && ok;
    } else if (ok) {
        // Keep the permissions of a file that is replaced.
        const mode_t mask = ::umask(0);
        ::umask(mask);
        ::chmod(temp.c_str(), ::stat(file.c_str(), &st) == 0 ? st.st_mode & 07777 : 0666 & ~mask);
        ok = std::rename(temp.c_str(), file.c_str()) == 0;
    }
    const int error = errno;
    ::unlink(temp.c_str());
    if (!ok) {
        Say(where, std::string("cannot write: ") + std::strerror(error ? error : EIO) + "; nothing written");
        return kUnreadable;
    }
    return kOk;
}

}  // namespace carnet_tool
