// Values of the element at an index, point queries by point number, and the
// context of an observation (eccentrics, instrument, repetition of its
// station, height computation).
#include <carnet/ccarnet.h>
#include <carnet/lecture.h>
#include <carnet/point.h>
#include <carnet/reference.h>
#include <carnet/station.h>
#include <carnet/undef.h>

#include "points/element_access_internal.h"

using carnet_query::ElementAs;

namespace {

constexpr unsigned int kStation = TypeCode<CStation>::value;
constexpr unsigned int kPoint = TypeCode<CPointGen>::value;

constexpr int kRadial = 0;
constexpr int kTangential = 1;
constexpr int kVertical = 2;

// A reference or a measure (a measure is a reference under another keyword).
const CReference* ObservationAt(const CCarnet& book, int i) {
    if (const CMesure* m = ElementAs<CMesure>(book, i)) return m;
    return ElementAs<CReference>(book, i);
}

template <class Get>
double ObservationValue(const CCarnet& book, int i, Get get) {
    const CReference* o = ObservationAt(book, i);
    return o ? get(*o) : UNDEF_VALUE;
}

template <class Get>
double ReadingValue(const CCarnet& book, int i, Get get) {
    if (const CLectAR* r = ElementAs<CLectAR>(book, i)) return get(*r);
    if (const CLectAV* r = ElementAs<CLectAV>(book, i)) return get(*r);
    return UNDEF_VALUE;
}

template <class Get>
double PointValue(const CCarnet& book, int i, Get get) {
    const CPointGen* p = ElementAs<CPointGen>(book, i);
    return p ? get(*p) : UNDEF_VALUE;
}

template <class Get>
double StationValue(const CCarnet& book, int i, Get get) {
    const CStation* s = ElementAs<CStation>(book, i);
    return s ? get(*s) : UNDEF_VALUE;
}

// The point number of the element at index i, read in place; empty for a
// type without one.
const CString& NumberAt(const CCarnet& book, int i) {
    static const CString none;
    const CString* np = carnet_query::PointNumber(book.ptrAt(i), book.typAt(i));
    return np ? *np : none;
}

struct Coords {
    double x = UNDEF_VALUE;
    double y = UNDEF_VALUE;
    double z = UNDEF_VALUE;
};

// The first point element of the book bearing that number (any point for an
// empty number), and its coordinates; a null element reads as a point whose
// coordinates are all unknown.
int FirstPoint(const CCarnet& book, const CString& np, Coords& c) {
    const int k = book.Find(kPoint, np, 0, 0);
    if (k >= 0)
        if (const CPointGen* p = static_cast<const CPointGen*>(book.ptrAt(k))) c = {p->m_X, p->m_Y, p->m_Z};
    return k;
}

// The first point of that number when it knows every coordinate asked for
// (a non-null out-value), which is then written; else -1, nothing written.
int KnownPoint(const CCarnet& book, const CString& np, double* x, double* y, double* z) {
    Coords c;
    const int k = FirstPoint(book, np, c);
    if (k < 0 || (x && IsUndef(c.x)) || (y && IsUndef(c.y)) || (z && IsUndef(c.z))) return -1;
    if (x) *x = c.x;
    if (y) *y = c.y;
    if (z) *z = c.z;
    return k;
}

// The value of the eccentric of that kind standing before the observation at
// index i, above the lower index; the previous observation or point closes
// the group.
double EccentricValue(const CCarnet& book, int i, int lower, int kind) {
    assert(i >= 0 && i <= book.length());
    const int stop = lower < -1 ? -1 : lower;
    for (int j = i - 1; j > stop; --j) {
        const unsigned int t = book.typAt(j);
        if (carnet_query::HasPointNumber(t)) return 0.0;
        if (t != TypeCode<CExcent>::value) continue;
        const CExcent* e = static_cast<const CExcent*>(book.ptrAt(j));
        if (e && e->getTyp() == kind) return e->getVal();
    }
    return 0.0;
}

// The nearest station at or before index i, or -1.
int GoverningStation(const CCarnet& book, int i) { return book.Find(kStation, CString(), i, -1); }

}  // namespace

double CCarnet::xAt(int i) const { return PointValue(*this, i, [](const CPointGen& p) { return p.m_X; }); }
double CCarnet::yAt(int i) const { return PointValue(*this, i, [](const CPointGen& p) { return p.m_Y; }); }
double CCarnet::zAt(int i) const { return PointValue(*this, i, [](const CPointGen& p) { return p.m_Z; }); }
double CCarnet::hiAt(int i) const { return StationValue(*this, i, [](const CStation& s) { return s.Hi(); }); }
double CCarnet::v0At(int i) const { return StationValue(*this, i, [](const CStation& s) { return s.V0(); }); }
double CCarnet::hpAt(int i) const { return ObservationValue(*this, i, [](const CReference& o) { return o.Hp(); }); }
double CCarnet::ahAt(int i) const { return ObservationValue(*this, i, [](const CReference& o) { return o.Ah(); }); }
double CCarnet::avAt(int i) const { return ObservationValue(*this, i, [](const CReference& o) { return o.Av(); }); }
double CCarnet::diAt(int i) const { return ObservationValue(*this, i, [](const CReference& o) { return o.Di(); }); }
double CCarnet::lmAt(int i) const { return ReadingValue(*this, i, [](const auto& r) { return r.Lm(); }); }
double CCarnet::dhAt(int i) const { return ReadingValue(*this, i, [](const auto& r) { return r.Dh(); }); }

