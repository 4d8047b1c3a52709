// Helpers of the record tests: the texts a record builds, and a guard that
// puts back a class's decimal count after a test changed it.
#pragma once

#include <string>

#include <carnet/cstring.h>

template <class R>
std::string ParamsOf(R& r) {
    CString s("stale");  // must be replaced, not appended to
    r.Params(s);
    return s.GetString();
}

template <class R>
std::string InfosOf(R& r) {
    CString s("stale");
    r.Infos(s);
    return s.GetString();
}

inline std::string Blanks(int n) { return std::string(static_cast<size_t>(n), ' '); }

class DeciGuard {
public:
    DeciGuard(int (*get)(), void (*set)(int), int value) : m_set(set), m_saved(get()) { set(value); }
    ~DeciGuard() { m_set(m_saved); }
    DeciGuard(const DeciGuard&) = delete;
    DeciGuard& operator=(const DeciGuard&) = delete;

private:
    void (*m_set)(int);
    int m_saved;
};
