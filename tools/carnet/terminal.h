// The terminal side of the tool: the conversions between the code page 1252
// of field books and UTF-8 (through iconv), the text window that streams to a
// terminal or a pipe, and a scratch folder that keeps the user's own
// parameter store untouched.
#pragma once

#include <cstdio>
#include <string>
#include <string_view>

#include <carnet/txtwnd.h>

namespace carnet_tool {

enum class Encoding {
    Cp1252,  // the bytes of the field book, unchanged
    Utf8,
    Auto,    // input only: UTF-8 when the bytes are valid UTF-8 with some above 127
};

// UTF-8 when the locale of the environment says so, else the file's bytes.
Encoding EncodingOfLocale();

// Code page 1252 text as UTF-8; the five bytes that code page 1252 leaves
// unassigned become the replacement character.
std::string Utf8Of(std::string_view cp1252);

// What a text is, told in one pass: plain ASCII, valid UTF-8 with
// characters beyond ASCII, or neither (`bad` then gets the offset of the
// first byte that is not UTF-8).
enum class TextKind { Ascii, Utf8, Other };
TextKind KindOf(std::string_view text, size_t& bad);
bool HasHighBytes(std::string_view text);

// A character that code page 1252 cannot hold, met while converting.
struct Unheld {
    long line = 0;          // of the UTF-8 text, counted from 1
    std::string character;  // its UTF-8 bytes
    unsigned long codePoint = 0;
};

// UTF-8 text as code page 1252; false, with the character, when one has no
// place in code page 1252. The text must be valid UTF-8.
bool Cp1252Of(std::string_view utf8, std::string& out, Unheld& unheld);
// The same in place: the text's bytes from `start` to `size` become their
// code page 1252 form at its beginning, and `size` its length.
bool Cp1252InPlace(char* text, size_t start, size_t& size, Unheld& unheld);

// The text in the chosen output encoding.
std::string ForOutput(std::string_view text, Encoding encoding);

// A text window that writes every text as a line to a stream as it comes,
// keeping nothing, so a listing of any length runs in constant memory. It
// counts the messages that report a rejected line. Diagnostics are cut
// (ForDiagnostics).
class StreamWnd : public CNorvexTxtWnd {
public:
    StreamWnd(std::FILE* out, Encoding encoding, std::string prefix = std::string(), bool cut = false)
        : m_out(out), m_encoding(encoding), m_prefix(std::move(prefix)), m_cut(cut) {}

    int Rejected() const { return m_rejected; }

protected:
    void Append(const std::string& text) override;

private:
    std::FILE* m_out;
    Encoding m_encoding;
    std::string m_prefix;
    bool m_cut;
    int m_rejected = 0;
};

// A diagnostic no longer than a terminal can show: a text beyond 200 bytes
// is cut there and its length said, "... (104 857 600 bytes)"; a rejected
// line shown as " (LINE)" keeps its parentheses, and the length is its own.
std::string ForDiagnostics(std::string_view text);

// A fresh temporary folder, made when first asked for and removed with all it
// holds, also by RemoveScratch when a signal ends the tool. Option lines read
// from a book that is to be saved or exported go to a profile file there
// instead of the user's settings, and are written back from there.
class ScratchStore {
public:
    ScratchStore() = default;
    ~ScratchStore();
    ScratchStore(const ScratchStore&) = delete;
    ScratchStore& operator=(const ScratchStore&) = delete;

    // The profile file in the folder, made now if need be; empty when no
    // folder can be made.
    const std::string& Location();

private:
    std::string m_folder;
    std::string m_file;
};

// Removes the scratch folder and what it holds: async-signal-safe, for a
// handler that then ends the tool.
void RemoveScratch();

}  // namespace carnet_tool
