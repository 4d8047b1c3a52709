// The terminal side of the tool: the text window that streams to a terminal
// or a pipe, the conversion of code-page-1252 texts for a UTF-8 terminal,
// and a scratch parameter store that keeps the user's own store untouched.
#pragma once

#include <cstdio>
#include <string>
#include <string_view>

#include <carnet/txtwnd.h>

namespace carnet_tool {

enum class Encoding {
    Cp1252,  // the bytes of the field book, unchanged
    Utf8,
};

// UTF-8 when the locale of the environment says so, else the file's bytes.
Encoding EncodingOfLocale();

// The text in the chosen encoding.
std::string ForOutput(std::string_view text, Encoding encoding);

// A text window that writes every text as a line to a stream as it comes,
// keeping nothing, so a listing of any length runs in constant memory. It
// counts the messages that report a rejected line.
class StreamWnd : public CNorvexTxtWnd {
public:
    StreamWnd(std::FILE* out, Encoding encoding, std::string prefix = std::string())
        : m_out(out), m_encoding(encoding), m_prefix(std::move(prefix)) {}

    int Rejected() const { return m_rejected; }

protected:
    void Append(const std::string& text) override;

private:
    std::FILE* m_out;
    Encoding m_encoding;
    std::string m_prefix;
    int m_rejected = 0;
};

// A profile file in a fresh temporary folder, removed with it. Option lines
// read from a book go there instead of the user's settings, and are written
// back from there when the book is saved.
class ScratchStore {
public:
    ScratchStore();
    ~ScratchStore();
    ScratchStore(const ScratchStore&) = delete;
    ScratchStore& operator=(const ScratchStore&) = delete;

    bool IsReady() const { return !m_folder.empty(); }
    const std::string& Location() const { return m_file; }

private:
    std::string m_folder;
    std::string m_file;
};

}  // namespace carnet_tool
