// Point numbers ("matricules"): a radical, a number and a dotted flag, split,
// rebuilt, normalised, and the last and next numbers of a book.
#include <climits>

#include <carnet/ccarnet.h>
#include <carnet/cp1252.h>
#include <carnet/numconv.h>

namespace {

bool IsDigitAt(const CString& s, int i) { return cp1252::IsDigit(static_cast<unsigned char>(s[i])); }

bool HasStar(const CString& s) { return s.Find('*') >= 0; }

// The number of a text read with the atoi rules, saturated so that a long run
// of digits can never turn negative and read as a wildcard.
int NumberFrom(const CString& s, int first) { return numconv::Atoi(s.GetString() + first); }

// Digits and stars only (or nothing at all).
bool OnlyDigitsAndStars(const CString& s) {
    for (int i = 0; i < s.GetLength(); ++i)
        if (!IsDigitAt(s, i) && s[i] != '*') return false;
    return true;
}

// Cuts a station reference at its separator: the text before it and the
// repetition index read after it, or the whole text and index 1.
void CutStationRef(const CString& ref, bool hyphenToo, CString& station, int& rep) {
    int p = ref.Find('(');
    if (p < 0 && hyphenToo) p = ref.Find('-');
    if (p >= 0) {
        rep = NumberFrom(ref, p + 1);
        station = ref.Left(p);
    } else {
        rep = 1;
        station = ref;
    }
    station.Trim();
}

}  // namespace

void CCarnet::extrMat(const CString& np, CString& radical, int& number, int& dotted, int dropDots) {
    CString s = np;  // radical may be the very text being split
    if (dropDots) s.Remove('.');
    const int dot = s.Find('.');
    if (dot >= 0) {
        number = dot + 1 < s.GetLength() && s.Find('*', dot + 1) >= 0 ? -1 : NumberFrom(s, dot + 1);
        dotted = 1;
        radical = s.Left(dot);
        return;
    }
    dotted = 0;
    int start = s.GetLength();
    while (start > 0 && IsDigitAt(s, start - 1)) --start;
    if (start == s.GetLength()) {
        number = HasStar(s) ? -1 : 0;
        radical = s;
    } else {
        number = NumberFrom(s, start);
        radical = s.Left(start);
    }
}

void CCarnet::extrMat(const CString& np, CString& radical, int& number) {
    int dotted = 0;
    extrMat(np, radical, number, dotted, 0);
}

void CCarnet::formMat(const CString& radical, int number, int& dotted, CString& out) {
    CString s;
    if (radical.IsEmpty()) {
        dotted = 0;
        if (number > 0)
            s.Format("%d", number);
        else if (number < 0)
            s = "*";
    } else if (number > 0) {
        s.Format(dotted ? "%s.%d" : "%s%d", radical.GetString(), number);
    } else {
        if (number == 0) {
            s = radical;
            dotted = 0;
        } else if (!dotted && radical[radical.GetLength() - 1] == '*') {
            // The radical of a plain wildcard already ends with its star
            // (P* splits into P* and -1): another one would make every
            // normalisation of P* one star longer.
            s = radical;
        } else {
            s = radical + (dotted ? ".*" : "*");
        }
        if (s == "**") s = "*";
    }
    out = s;
}

void CCarnet::formMat(CString& np, CString& radical, int& number, int& dotted, int keepStars) {
    CString s;
    for (int i = 0; i < np.GetLength(); ++i) {
        const char c = np[i];
        if (c == ' ' || c == '-' || c == ';' || (c == '*' && !keepStars)) continue;
        s += c;
    }
    np = s;
    const int dot = s.Find('.');
    if (dot < 0) {
        extrMat(s, radical, number, dotted, 0);
    } else if (s.Find('.', dot + 1) >= 0) {
        extrMat(s, radical, number, dotted, 1);
    } else {
        // A dot that comes first leaves an empty radical, whatever the
        // caller's variable held.
        radical = s.Left(dot);
        const CString tail = s.Mid(dot + 1);
        if (OnlyDigitsAndStars(tail)) {
            number = HasStar(tail) ? -1 : NumberFrom(tail, 0);
            dotted = 1;
        } else {
            np = radical + tail;
            extrMat(np, radical, number, dotted, 0);
        }
    }
    formMat(radical, number, dotted, np);
    // A number 0 leaves the radical alone, and a radical may read otherwise
    // on its own: digits at its end are a number (P07 from P07.0 is P7), a
    // star in it makes a wildcard (A*B from A*B00 is A*B*). Split and build
    // again until the result is what its own normalisation gives; two more
    // rounds always suffice.
    for (int round = 0; round < 2 && number == 0 && !dotted && !np.IsEmpty(); ++round) {
        extrMat(np, radical, number, dotted, 0);
        formMat(radical, number, dotted, np);
    }
}

