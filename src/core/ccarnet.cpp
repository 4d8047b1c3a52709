#include <carnet/ccarnet.h>

#include <carnet/numconv.h>

#include "core/dispatch_internal.h"

int CCarnet::m_DeciXY = 4;
int CCarnet::m_DeciZ = 4;
int CCarnet::m_DeciAng = 5;

CCarnet::CCarnet(int nSize, int nGrowBy) : m_FileName("Sitebook.geo") {
    m_Elements.SetSize(nSize, nGrowBy);
    m_Types.SetSize(nSize, nGrowBy);
}

CCarnet::~CCarnet() { removeAll(1); }

int CCarnet::append(void* p, unsigned int t) {
    m_Elements.Add(p);
    return m_Types.Add(t);
}

CCarnet& CCarnet::insertAt(int i, void* p, unsigned int t) {
    assert(i >= 0 && i <= length());
    m_Elements.InsertAt(i, p);
    m_Types.InsertAt(i, t);
    return *this;
}

CCarnet& CCarnet::removeAt(int i, int bDelete) {
    assert(isValid(i));
    void* p = m_Elements.GetAt(i);
    unsigned int t = m_Types.GetAt(i);
    m_Elements.RemoveAt(i);
    m_Types.RemoveAt(i);
    if (bDelete) removeElement(p, t);
    return *this;
}

CCarnet& CCarnet::removeAll(int bDelete) {
    // Last to first, each entry out of the list before it is destroyed.
    for (int i = length() - 1; i >= 0; --i) removeAt(i, bDelete);
    return *this;
}

void CCarnet::removeElement(void* p, unsigned int t) { DestroyElement(p, t); }

void CCarnet::swapElements(int i, int j) {
    assert(isValid(i) && isValid(j));
    if (i == j) return;
    void* p = m_Elements.GetAt(i);
    unsigned int t = m_Types.GetAt(i);
    m_Elements.SetAt(i, m_Elements.GetAt(j));
    m_Types.SetAt(i, m_Types.GetAt(j));
    m_Elements.SetAt(j, p);
    m_Types.SetAt(j, t);
}

void CCarnet::printAt(CNorvexTxtWnd* w, int i, int n) {
    assert(isValid(i));
    if (const ElementOps* ops = ElementOpsFor(m_Types.GetAt(i))) {
        if (void* p = m_Elements.GetAt(i)) ops->print(p, w, n);
    }
}

void CCarnet::writeAt(int i, std::FILE* f, int n) {
    assert(isValid(i));
    if (const ElementOps* ops = ElementOpsFor(m_Types.GetAt(i))) {
        if (void* p = m_Elements.GetAt(i)) ops->write(p, f, n);
    }
}

void CCarnet::Print(CNorvexTxtWnd* w, int n) {
    for (int i = 0; i < length(); ++i) printAt(w, i, n > 0 ? n + i : 0);
}

double CCarnet::formatXY(double v) { return numconv::Round(v, m_DeciXY); }
double CCarnet::formatZ(double v) { return numconv::Round(v, m_DeciZ); }
double CCarnet::formatAng(double v) { return numconv::Round(v, m_DeciAng); }
