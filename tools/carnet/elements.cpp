#include "elements.h"

#include <algorithm>
#include <cstdio>

#include <carnet/cp1252.h>
#include <carnet/element_types.h>
#include <carnet/numconv.h>

#include "session.h"

namespace carnet_tool {
namespace {

void PutShown(const std::string& text) { std::fwrite(text.data(), 1, text.size(), stdout); }

// A column that is empty in every row takes no room.
void Pad(std::string& line, const CString& text, size_t width) {
    if (width == 0) return;
    line += text.str();
    line.append(width - std::min<size_t>(width, text.str().size()), ' ');
    line += "  ";
}

}  // namespace

bool TypeNamed(const std::string& arg, unsigned int& code) {
    std::string keyword;
    if (!FromTerminal("type", arg, keyword)) return false;
    if (!keyword.empty() && keyword.find_first_not_of("0123456789") == std::string::npos) {
        code = static_cast<unsigned int>(numconv::Atoi(keyword.c_str()));
        if (CarnetTypeInfo(code)) return true;
    }
    for (code = CARNET_FIRST_TYPE; code <= CARNET_LAST_TYPE; ++code)
        for (const char* known : CarnetTypeInfo(code)->keywords)
            if (known && cp1252::CompareNoCase(known, keyword.c_str()) == 0) return true;
    Say("carnet", "no element type is named " + keyword + " (a code from " + std::to_string(CARNET_FIRST_TYPE) +
                      " to " + std::to_string(CARNET_LAST_TYPE) + " or a keyword)");
    return false;
}

void ElementRows::PrintColumns() {
    // Code page 1252 has one byte a character, so widths are byte counts.
    size_t wide[3] = {0, 0, 0};
    const int last = m_rows.empty() ? 0 : m_rows.back() + 1;
    const size_t position = std::to_string(std::max(last, 1)).size();
    for (int i : m_rows) {
        wide[0] = std::max<size_t>(wide[0], m_book.cmdAt(i).str().size());
        wide[1] = std::max<size_t>(wide[1], m_book.matAt(i).str().size());
        wide[2] = std::max<size_t>(wide[2], m_book.symAt(i).str().size());
    }
    const Encoding encoding = CurrentSession().output;
    std::string line;
    for (int i : m_rows) {
        line = numconv::Format("%*d  ", static_cast<int>(position), i + 1);
        Pad(line, m_book.cmdAt(i), wide[0]);
        Pad(line, m_book.matAt(i), wide[1]);
        Pad(line, m_book.symAt(i), wide[2]);
        line += m_book.parAt(i).str();
        line.erase(line.find_last_not_of(' ') + 1);
        PutShown(ForOutput(line, encoding) + "\n");
    }
}

void ElementRows::PrintJson() {
    PutShown("[\n");
    for (size_t k = 0; k < m_rows.size(); ++k) {
        const int i = m_rows[k];
        PutShown(numconv::Format("{\"position\": %d, \"keyword\": ", i + 1) + JsonString(m_book.cmdAt(i).str()) +
            ", \"number\": " + JsonString(m_book.matAt(i).str()) + ", \"code\": " + JsonString(m_book.symAt(i).str()) +
            ", \"text\": " + JsonString(m_book.parAt(i).str()) + (k + 1 < m_rows.size() ? "},\n" : "}\n"));
    }
    PutShown("]\n");
}

std::string JsonString(const std::string& cp1252) {
    std::string out = "\"";
    for (char ch : Utf8Of(cp1252)) {
        const unsigned char c = static_cast<unsigned char>(ch);
        if (ch == '"' || ch == '\\')
            out += std::string("\\") + ch;
        else if (c < 0x20)
            out += numconv::Format("\\u%04x", c);
        else
            out += ch;
    }
    return out + "\"";
}

}  // namespace carnet_tool
