#include <carnet/txtwnd.h>

#include <cstdarg>

#include <carnet/numconv.h>

void CNorvexTxtWnd::Printf(int, const char* format, ...) {
    std::string text;
    va_list args;
    va_start(args, format);
    numconv::AppendFormatV(text, format, args);
    va_end(args);
    Append(text);
}

void CNorvexTxtWnd::Append(const std::string& text) {
    if (m_echo) {
        std::fwrite(text.data(), 1, text.size(), m_echo);
        std::fputc('\n', m_echo);
    }
    m_texts.push_back(text);
}
