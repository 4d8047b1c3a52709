// Stand-in for the host's text window: it keeps every text it is given, in
// call order, and can echo each one as a line to a stream.
#pragma once

#include <cstdio>
#include <string>
#include <vector>

class CNorvexTxtWnd {
public:
    CNorvexTxtWnd() = default;
    explicit CNorvexTxtWnd(std::FILE* echo) : m_echo(echo) {}
    virtual ~CNorvexTxtWnd() = default;

    void Printf(int, const char* format, ...) __attribute__((format(printf, 3, 4)));

    const std::vector<std::string>& Texts() const { return m_texts; }
    void Clear() { m_texts.clear(); }

protected:
    // Called once per text; the default keeps it and echoes it.
    virtual void Append(const std::string& text);

private:
    std::FILE* m_echo = nullptr;
    std::vector<std::string> m_texts;
};
