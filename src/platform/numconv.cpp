#include <carnet/numconv.h>

#include <charconv>
#include <climits>
#include <cmath>
#include <limits>
#include <cstring>
#include <clocale>
#include <cstdio>
#include <cstdint>
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

namespace {

// Powers of ten that a double holds exactly.
constexpr double kExactPowers[] = {1e0,  1e1,  1e2,  1e3,  1e4,  1e5,  1e6,  1e7,  1e8,  1e9,  1e10, 1e11,
                                   1e12, 1e13, 1e14, 1e15, 1e16, 1e17, 1e18, 1e19, 1e20, 1e21, 1e22};

// value * 10^exponent when a double holds both the digits (as an integer of
// at most 19 significant digits) and the power exactly: one multiplication
// or division then rounds the true value once, which is exactly what the
// general conversion gives.
bool ConvertShort(std::uint64_t digits, int significant, int exponent, double& value) {
    if (significant > 19 || digits > (std::uint64_t{1} << 53) || exponent < -22 || exponent > 22) return false;
    const double m = static_cast<double>(digits);
    value = exponent < 0 ? m / kExactPowers[-exponent] : m * kExactPowers[exponent];
    return true;
}

bool IsDigitChar(char c) { return cp1252::IsDigit(static_cast<unsigned char>(c)); }

}  // namespace

double Atof(std::string_view text) {
    const char* p = text.data();
    const char* const end = p + text.size();
    while (p < end && cp1252::IsSpace(static_cast<unsigned char>(*p))) ++p;
    bool negative = false;
    if (p < end && (*p == '+' || *p == '-')) negative = (*p++ == '-');
    const char* const start = p;
    // The digits as one integer (it wraps beyond 19 significant digits,
    // which are then left to the general conversion).
    std::uint64_t digits = 0;
    while (p < end && *p == '0') ++p;
    const char* first = p;
    while (p < end && IsDigitChar(*p)) digits = digits * 10 + static_cast<std::uint64_t>(*p++ - '0');
    int significant = static_cast<int>(p - first);
    bool any = p > start;
    int exponent = 0;
    if (p < end && *p == '.') {
        const char* frac = ++p;
        if (significant == 0)
            while (p < end && *p == '0') ++p;  // zeros before the first significant digit
        first = p;
        while (p < end && IsDigitChar(*p)) digits = digits * 10 + static_cast<std::uint64_t>(*p++ - '0');
        significant += static_cast<int>(p - first);
        any = any || p > frac;
        exponent = -static_cast<int>(p - frac);
    }
    if (!any) return 0.0;
    if (p < end && (*p == 'e' || *p == 'E')) {
        const char* q = p + 1;
        bool negativeExponent = false;
        if (q < end && (*q == '+' || *q == '-')) negativeExponent = (*q++ == '-');
        const char* exp = q;
        int written = 0;
        while (q < end && IsDigitChar(*q)) {
            // Beyond four digits the number is far outside the short way.
            if (q - exp < 4) written = written * 10 + (*q - '0');
            ++q;
        }
        if (q > exp) {
            p = q;
            exponent = q - exp > 4 ? 1000 : exponent + (negativeExponent ? -written : written);
        }
    }
    double value = 0.0;
    // Most numbers of a field book take the short way; the others, and the
    // limits of the range, go through the general conversion of the
    // validated decimal prefix only, so no special form ("inf", "nan",
    // hexadecimal) can be read.
    if (!ConvertShort(digits, significant, exponent, value)) {
        auto result = std::from_chars(start, p, value, std::chars_format::general);
        if (result.ec == std::errc::result_out_of_range) {
            // Rare: let the C library pick infinity or zero, as atof does.
            value = strtod_l(std::string(start, p).c_str(), nullptr, CLocale());
            // An infinity would be written "inf", which no reader takes
            // back: a number beyond the range reads as the largest one.
            if (std::isinf(value)) value = std::numeric_limits<double>::max();
        }
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
    // Formatted first in a scratch text of the thread that keeps its size
    // from one call to the next, so that nothing is cleared or allocated on
    // each call; a longer text makes it grow to fit and is formatted again.
    // The arguments may point into `out`, which is only appended to at the end.
    thread_local std::string scratch(256, '\0');
    va_list copy;
    va_copy(copy, args);
    // The analyzer does not see that a copy of the caller's list is set.
    // NOLINTNEXTLINE(clang-analyzer-valist.Uninitialized)
    const int n = std::vsnprintf(&scratch[0], scratch.size(), format, copy);
    va_end(copy);
    if (n < 0) return;
    const size_t length = static_cast<size_t>(n);
    if (length >= scratch.size()) {
        scratch.resize(length + 1);
        std::vsnprintf(&scratch[0], scratch.size(), format, args);
    }
    out.append(scratch.data(), length);
    // A rare long text does not keep its room for the rest of the thread.
    if (scratch.size() > (1u << 16)) {
        scratch.assign(256, '\0');
        scratch.shrink_to_fit();
    }
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
