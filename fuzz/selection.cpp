// Selection strings: an arbitrary string validated into its canonical form,
// then membership and counting on what it became.
//
// Input: the selection string, optionally followed by '\n' and a point
// number to look up.
//
// Properties: a refused string is left as typed; an accepted one is not
// empty and validates again to itself; it counts at least one point number
// per group; the first and last point numbers that each group names belong
// to it; membership and counting take any text, validated or not.
#include <string>
#include <vector>

#include "fuzz_support.h"

namespace {

std::vector<CString> Groups(const CString& sel) {
    std::vector<CString> groups;
    int start = 0;
    for (int end; (end = sel.Find(';', start)) >= 0; start = end + 1) groups.push_back(sel.Mid(start, end - start));
    groups.push_back(sel.Mid(start));
    return groups;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    carnet_fuzz::Scratch::Get();
    carnet_fuzz::Input in(data, size);
    // Typed texts: they end at a NUL, as every text of a dialog does.
    const CString typed{std::string(in.Until('\n')).c_str()};
    const CString point{std::string(in.Rest()).c_str()};

    // Unchecked strings must not trip the members that expect checked ones.
    CCarnet::IsPointInSel(point, typed);
    FUZZ_CHECK(CCarnet::GetSelStringCount(typed) >= 0);

    CString sel = typed;
    if (!CCarnet::IsValidSelString(sel)) {
        FUZZ_CHECK_SAME(sel.str(), typed.str());
        return 0;
    }
    FUZZ_CHECK(!sel.IsEmpty());
    CString again = sel;
    FUZZ_CHECK(CCarnet::IsValidSelString(again) == 1);
    FUZZ_CHECK_SAME(again.str(), sel.str());

    const std::vector<CString> groups = Groups(sel);
    FUZZ_CHECK(CCarnet::GetSelStringCount(sel) >= static_cast<int>(groups.size()));
    for (const CString& group : groups) {
        FUZZ_CHECK(!group.IsEmpty());
        const int dash = group.Find('-');
        if (dash < 0) {
            FUZZ_CHECK(CCarnet::IsPointInSel(group, sel) == 1);
        } else {
            FUZZ_CHECK(CCarnet::IsPointInSel(group.Left(dash), sel) == 1);
            FUZZ_CHECK(CCarnet::IsPointInSel(group.Mid(dash + 1), sel) == 1);
        }
    }
    CCarnet::IsPointInSel(point, sel);
    return 0;
}