void CCarnet::formMat(const CString& np, CString& out) {
    CString s = np;
    formMat(s);
    out = s;
}

void CCarnet::formMat(CString& np) {
    CString radical;
    int number = 0;
    int dotted = 0;
    formMat(np, radical, number, dotted, 1);
}

void CCarnet::extrStaRep(const CString& ref, CString& radical, int& number, int& rep, int& dotted, int dropDots) {
    CString station;
    CutStationRef(ref, false, station, rep);
    extrMat(station, radical, number, dotted, dropDots);
}

int CCarnet::extrStaRep(const CString& ref, CString& station, int& rep) const {
    CString s;
    CutStationRef(ref, true, s, rep);
    station = s;
    return findStaRep(s, rep);
}

int CCarnet::findStaRep(const CString& station, int rep) const {
    if (rep <= 0) return -1;
    constexpr unsigned int kStation = TypeCode<CStation>::value;
    int found = 0;
    for (int i = Find(kStation, station, 0, 0); i >= 0; i = Find(kStation, station, i + 1, 0))
        if (++found == rep) return i;
    return -1;
}

int CCarnet::findMat(const CString& np) {
    for (int i = 0; i < length(); ++i)
        if (matAt(i) == np) return i;
    return -1;
}

int CCarnet::lastInd(const CString& radical) {
    int best = 0;
    CString r;
    int n = 0;
    for (int i = 0; i < length(); ++i) {
        extrMat(matAt(i), r, n);
        if (r == radical && n > best) best = n;
    }
    return best;
}

CString CCarnet::lastMat(unsigned int type, int& index) {
    index = -1;
    // The best number starts below 1 so that a book whose last point is plain
    // 1 gives that point, and the next number proposed is 2, not 1 again.
    CString bestRadical;
    int bestNumber = 0;
    int bestDotted = 0;
    CString r;
    int n = 0;
    int d = 0;
    for (int i = 0; i < length(); ++i) {
        if (type != CARNET_ANY_TYPE && typAt(i) != type) continue;
        extrMat(matAt(i), r, n, d, 0);
        const int order = cp1252::Compare(r, bestRadical);
        if (order > 0 || (order == 0 && n > bestNumber)) {
            bestRadical = r;
            bestNumber = n;
            bestDotted = d;
            index = i;
        }
    }
    if (index < 0)
        m_MatText = "1";
    else
        formMat(bestRadical, bestNumber, bestDotted, m_MatText);
    return m_MatText;
}

CString CCarnet::lastMat(unsigned int type) {
    int index = -1;
    return lastMat(type, index);
}

CString CCarnet::nextMat(const CString& np) {
    CString radical;
    int number = 0;
    int dotted = 0;
    extrMat(np, radical, number, dotted, 0);
    // The largest number has no successor that an int can hold: keep it
    // rather than wrap to a negative number, which would read as a wildcard.
    if (number < INT_MAX) ++number;
    formMat(radical, number, dotted, m_MatText);
    return m_MatText;
}

CString CCarnet::nextMat(unsigned int type, int& index) {
    const CString last = lastMat(type, index);
    if (index >= 0) return nextMat(last);
    return m_MatText;
}

CString CCarnet::nextMat(unsigned int type) {
    int index = -1;
    return nextMat(type, index);
}
