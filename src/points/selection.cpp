// Selection strings ("1-5;8;P.1-P.20;A.*"): validation into canonical form,
// membership and counting, and the point-number field of a dialog.
#include <algorithm>
#include <climits>
#include <cstdlib>
#include <map>
#include <set>
#include <string>
#include <tuple>
#include <unordered_map>
#include <utility>
#include <vector>

#include <carnet/ccarnet.h>
#include <carnet/cwnd.h>
#include <carnet/messages.h>
#include <carnet/msgbox.h>
#include <carnet/selmatch.h>

namespace {

// The accented texts are code-page-1252 bytes; the formats are written at
// their calls so that the compiler checks them against their values.
const char* const kEmptySelection =
    "La cha\xEEne de s\xE9lection des points est vide.\nVeuillez la renseigner avant de r\xE9" "essayer !";

// One point number of a selection, split.
struct SelPoint {
    CString radical;
    int number = 0;
    int rep = 1;
    int dotted = 0;
};

// Station mode: the text holds a station reference with a repetition index.
bool IsStationRef(const CString& s) { return s.Find('(') >= 0; }

SelPoint Split(const CString& text, bool station) {
    SelPoint p;
    if (station)
        CCarnet::extrStaRep(text, p.radical, p.number, p.rep, p.dotted, 0);
    else
        CCarnet::extrMat(text, p.radical, p.number, p.dotted, 0);
    return p;
}

// Calls f(group) for every group of a selection, in order; stops and returns
// false as soon as f does.
template <class F>
bool ForEachGroup(const CString& sel, F f) {
    int start = 0;
    for (;;) {
        const int end = sel.Find(';', start);
        const CString group = end < 0 ? sel.Mid(start) : sel.Mid(start, end - start);
        if (!f(group)) return false;
        if (end < 0) return true;
        start = end + 1;
    }
}

// The range group cut at its first hyphen into its two ends.
struct Range {
    CString first;
    CString second;
    explicit Range(const CString& group, int dash) : first(group.Left(dash)), second(group.Mid(dash + 1)) {}
};

// A range or wildcard group checked and written canonically into out; false
// (with the message shown) when its ends do not agree.
bool CanonicalRange(const CString& group, int dash, CString& out) {
    const Range range(group, dash);
    const bool station = IsStationRef(range.first);
    SelPoint a = Split(range.first, station);
    SelPoint b = Split(range.second, station);
    // After a "*" first end the group takes the radical of the second end:
    // one that holds a hyphen, or a parenthesis outside station mode, cannot
    // be written in a range that reads back as the same group.
    const bool unwritable = a.radical == "*" && (b.radical.Find('-') >= 0 || (!station && b.radical.Find('(') >= 0));
    if (unwritable || (a.radical != "*" && b.radical != "*" && a.radical != b.radical)) {
        ShowWarning(nullptr,
                    "Le groupe %s pr\xE9sent dans la cha\xEEne de s\xE9lection\n"
                    "pr\xE9sente des radicaux diff\xE9rents !",
                    group.GetString());
        return false;
    }
    if (station && a.rep != b.rep) {
        ShowWarning(nullptr, "Les indice de reprise de stations doivent \xEAtre\nidentiques dans l'intervalle %s !",
                    group.GetString());
        return false;
    }
    if (a.dotted != b.dotted) {
        ShowWarning(nullptr, "Un des deux matricules du groupe %s de s\xE9lection\ncontient un point et l'autre pas !",
                    group.GetString());
        return false;
    }
    if (a.radical != "*")
        b.radical = a.radical;
    else if (b.radical != "*")
        a.radical = b.radical;
    if (a.number < 0 || b.number < 0) {
        // Normalised like a single group, so that the canonical string
        // validates to itself (.* of an empty radical is written *).
        out = a.radical + ".*";
        CCarnet::formMat(out);
        return true;
    }
    if (a.number > b.number) std::swap(a.number, b.number);
    if (a.radical.IsEmpty()) {
        if (station)
            out.Format("%d(%d)-%d(%d)", a.number, a.rep, b.number, b.rep);
        else
            out.Format("%d-%d", a.number, b.number);
    } else {
        const char* r = a.radical.GetString();
        if (station)
            out.Format("%s.%d(%d)-%s.%d(%d)", r, a.number, a.rep, r, b.number, b.rep);
        else
            out.Format("%s.%d-%s.%d", r, a.number, r, b.number);
    }
    return true;
}

}  // namespace

int CCarnet::IsValidSelString(CString& sel) {
    if (sel.IsEmpty()) {
        ShowWarning(nullptr, "%s", kEmptySelection);
        return 0;
    }
    CString result;
    const bool valid = ForEachGroup(sel, [&result](const CString& group) {
        CString canonical;
        const int dash = group.Find('-');
        if (dash < 0) {
            canonical = group;
            formMat(canonical);
        } else if (!CanonicalRange(group, dash, canonical)) {
            return false;
        }
        // Groups that name nothing are dropped.
        if (!canonical.IsEmpty()) {
            if (!result.IsEmpty()) result += ';';
            result += canonical;
        }
        return true;
    });
    if (!valid) return 0;
    // A string of empty groups selects nothing: refused like an empty one
    // rather than accepted as an empty selection.
    if (result.IsEmpty()) {
        ShowWarning(nullptr, "%s", kEmptySelection);
        return 0;
    }
    sel = result;
    return 1;
}

