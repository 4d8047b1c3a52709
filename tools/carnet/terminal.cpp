#include "terminal.h"

#include <langinfo.h>
#include <unistd.h>

#include <clocale>
#include <cstdlib>
#include <cstring>

namespace carnet_tool {
namespace {

// Code points of the bytes 0x80 to 0x9F; the five bytes that code page 1252
// leaves unassigned become the replacement character.
const char32_t kHighControls[32] = {
    0x20AC, 0xFFFD, 0x201A, 0x0192, 0x201E, 0x2026, 0x2020, 0x2021, 0x02C6, 0x2030, 0x0160,
    0x2039, 0x0152, 0xFFFD, 0x017D, 0xFFFD, 0xFFFD, 0x2018, 0x2019, 0x201C, 0x201D, 0x2022,
    0x2013, 0x2014, 0x02DC, 0x2122, 0x0161, 0x203A, 0x0153, 0xFFFD, 0x017E, 0x0178,
};

void AppendUtf8(std::string& out, char32_t c) {
    if (c < 0x80) {
        out += static_cast<char>(c);
    } else if (c < 0x800) {
        out += static_cast<char>(0xC0 | (c >> 6));
        out += static_cast<char>(0x80 | (c & 0x3F));
    } else {
        out += static_cast<char>(0xE0 | (c >> 12));
        out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
        out += static_cast<char>(0x80 | (c & 0x3F));
    }
}

const char kRejectedMark[] = "Erreur ligne ";

}  // namespace

Encoding EncodingOfLocale() {
    Encoding encoding = Encoding::Cp1252;
    if (std::setlocale(LC_CTYPE, "")) {
        if (std::strcmp(nl_langinfo(CODESET), "UTF-8") == 0) encoding = Encoding::Utf8;
        std::setlocale(LC_CTYPE, "C");
    }
    return encoding;
}

std::string ForOutput(std::string_view text, Encoding encoding) {
    if (encoding == Encoding::Cp1252) return std::string(text);
    std::string out;
    out.reserve(text.size() + text.size() / 8);
    for (char ch : text) {
        const unsigned char c = static_cast<unsigned char>(ch);
        AppendUtf8(out, c >= 0x80 && c < 0xA0 ? kHighControls[c - 0x80] : c);
    }
    return out;
}

void StreamWnd::Append(const std::string& text) {
    // Every rejected line is reported by one message that begins so.
    if (text.compare(0, sizeof kRejectedMark - 1, kRejectedMark) == 0) ++m_rejected;
    std::string line = m_prefix;
    line += ForOutput(text, m_encoding);
    line += '\n';
    std::fwrite(line.data(), 1, line.size(), m_out);
}

ScratchStore::ScratchStore() {
    const char* tmp = std::getenv("TMPDIR");
    std::string pattern = std::string(tmp && *tmp ? tmp : "/tmp") + "/carnet-XXXXXX";
    if (!::mkdtemp(&pattern[0])) return;
    m_folder = pattern;
    m_file = m_folder + "/options.ini";
}

ScratchStore::~ScratchStore() {
    if (m_folder.empty()) return;
    ::unlink(m_file.c_str());
    ::rmdir(m_folder.c_str());
}

}  // namespace carnet_tool
