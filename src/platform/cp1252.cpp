#include <carnet/cp1252.h>

#include <cstring>

namespace cp1252 {

unsigned int ToUpper(unsigned int c) {
    if (c >= 'a' && c <= 'z') return c - 32;
    // à..þ except ÷ (0xF7) map to À..Þ.
    if (c >= 0xE0 && c <= 0xFE && c != 0xF7) return c - 32;
    if (c == 0x9A || c == 0x9C || c == 0x9E) return c - 16;  // š œ ž
    if (c == 0xFF) return 0x9F;                                // ÿ
    return c;
}

unsigned int ToLower(unsigned int c) {
    if (c >= 'A' && c <= 'Z') return c + 32;
    if (c >= 0xC0 && c <= 0xDE && c != 0xD7) return c + 32;
    if (c == 0x8A || c == 0x8C || c == 0x8E) return c + 16;
    if (c == 0x9F) return 0xFF;
    return c;
}

int Compare(const char* a, const char* b) {
    const auto* p = reinterpret_cast<const unsigned char*>(a ? a : "");
    const auto* q = reinterpret_cast<const unsigned char*>(b ? b : "");
    while (*p && *p == *q) {
        ++p;
        ++q;
    }
    return (*p > *q) - (*p < *q);
}

int CompareNoCase(const char* a, const char* b) {
    const auto* p = reinterpret_cast<const unsigned char*>(a ? a : "");
    const auto* q = reinterpret_cast<const unsigned char*>(b ? b : "");
    for (;; ++p, ++q) {
        unsigned int x = ToLower(*p);
        unsigned int y = ToLower(*q);
        if (x != y || x == 0) return (x > y) - (x < y);
    }
}

const char* FindChar(const char* s, unsigned int c) {
    if (!s) return nullptr;
    return std::strchr(s, static_cast<int>(static_cast<unsigned char>(c)));
}

const char* FindText(const char* s, const char* sub) {
    if (!s || !sub) return nullptr;
    return std::strstr(s, sub);
}

}  // namespace cp1252