int CCarnet::IsPointInSel(const CString& np, const CString& sel) {
    if (sel.IsEmpty()) return 0;
    const bool station = IsStationRef(np);
    const SelPoint pt = Split(np, station);
    const bool found = !ForEachGroup(sel, [&](const CString& group) {
        if (group.IsEmpty()) return true;
        const int dash = group.Find('-');
        bool match = false;
        if (dash >= 0) {
            // The point's own mode reads both ends; the second end only
            // bounds the number.
            const Range range(group, dash);
            const SelPoint a = Split(range.first, station);
            const SelPoint b = Split(range.second, station);
            match = a.radical == pt.radical && pt.number >= a.number && pt.number <= b.number &&
                    (!station || (pt.rep == a.rep && pt.rep == b.rep));
        } else {
            const SelPoint g = Split(group, station);
            match = (g.radical == "*" || g.radical == pt.radical) && (g.number == -1 || g.number == pt.number) &&
                    g.dotted == pt.dotted && (!station || g.rep == pt.rep);
        }
        return !match;
    });
    return found ? 1 : 0;
}

// The groups of a selection in one mode, sorted for lookup. Each follows the
// rule of IsPointInSel: a range matches the numbers between its ends of its
// first end's radical (and set-up); a single group matches its radical (any
// for "*"), its number (any for -1), its dotted flag (and set-up).
struct CSelMatcher::Index {
    // What the groups say of one radical; set-ups are 0 for plain numbers.
    struct Radical {
        std::set<std::tuple<int, int, int>> singles;                   // number (-1: any), dotted, set-up
        std::map<int, std::vector<std::pair<long long, long long>>> ranges;  // by set-up, merged, in order
    };
    std::unordered_map<std::string, Radical> radicals;
    Radical anyRadical;  // the single groups of radical "*"

    Index(const CString& sel, bool station) {
        const auto setUp = [station](const SelPoint& p) { return station ? p.rep : 0; };
        ForEachGroup(sel, [&](const CString& group) {
            if (group.IsEmpty()) return true;
            const int dash = group.Find('-');
            if (dash >= 0) {
                const Range range(group, dash);
                const SelPoint a = Split(range.first, station), b = Split(range.second, station);
                if ((!station || a.rep == b.rep) && a.number <= b.number)
                    radicals[a.radical.str()].ranges[setUp(a)].emplace_back(a.number, b.number);
            } else {
                const SelPoint g = Split(group, station);
                Radical& r = g.radical == "*" ? anyRadical : radicals[g.radical.str()];
                r.singles.emplace(g.number, g.dotted, setUp(g));
            }
            return true;
        });
        for (auto& radical : radicals) {
            for (auto& entry : radical.second.ranges) {
                auto& spans = entry.second;
                std::sort(spans.begin(), spans.end());
                size_t kept = 0;
                for (const auto& span : spans) {
                    if (kept > 0 && span.first <= spans[kept - 1].second + 1)
                        spans[kept - 1].second = std::max(spans[kept - 1].second, span.second);
                    else
                        spans[kept++] = span;
                }
                spans.resize(kept);
            }
        }
    }

    static bool Single(const Radical& r, const SelPoint& p, int rep) {
        return !r.singles.empty() && (r.singles.count({p.number, p.dotted, rep}) || r.singles.count({-1, p.dotted, rep}));
    }

    bool Matches(const SelPoint& p, bool station) const {
        const int rep = station ? p.rep : 0;
        if (Single(anyRadical, p, rep)) return true;
        const auto found = radicals.find(p.radical.str());
        if (found == radicals.end()) return false;
        if (Single(found->second, p, rep)) return true;
        const auto spans = found->second.ranges.find(rep);
        if (spans == found->second.ranges.end()) return false;
        const long long n = p.number;
        const auto after = std::upper_bound(spans->second.begin(), spans->second.end(), std::make_pair(n, LLONG_MAX));
        return after != spans->second.begin() && std::prev(after)->second >= n;
    }
};

CSelMatcher::CSelMatcher(const CString& sel) : m_sel(sel) {}
CSelMatcher::~CSelMatcher() = default;

int CSelMatcher::Contains(const CString& np) {
    if (m_sel.IsEmpty()) return 0;
    const bool station = IsStationRef(np);
    std::unique_ptr<Index>& index = station ? m_setUps : m_plain;
    if (!index) index = std::make_unique<Index>(m_sel, station);
    return index->Matches(Split(np, station), station) ? 1 : 0;
}

int CCarnet::GetSelStringCount(const CString& sel) {
    if (sel.IsEmpty()) return 0;
    long long count = 0;
    ForEachGroup(sel, [&count](const CString& group) {
        const int dash = group.Find('-');
        if (dash >= 0) {
            const Range range(group, dash);
            const bool station = IsStationRef(range.first);
            const long long a = Split(range.first, station).number;
            const long long b = Split(range.second, station).number;
            count += std::llabs(b - a) + 1;
        } else if (!group.IsEmpty()) {
            ++count;
        }
        // A count that an int cannot hold stays at the largest int.
        if (count >= INT_MAX) {
            count = INT_MAX;
            return false;
        }
        return true;
    });
    return static_cast<int>(count);
}

void CCarnet::DDX_Mat(CWnd* dlg, int id, CString& np) {
    if (dlg) dlg->GetDlgItemText(id, np);
    formMat(np);
    if (dlg) dlg->SetDlgItemText(id, np);
}

int CCarnet::DDV_Mat(CWnd* parent, int index, const CString& np) {
    // An empty field names no point, so it cannot clash with the elements
    // that have no point number.
    if (np.IsEmpty()) return 1;
    for (int i = 0; i < length(); ++i) {
        if (i == index || matAt(i) != np) continue;
        const int answer = ShowMessage(parent, MB_ICONQUESTION | MB_YESNO,
                                       "Le matricule '%s' est d\xE9j\xE0 utilis\xE9 !\n"
                                       "Voulez-vous quand m\xEAme le conserver ?",
                                       np.GetString());
        return answer == IDYES ? 1 : 0;
    }
    return 1;
}
