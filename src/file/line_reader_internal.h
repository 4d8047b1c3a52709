// Reads a field-book file line by line: whole lines of any length, with only
// a real line end ("\n", and a "\r" before it) removed, so a last line
// without a newline keeps every byte.
#pragma once

#include <cstdio>
#include <string_view>

namespace carnet_file {

class LineReader {
public:
    // Opens the file for reading; a folder counts as a file that cannot be
    // opened.
    explicit LineReader(const char* path);
    ~LineReader();
    LineReader(const LineReader&) = delete;
    LineReader& operator=(const LineReader&) = delete;

    bool IsOpen() const { return m_f != nullptr; }
    // The next line, valid until the next call; false at the end of the file.
    bool Next(std::string_view& line);

private:
    std::FILE* m_f = nullptr;
    char* m_buf = nullptr;
    size_t m_cap = 0;
};

}  // namespace carnet_file
