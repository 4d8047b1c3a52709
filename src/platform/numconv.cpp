#include <carnet/numconv.h>

#include <charconv>
#include <climits>
#include <cstring>
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <locale.h>

#include <carnet/cp1252.h>

namespace numconv {
namespace {

locale_t CLocale() {
    static locale_t loc = newlocale(LC_ALL_MASK, "C", static_cast<locale_t>(nullptr));
    return loc;
}

// Switches this thread to the "C" locale for the scope of a conversion.
class CLocaleScope {
public:
    CLocaleScope() : m_old(uselocale(CLocale())) {}
    ~CLocaleScope() { uselocale(m_old); }
    CLocaleScope(const CLocaleScope&) = delete;
    CLocaleScope& operator=(const CLocaleScope&) = delete;

private:
    locale_t m_old;
};

}  // namespace

double Atof(const char* s) {
    if (!s) return 0.0;
    return Atof(std::string_view(s));
}

double Atof(std::string_view text) {
    const char* p = text.data();
    const char* const end = p + text.size();
    auto digit = [&](const char* q) { return q < end && cp1252::IsDigit(static_cast<unsigned char>(*q)); };
    while (p < end && cp1252::IsSpace(static_cast<unsigned char>(*p))) ++p;
    bool negative = false;
    if (p < end && (*p == '+' || *p == '-')) negative = (*p++ == '-');
    const char* start = p;
    while (digit(p)) ++p;
    bool any = p > start;
    if (p < end && *p == '.') {
        const char* frac = ++p;
        while (digit(p)) ++p;
        any = any || p > frac;
    }
    if (!any) return 0.0;
    if (p < end && (*p == 'e' || *p == 'E')) {
        const char* q = p + 1;
        if (q < end && (*q == '+' || *q == '-')) ++q;
        const char* exp = q;
        while (digit(q)) ++q;
        if (q > exp) p = q;
    }
    // Only the validated decimal prefix is converted, so no special form
    // ("inf", "nan", hexadecimal) can be read.
    double value = 0.0;
    auto result = std::from_chars(start, p, value, std::chars_format::general);
    if (result.ec == std::errc::result_out_of_range) {
        // Rare: let the C library pick infinity or zero, as atof does.
        value = strtod_l(std::string(start, p).c_str(), nullptr, CLocale());
    }
    return negative ? -value : value;
}

int Atoi(const char* s) {
    if (!s) return 0;
    const char* p = s;
    while (cp1252::IsSpace(static_cast<unsigned char>(*p))) ++p;
    bool neg = false;
    if (*p == '+' || *p == '-') neg = (*p++ == '-');
    long long v = 0;
    const long long limit = neg ? -static_cast<long long>(INT_MIN) : INT_MAX;
    while (cp1252::IsDigit(static_cast<unsigned char>(*p))) {
        v = v * 10 + (*p++ - '0');
        if (v >= limit) {
            v = limit;
            break;
        }
    }
    return static_cast<int>(neg ? -v : v);
}

void AppendFormatV(std::string& out, const char* format, va_list args) {
    if (!format) return;
    CLocaleScope scope;
    // Try in the string's own spare room first, grow once when it is short.
    const size_t base = out.size();
    size_t room = 64;
    out.resize(base + room);
    va_list copy;
    va_copy(copy, args);
    int n = std::vsnprintf(&out[base], room, format, copy);
    va_end(copy);
    if (n < 0) {
        out.resize(base);
        return;
    }
    if (static_cast<size_t>(n) >= room) {
        out.resize(base + static_cast<size_t>(n) + 1);
        std::vsnprintf(&out[base], static_cast<size_t>(n) + 1, format, args);
    }
    out.resize(base + static_cast<size_t>(n));
}

std::string Format(const char* format, ...) {
    std::string out;
    va_list args;
    va_start(args, format);
    AppendFormatV(out, format, args);
    va_end(args);
    return out;
}

int SafeDecimals(int n) { return n < 0 ? 0 : (n > 30 ? 30 : n); }

std::string Fixed(double v, int n) { return Format("%.*f", SafeDecimals(n), v); }

double Round(double v, int n) { return Atof(Fixed(v, n).c_str()); }

}  // namespace numconv
