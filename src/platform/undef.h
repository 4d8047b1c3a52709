// The absent-value sentinel of every coordinate and observation.
#pragma once

#include <cstdint>
#include <cstring>

constexpr double UNDEF_VALUE = -999999.0;

// Present or absent is decided on the 8 bytes of the double, never with a
// tolerance: 0.0 and -999999.0000001 are present values.
inline bool IsUndef(double v) {
    std::uint64_t a;
    std::uint64_t b;
    const double u = UNDEF_VALUE;
    std::memcpy(&a, &v, sizeof a);
    std::memcpy(&b, &u, sizeof b);
    return a == b;
}