double CCarnet::findER(int i, int lower) const { return EccentricValue(*this, i, lower, kRadial); }
double CCarnet::findET(int i, int lower) const { return EccentricValue(*this, i, lower, kTangential); }
double CCarnet::findEV(int i, int lower) const { return EccentricValue(*this, i, lower, kVertical); }

int CCarnet::hasPnt(const CString& np) const { return Find(kPoint, np, 0, 0); }
int CCarnet::hasPnt(int i) const { return hasPnt(NumberAt(*this, i)); }

int CCarnet::hasPnt(const CString& np, double& x, double& y, double& z) const {
    Coords c;
    const int k = FirstPoint(*this, np, c);
    if (k < 0) return -1;
    x = c.x;
    y = c.y;
    z = c.z;
    return k;
}

// By element index, the point must also have all three coordinates.
int CCarnet::hasPnt(int i, double& x, double& y, double& z) const { return hasXYZ(NumberAt(*this, i), x, y, z); }

int CCarnet::hasXYZ(const CString& np) const {
    double x, y, z;
    return KnownPoint(*this, np, &x, &y, &z);
}

int CCarnet::hasXYZ(int i) const { return hasXYZ(NumberAt(*this, i)); }
int CCarnet::hasXYZ(const CString& np, double& x, double& y, double& z) const { return KnownPoint(*this, np, &x, &y, &z); }
int CCarnet::hasXYZ(int i, double& x, double& y, double& z) const { return hasXYZ(NumberAt(*this, i), x, y, z); }

int CCarnet::hasXY(const CString& np) const {
    double x, y;
    return KnownPoint(*this, np, &x, &y, nullptr);
}

int CCarnet::hasXY(int i) const { return hasXY(NumberAt(*this, i)); }
int CCarnet::hasXY(const CString& np, double& x, double& y) const { return KnownPoint(*this, np, &x, &y, nullptr); }
int CCarnet::hasXY(int i, double& x, double& y) const { return hasXY(NumberAt(*this, i), x, y); }

int CCarnet::hasZ(const CString& np) const {
    double z;
    return KnownPoint(*this, np, nullptr, nullptr, &z);
}

int CCarnet::hasZ(int i) const { return hasZ(NumberAt(*this, i)); }
int CCarnet::hasZ(const CString& np, double& z) const { return KnownPoint(*this, np, nullptr, nullptr, &z); }
int CCarnet::hasZ(int i, double& z) const { return hasZ(NumberAt(*this, i), z); }

double CCarnet::zFor(const CString& np) const {
    double z = UNDEF_VALUE;
    hasZ(np, z);
    return z;
}

double CCarnet::zFor(int i) const { return zFor(NumberAt(*this, i)); }

CAppareil* CCarnet::findAppAt(int i) const {
    assert(isValid(i));
    const int s = GoverningStation(*this, i);
    // An instrument placed after the station is not the one in force.
    const int a = s > 0 ? Find(TypeCode<CAppareil>::value, CString(), s - 1, -1) : -1;
    return a >= 0 ? static_cast<CAppareil*>(ptrAt(a)) : nullptr;
}

int CCarnet::findRepAt(int i, CString& np) const {
    assert(isValid(i));
    const int s = GoverningStation(*this, i);
    if (s < 0) return 0;
    const CString name = NumberAt(*this, s);
    int count = 1;
    for (int j = Find(kStation, name, s - 1, -1); j >= 0; j = Find(kStation, name, j - 1, -1)) ++count;
    np = name;
    return count;
}

int CCarnet::isObsAltiAt(int i, int bStation) const {
    assert(isValid(i));
    const CReference* obs = ObservationAt(*this, i);
    if (!obs) return 0;
    const int s = GoverningStation(*this, i);
    const CStation* station = s >= 0 ? static_cast<const CStation*>(ptrAt(s)) : nullptr;
    if (!station || IsUndef(station->Hi())) return 0;
    if (IsUndef(obs->Hp()) || IsUndef(obs->Av())) return 0;
    if (!(obs->Di() > 0.0)) return 0;
    return hasZ(bStation ? station->Np() : obs->Np()) >= 0 ? 1 : 0;
}
