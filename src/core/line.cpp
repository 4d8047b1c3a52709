#include "core/line_internal.h"

#include <cstring>
#include <string>

#include <carnet/numconv.h>

namespace carnet_line {

void AppendKeyword(CString& out, const char* keyword) {
    std::string& s = out.str();
    const size_t len = keyword ? std::strlen(keyword) : 0;
    const size_t n = len < 16 ? len : 16;
    s.append(keyword ? keyword : "", n);
    s.append(16 - n, ' ');
}

void AppendName(CString& out, const CString& name) {
    std::string& s = out.str();
    if (name.IsEmpty()) {
        s.append(16, '?');
        return;
    }
    s += name.str();
    if (name.GetLength() < 16) s.append(static_cast<size_t>(16 - name.GetLength()), ' ');
}

void AppendMarkedSymbol(CString& out, const CString& symbol) {
    for (char c : symbol.str()) {
        if (c == ' ')
            out.str() += "***";
        else
            out.str() += c;
    }
}

void MarkSpaces(CString& symbol) {
    if (symbol.Find(' ') >= 0) symbol.Replace(" ", "***");
}

void UnmarkSpaces(CString& symbol) {
    if (symbol.Find("***") >= 0) symbol.Replace("***", " ");
}

void Emit(CNorvexTxtWnd* wnd, int n, const CString& line) {
    if (!wnd) return;
    if (n > 0)
        wnd->Printf(1, "%06d  %s", n, line.GetString());
    else
        wnd->Printf(1, "%s", line.GetString());
}

void Emit(std::FILE* f, int n, const CString& line) {
    if (!f) return;
    if (n > 0) {
        // "%06d  ", without a format to parse on every line of a book.
        thread_local std::string prefix;
        if (n < 1000000) {
            prefix.assign("000000  ");
            for (int k = 5, v = n; v > 0; --k, v /= 10) prefix[static_cast<size_t>(k)] = static_cast<char>('0' + v % 10);
        } else {
            prefix = numconv::Format("%06d  ", n);
        }
        std::fwrite(prefix.data(), 1, prefix.size(), f);
    }
    std::fwrite(line.GetString(), 1, static_cast<size_t>(line.GetLength()), f);
    std::fputc('\n', f);
}

}  // namespace carnet_line
