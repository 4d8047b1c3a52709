// Validation of records that the host builds itself: checks, normalisation,
// the merge of points of the same name, and the notes added as comments.
#include <cmath>
#include <string>

#include <carnet/ccarnet.h>
#include <carnet/comment.h>
#include <carnet/numconv.h>
#include <carnet/point.h>
#include <carnet/reference.h>
#include <carnet/station.h>

#include "file/file_texts_internal.h"

namespace {

// Fills the "%s" of a caller's format with a, then b, then nothing; "%%"
// gives "%". Any other '%' is kept as it stands, so no format can read
// arguments that were never given.
std::string FillFormat(const char* fmt, const char* a, const char* b) {
    std::string out;
    const char* args[2] = {a, b};
    int used = 0;
    for (const char* p = fmt; *p; ++p) {
        if (p[0] == '%' && p[1] == 's') {
            if (used < 2) out += args[used];
            ++used;
            ++p;
        } else if (p[0] == '%' && p[1] == '%') {
            out += '%';
            ++p;
        } else {
            out += *p;
        }
    }
    return out;
}

constexpr unsigned int kPoint = TypeCode<CPointGen>::value;

void Say(CNorvexTxtWnd* wnd, const char* format, int line, const CString& name) {
    if (wnd) wnd->Printf(1, format, line, name.GetString());
}

template <class Observation>
void NormaliseAndAdd(CCarnet& book, CNorvexTxtWnd* wnd, Observation* p, int line, const char* incomplete) {
    std::string note;
    if (!IsUndef(p->Di()) && p->Di() < 0.0) {
        // A negative distance is a horizontal one.
        const double dh = -p->Di();
        if (IsUndef(p->Av())) {
            p->setDi(dh);
            p->setAv(100.0);
        } else {
            static const double pi = 2.0 * std::asin(1.0);
            p->setDi(dh / std::fabs(std::sin(p->Av() * pi / 200.0)));
        }
        note = numconv::Format(carnet_texts::kDistanceNote, dh, p->Di(), p->Av());
    }
    const bool aPresent = !IsUndef(p->Ah()), vPresent = !IsUndef(p->Av()), dPresent = !IsUndef(p->Di());
    if (IsUndef(p->Hp()) && aPresent && vPresent && dPresent) p->setHp(0.0);
    if (!IsUndef(p->Hp()) && (!dPresent || !vPresent)) p->setHp(UNDEF_VALUE);
    if (p->isOk()) {
        if (!note.empty()) book.validComment(note.c_str(), " ", "");
        book.append(p, TypeCode<Observation>::value);
    } else if (!p->isTemp()) {
        Say(wnd, incomplete, line, p->Np());
        delete p;
    }
}

}  // namespace

void CCarnet::validComment(const char* fmt, const CString& a, const CString& b) {
    if (a.IsEmpty() || !fmt) return;
    append(new CComment(CString(FillFormat(fmt, a.GetString(), b.IsEmpty() ? "" : b.GetString()))),
           TypeCode<CComment>::value);
}

CStation* CCarnet::validStation(CNorvexTxtWnd* pWnd, CStation* p, int line) {
    if (!p) return nullptr;
    if (p->isOk()) {
        append(p, TypeCode<CStation>::value);
    } else {
        Say(pWnd, carnet_texts::kStationIncomplete, line, p->Np());
        delete p;
    }
    return nullptr;
}

CReference* CCarnet::validReference(CNorvexTxtWnd* pWnd, CReference* p, int line) {
    if (p) NormaliseAndAdd(*this, pWnd, p, line, carnet_texts::kReferenceIncomplete);
    return nullptr;
}

CMesure* CCarnet::validMesure(CNorvexTxtWnd* pWnd, CMesure* p, int line) {
    if (p) NormaliseAndAdd(*this, pWnd, p, line, carnet_texts::kMesureIncomplete);
    return nullptr;
}

CPointGen* CCarnet::validPoint(CNorvexTxtWnd* pWnd, CPointGen* p, int line) {
    if (!p) return nullptr;
    if (!p->isOk()) {
        if (!p->isTemp()) Say(pWnd, carnet_texts::kPointIncomplete, line, p->m_Np);
        delete p;
        return nullptr;
    }
    if (p->is3D()) {
        p->m_bXConst = 1;
        p->m_bZConst = 1;
    } else if (p->is2D()) {
        p->m_bXConst = 1;
    } else if (p->is1D()) {
        p->m_bZConst = 1;
    }
    if (line < 0) {
        append(p, kPoint);
        return nullptr;
    }

    int found = 0, merged = 0, unchanged = 0;
    bool conflict = false;
    const bool pXY = p->hasXY() != 0, pZ = p->hasZ() != 0;
    auto sameXY = [p](const CPointGen* e) {
        return (IsUndef(p->m_X) || p->m_X == e->m_X) && (IsUndef(p->m_Y) || p->m_Y == e->m_Y);
    };
    for (int i = Find(kPoint, p->m_Np, 0, 0); i >= 0; i = i + 1 < length() ? Find(kPoint, p->m_Np, i + 1, 0) : -1) {
        CPointGen* e = static_cast<CPointGen*>(ptrAt(i));
        ++found;
        auto takeSymbol = [&] {
            if (e->m_Sy.IsEmpty() && !p->m_Sy.IsEmpty()) e->m_Sy = p->m_Sy;
        };
        auto symbolStep = [&] {
            if (e->m_Sy.IsEmpty() && !p->m_Sy.IsEmpty()) {
                e->m_Sy = p->m_Sy;
                ++merged;
            } else {
                ++unchanged;
            }
        };
        auto takeXY = [&] {
            e->m_X = p->m_X;
            e->m_Y = p->m_Y;
            e->m_bXConst = e->m_bZConst = 1;
            ++merged;
            takeSymbol();
        };
        if (e->hasXYZ()) {
            if (sameXY(e) && (!pZ || p->m_Z == e->m_Z))
                symbolStep();
            else
                conflict = true;
        } else if (e->hasXY()) {
            if (!sameXY(e)) {
                conflict = true;
            } else if (!pZ) {
                symbolStep();
            } else {
                e->m_Z = p->m_Z;
                e->m_bXConst = e->m_bZConst = 1;
                ++merged;
                takeSymbol();
            }
        } else if (e->hasZ()) {
            if (pZ && p->m_Z != e->m_Z)
                conflict = true;
            else if (pXY)
                takeXY();
            else
                symbolStep();
        } else if (e->m_bZConst) {
            if (pZ)
                conflict = true;
            else if (pXY)
                takeXY();
            else
                symbolStep();
        }
    }
    if (conflict && pWnd) pWnd->Printf(1, carnet_texts::kPointDuplicated, p->m_Np.GetString());
    // Absorbed into the earlier points: the record stays with the caller.
    if (found > 0 && !conflict && merged + unchanged == found) return nullptr;
    append(p, kPoint);
    return nullptr;
}
