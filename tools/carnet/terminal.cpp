#include "terminal.h"

#include <dirent.h>
#include <fcntl.h>
#include <iconv.h>
#include <langinfo.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <clocale>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>

namespace carnet_tool {
namespace {

const char kRejectedMark[] = "Erreur ligne ";
const char kReplacement[] = "\xEF\xBF\xBD";

// One conversion descriptor per direction, opened once: a listing converts
// every line it prints.
class Converter {
public:
    Converter(const char* to, const char* from) : m_cd(::iconv_open(to, from)) {
        if (m_cd == reinterpret_cast<iconv_t>(-1)) {
            std::fprintf(stderr, "carnet: the C library cannot convert from %s to %s\n", from, to);
            std::exit(2);
        }
    }
    ~Converter() { ::iconv_close(m_cd); }
    Converter(const Converter&) = delete;
    Converter& operator=(const Converter&) = delete;

    // Converts as far as it can; returns the number of input bytes used.
    // `error` is 0 when the whole text was converted, else the errno.
    size_t Run(std::string_view in, std::string& out, int& error) {
        ::iconv(m_cd, nullptr, nullptr, nullptr, nullptr);
        char* src = const_cast<char*>(in.data());
        size_t left = in.size();
        error = 0;
        char chunk[256];
        while (left > 0) {
            char* dst = chunk;
            size_t room = sizeof chunk;
            const size_t done = ::iconv(m_cd, &src, &left, &dst, &room);
            out.append(chunk, static_cast<size_t>(dst - chunk));
            if (done == static_cast<size_t>(-1) && errno != E2BIG) {
                error = errno;
                break;
            }
        }
        return in.size() - left;
    }

private:
    iconv_t m_cd;
};

Converter& ToUtf8() {
    static Converter converter("UTF-8", "CP1252");
    return converter;
}

Converter& ToCp1252() {
    static Converter converter("CP1252", "UTF-8");
    return converter;
}

// Length of the UTF-8 sequence that starts with this byte, 0 for a byte that
// cannot start one.
size_t SequenceLength(unsigned char c) {
    if (c < 0x80) return 1;
    if (c >= 0xC2 && c <= 0xDF) return 2;
    if (c >= 0xE0 && c <= 0xEF) return 3;
    if (c >= 0xF0 && c <= 0xF4) return 4;
    return 0;
}

}  // namespace

Encoding EncodingOfLocale() {
    Encoding encoding = Encoding::Cp1252;
    if (std::setlocale(LC_CTYPE, "")) {
        if (std::strcmp(nl_langinfo(CODESET), "UTF-8") == 0) encoding = Encoding::Utf8;
        std::setlocale(LC_CTYPE, "C");
    }
    return encoding;
}

// Whether any of the 8 bytes from p is beyond ASCII.
bool AnyHigh8(const char* p) {
    std::uint64_t word;
    std::memcpy(&word, p, sizeof word);
    return (word & 0x8080808080808080ull) != 0;
}

bool HasHighBytes(std::string_view text) {
    size_t i = 0;
    for (; i + 8 <= text.size(); i += 8)
        if (AnyHigh8(text.data() + i)) return true;
    for (; i < text.size(); ++i)
        if (static_cast<unsigned char>(text[i]) >= 0x80) return true;
    return false;
}

TextKind KindOf(std::string_view text, size_t& bad) {
    bool high = false;
    for (size_t i = 0; i < text.size();) {
        // Runs of ASCII, the whole of most books, eight bytes at a time.
        if (i + 8 <= text.size() && !AnyHigh8(text.data() + i)) {
            i += 8;
            continue;
        }
        const unsigned char c = static_cast<unsigned char>(text[i]);
        const size_t n = SequenceLength(c);
        bool ok = n > 0 && i + n <= text.size();
        for (size_t k = 1; ok && k < n; ++k) ok = (static_cast<unsigned char>(text[i + k]) & 0xC0) == 0x80;
        if (ok && n >= 3) {
            // No overlong forms, no surrogates, nothing beyond U+10FFFF.
            const unsigned char d = static_cast<unsigned char>(text[i + 1]);
            ok = !(c == 0xE0 && d < 0xA0) && !(c == 0xED && d >= 0xA0) && !(c == 0xF0 && d < 0x90) &&
                 !(c == 0xF4 && d >= 0x90);
        }
        if (!ok) {
            bad = i;
            return TextKind::Other;
        }
        high = high || n > 1;
        i += n;
    }
    return high ? TextKind::Utf8 : TextKind::Ascii;
}

std::string Utf8Of(std::string_view cp1252) {
    if (!HasHighBytes(cp1252)) return std::string(cp1252);
    std::string out;
    out.reserve(cp1252.size() + cp1252.size() / 4);
    while (!cp1252.empty()) {
        int error = 0;
        const size_t used = ToUtf8().Run(cp1252, out, error);
        cp1252.remove_prefix(used);
        if (error == 0) break;
        out += kReplacement;  // an unassigned byte
        cp1252.remove_prefix(1);
    }
    return out;
}

bool Cp1252InPlace(char* text, size_t start, size_t& size, Unheld& unheld) {
    // Runs of ASCII move as they are; each run of other characters goes
    // through iconv. Code page 1252 never takes more bytes than UTF-8, so
    // what is written never passes what is still to be read.
    size_t from = start, to = 0;
    std::string converted;
    while (from < size) {
        size_t ascii = from;
        while (ascii + 8 <= size && !AnyHigh8(text + ascii)) ascii += 8;
        while (ascii < size && static_cast<unsigned char>(text[ascii]) < 0x80) ++ascii;
        std::memmove(text + to, text + from, ascii - from);
        to += ascii - from;
        from = ascii;
        size_t end = from;
        while (end < size && static_cast<unsigned char>(text[end]) >= 0x80) ++end;
        if (end == from) break;
        converted.clear();
        int error = 0;
        const size_t used = ToCp1252().Run(std::string_view(text + from, end - from), converted, error);
        if (error != 0) {
            const std::string_view rest(text + from + used, end - from - used);
            const size_t n = std::max<size_t>(1, SequenceLength(static_cast<unsigned char>(rest[0])));
            unheld.character.assign(rest.substr(0, n));
            const unsigned char lead = static_cast<unsigned char>(unheld.character[0]);
            unsigned long cp = n == 1 ? lead : lead & (0x7F >> n);
            for (size_t k = 1; k < unheld.character.size(); ++k)
                cp = (cp << 6) | (static_cast<unsigned char>(unheld.character[k]) & 0x3F);
            unheld.codePoint = cp;
            // The lines before it have all been moved, newlines included.
            unheld.line = 1 + std::count(text, text + to, '\n');
            return false;
        }
        std::memcpy(text + to, converted.data(), converted.size());
        to += converted.size();
        from = end;
    }
    size = to;
    return true;
}

bool Cp1252Of(std::string_view utf8, std::string& out, Unheld& unheld) {
    out.assign(utf8);
    size_t size = out.size();
    if (!Cp1252InPlace(&out[0], 0, size, unheld)) return false;
    out.resize(size);
    return true;
}

std::string ForOutput(std::string_view text, Encoding encoding) {
    return encoding == Encoding::Utf8 ? Utf8Of(text) : std::string(text);
}

std::string ForDiagnostics(std::string_view text) {
    constexpr size_t kShown = 200;
    if (text.size() <= kShown) return std::string(text);
    const bool line = text.size() > 3 && text.compare(0, 2, " (") == 0 && text.back() == ')';
    const std::string_view inner = line ? text.substr(2, text.size() - 3) : text;
    std::string size = std::to_string(inner.size());
    for (size_t at = size.size(); at > 3; at -= 3) size.insert(at - 3, " ");
    std::string cut = std::string(line ? " (" : "") + std::string(inner.substr(0, kShown)) + "... (" + size + " bytes)";
    return line ? cut + ")" : cut;
}

void StreamWnd::Append(const std::string& text) {
    // Every rejected line is reported by one message that begins so.
    if (text.compare(0, sizeof kRejectedMark - 1, kRejectedMark) == 0) ++m_rejected;
    std::string line = m_prefix;
    line += ForOutput(m_cut ? ForDiagnostics(text) : text, m_encoding);
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), m_out);
}

