// A selection string read once for matching the point numbers of a whole
// book: its groups sorted into ranges and single numbers per radical, each
// number then found by lookup, so that matching costs the logarithm of the
// number of groups rather than their number.
#pragma once

#include <memory>

#include <carnet/cstring.h>

class CSelMatcher {
public:
    // The selection as IsPointInSel takes it (validated or not).
    explicit CSelMatcher(const CString& sel);
    ~CSelMatcher();
    CSelMatcher(const CSelMatcher&) = delete;
    CSelMatcher& operator=(const CSelMatcher&) = delete;

    // 1 when the point number is in the selection, else 0: what
    // CCarnet::IsPointInSel(np, sel) returns.
    int Contains(const CString& np);

    struct Index;

private:
    CString m_sel;
    // The groups read as plain point numbers, and as station set-ups (for
    // numbers such as "S1(2)"), each made when first needed.
    std::unique_ptr<Index> m_plain, m_setUps;
};
