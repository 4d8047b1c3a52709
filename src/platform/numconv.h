// Locale-independent number conversions. The library reads and writes the
// same bytes whatever the process locale says about the decimal separator.
#pragma once

#include <cstdarg>
#include <string>
#include <string_view>

namespace numconv {

// atof with decimal forms only: leading white space, optional sign, digits,
// optional fraction, optional exponent. Anything else ("inf", "nan", "0x1p3"
// beyond its leading "0") stops the number; no number at all gives 0.0.
double Atof(const char* s);
double Atof(std::string_view text);
// atoi that saturates at the int range instead of wrapping.
int Atoi(const char* s);

// vsnprintf into a growing string, with the "C" numeric locale.
void AppendFormatV(std::string& out, const char* format, va_list args);
std::string Format(const char* format, ...) __attribute__((format(printf, 1, 2)));

// A decimal count made safe for a "%.*f" format: negative counts give 0
// decimals and counts above 30 give 30.
int SafeDecimals(int n);
// v printed with n decimals (n made safe) and read back: the value a display
// with that many decimals shows.
double Round(double v, int n);
// v printed "%.*f" with n decimals (n made safe).
std::string Fixed(double v, int n);

}  // namespace numconv
