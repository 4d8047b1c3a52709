// The lines of a field book held in memory: whole lines of any length, with
// only a real line end ("\n", and a "\r" before it) removed, so a last line
// without a newline keeps every byte.
#pragma once

#include <cstring>
#include <string_view>

namespace carnet_file {

// Calls line(text, end) for every line of bytes in order, with the offset
// just past the line's end, until it returns false.
template <class F>
void ForEachLine(std::string_view bytes, F line) {
    const char* const data = bytes.data();
    for (size_t pos = 0; pos < bytes.size();) {
        const void* nl = std::memchr(data + pos, '\n', bytes.size() - pos);
        const size_t end = nl ? static_cast<size_t>(static_cast<const char*>(nl) - data) : bytes.size();
        size_t len = end - pos;
        if (nl && len > 0 && data[end - 1] == '\r') --len;
        const std::string_view text(data + pos, len);
        pos = nl ? end + 1 : end;
        if (!line(text, pos)) return;
    }
}

}  // namespace carnet_file