namespace {

// The scratch folder's name where a signal handler can read it.
char g_scratch[4096];

// Removes the scratch folders that ended runs left (killed, so that no
// handler could run): ours, named after a process that no longer exists.
void RemoveLeftScratch(const std::string& parent) {
    std::error_code ignored;
    for (const auto& entry : std::filesystem::directory_iterator(parent, ignored)) {
        const std::string name = entry.path().filename().string();
        char* end = nullptr;
        const long pid = name.compare(0, 7, "carnet-") == 0 ? std::strtol(name.c_str() + 7, &end, 10) : 0;
        struct stat st;
        if (pid <= 0 || !end || *end != '-' || std::strlen(end) != 7 || ::lstat(entry.path().c_str(), &st) != 0 ||
            !S_ISDIR(st.st_mode) || st.st_uid != ::geteuid() || ::kill(static_cast<pid_t>(pid), 0) == 0 ||
            errno != ESRCH)
            continue;
        std::filesystem::remove_all(entry.path(), ignored);
    }
}

}  // namespace

const std::string& ScratchStore::Location() {
    if (!m_folder.empty()) return m_file;
    const char* tmp = std::getenv("TMPDIR");
    const std::string parent = tmp && *tmp ? tmp : "/tmp";
    RemoveLeftScratch(parent);
    std::string pattern = parent + "/carnet-" + std::to_string(::getpid()) + "-XXXXXX";
    if (pattern.size() >= sizeof g_scratch || !::mkdtemp(&pattern[0])) return m_file;
    std::memcpy(g_scratch, pattern.c_str(), pattern.size() + 1);
    m_folder = pattern;
    m_file = m_folder + "/options.ini";
    return m_file;
}

ScratchStore::~ScratchStore() {
    if (m_folder.empty()) return;
    g_scratch[0] = '\0';
    std::error_code ignored;
    std::filesystem::remove_all(m_folder, ignored);
}

void RemoveScratch() {
    if (!g_scratch[0]) return;
    // The folder holds files only: the options and the stores' temporary files.
    const int dir = ::open(g_scratch, O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    // Entries removed while the folder is read may hide others: it is read
    // again until nothing is left to remove.
    for (int pass = 0, removed = 1; dir >= 0 && removed > 0 && pass < 8; ++pass) {
        alignas(8) static char entries[4096];
        removed = 0;
        ::lseek(dir, 0, SEEK_SET);
        for (ssize_t n; (n = ::getdents64(dir, entries, sizeof entries)) > 0;) {
            for (ssize_t at = 0; at < n;) {
                const auto* entry = reinterpret_cast<const struct dirent64*>(entries + at);
                const char* name = entry->d_name;
                if (!(name[0] == '.' && (name[1] == '\0' || (name[1] == '.' && name[2] == '\0'))) &&
                    ::unlinkat(dir, name, 0) == 0)
                    ++removed;
                at += entry->d_reclen;
            }
        }
    }
    if (dir >= 0) ::close(dir);
    ::rmdir(g_scratch);
}

}  // namespace carnet_tool
