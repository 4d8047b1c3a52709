#include "session.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <memory>

namespace carnet_tool {
namespace {

// Line of a byte offset, counted from 1.
long LineOf(std::string_view text, size_t offset) {
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

}  // namespace

Session& CurrentSession() {
    static Session session;
    return session;
}

CCarnet& FreshBook() {
    Session& session = CurrentSession();
    delete session.book;
    session.book = new CCarnet;
    return *session.book;
}

bool FlushOutput() {
    int& error = CurrentSession().outputError;
    errno = 0;
    if ((std::fflush(stdout) != 0 || std::ferror(stdout)) && error == 0) error = errno ? errno : EIO;
    return error == 0;
}

void Say(const std::string& context, std::string_view text, std::string_view shown) {
    FlushOutput();
    std::string line = context + ": " + ForOutput(ForDiagnostics(text), CurrentSession().output);
    std::replace(line.begin(), line.end(), '\n', ' ');
    line += shown;
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), stderr);
}

std::string Plural(long n, const char* word) {
    return std::to_string(n) + " " + word + (n == 1 ? "" : "s");
}

int ReadInput(const std::string& path, Input& input) {
    if (const int err = input.m_file.Read(path.c_str())) {
        Say(path, std::string("cannot read: ") +
                      (err == EFBIG ? "not a regular file, and longer than 256 MiB" : std::strerror(err)));
        return kUnreadable;
    }
    const std::string_view bytes = input.m_file.View();
    const Encoding encoding = CurrentSession().input;
    if (encoding == Encoding::Cp1252) return kOk;
    size_t bad = 0;
    const TextKind kind = KindOf(bytes, bad);
    if (encoding == Encoding::Utf8 && kind == TextKind::Other) {
        Say(path + ":" + std::to_string(LineOf(bytes, bad)),
            "not UTF-8 (byte " + HexByte(static_cast<unsigned char>(bytes[bad])) +
                "); --encoding cp1252 reads a code page 1252 file");
        return kRejected;
    }
    if (kind != TextKind::Utf8) return kOk;
    // A byte order mark says UTF-8 and is no part of the text.
    const size_t start = bytes.compare(0, 3, "\xEF\xBB\xBF") == 0 ? 3 : 0;
    size_t size = bytes.size();
    Unheld unheld;
    if (!Cp1252InPlace(input.m_file.Data(), start, size, unheld)) {
        SayUnheld(path + ":" + std::to_string(unheld.line), "stopped, nothing written: ", unheld);
        return kRejected;
    }
    input.m_file.Shrink(size);
    return kOk;
}

bool FromTerminal(const std::string& what, const std::string& arg, std::string& cp1252) {
    size_t bad = 0;
    if (KindOf(arg, bad) != TextKind::Utf8) {
        cp1252 = arg;
        return true;
    }
    Unheld unheld;
    if (Cp1252Of(arg, cp1252, unheld)) return true;
    SayUnheld("carnet", what + ": ", unheld);
    return false;
}

void Put(const std::string& cp1252) {
    const std::string text = ForOutput(cp1252, CurrentSession().output);
    std::fwrite(text.data(), 1, text.size(), stdout);
}

int LoadBook(const std::string& path, CCarnet& book, int& rejected, bool keepOptions) {
    rejected = 0;
    Session& session = CurrentSession();
    // A book only read has nowhere to keep its options: they are read and
    // checked, and stored nowhere (a write to no location fails unreported).
    std::string location;
    if (keepOptions) {
        location = session.store.Location();
        if (location.empty()) {
            Say("carnet", std::string("cannot create a temporary folder: ") + std::strerror(errno));
            return kUnreadable;
        }
    }
    Input input;
    const int read = ReadInput(path, input);
    if (read != kOk) return read;
    StreamWnd diagnostics(stderr, session.output, path + ": ", true);
    FlushOutput();
    session.context = path;
    book.LoadBytes(&diagnostics, input.Bytes(), location, 0, [&input](size_t done) { input.Release(done); });
    book.m_FileName = path;
    book.m_FileState = input.State();
    rejected = diagnostics.Rejected();
    return rejected > 0 ? kRejected : kOk;
}

int WriteOutput(const std::string& target, const std::function<bool(std::FILE*)>& write) {
    const std::string where = target.empty() ? std::string("standard output") : target;
    int err = 0;
    if (target.empty()) {
        // Made whole before it is shown: an unnamed file that vanishes with
        // the process, whatever ends it.
        std::unique_ptr<std::FILE, int (*)(std::FILE*)> temp(std::tmpfile(), std::fclose);
        errno = 0;
        if (!temp || !write(temp.get()) || std::fflush(temp.get()) != 0 || std::ferror(temp.get())) {
            err = errno ? errno : EIO;
        } else {
            std::rewind(temp.get());
            FlushOutput();
            char chunk[1 << 16];
            for (size_t n; err == 0 && (n = std::fread(chunk, 1, sizeof chunk, temp.get())) > 0;)
                if (std::fwrite(chunk, 1, n, stdout) != n) err = errno ? errno : EIO;
            if (err == 0 && !FlushOutput()) err = CurrentSession().outputError;
        }
    } else {
        err = CarnetWriteFile(target.c_str(), [&write](std::FILE* f) {
            errno = 0;
            return write(f) ? 0 : (errno ? errno : EIO);
        });
    }
    if (err != 0) {
        Say(where, std::string("cannot write: ") + std::strerror(err) + "; nothing written");
        return kUnreadable;
    }
    return kOk;
}

}  // namespace carnet_tool
