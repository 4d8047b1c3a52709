#include <carnet/ccarnet.h>

#include "points/element_access_internal.h"

using carnet_query::PointNumber;

int CCarnet::Find(unsigned int type, const CString& np, int first, int end) const {
    const bool any = np.IsEmpty();
    // Only types 1001 to 1007 carry a point number: a named search can match
    // nothing else. The number is compared in place, with no copy per element.
    const ElementOps* ops = type >= 1001 && type <= 1007 ? ElementOpsFor(type) : nullptr;
    if (!any && !(ops && ops->np)) return -1;
    const std::string& wanted = np.str();
    const std::uint32_t* types = m_Types.GetData();
    void* const* elements = m_Elements.GetData();
    auto matches = [&](int i) {
        if (types[i] != type) return false;
        if (any) return true;
        const void* p = elements[i];
        return p && ops->np(p)->str() == wanted;
    };
    if (end < 0) {
        if (first < 0) return -1;
        assert(first < length());
        for (int i = first; i >= 0; --i)
            if (matches(i)) return i;
        return -1;
    }
    const int last = end == 0 ? length() - 1 : end;
    if (first > last) return -1;
    assert(first >= 0 && last < length());
    for (int i = first; i <= last; ++i)
        if (matches(i)) return i;
    return -1;
}

CString CCarnet::cmdAt(int i) {
    assert(isValid(i));
    m_CmdText.Empty();
    const unsigned int code = m_Types.GetAt(i);
    const ElementOps* ops = ElementOpsFor(code);
    const void* p = m_Elements.GetAt(i);
    if (ops && ops->keyword && p)
        m_CmdText = ops->keyword(p);
    else if (const char* kw = CarnetKeyword(code))
        m_CmdText = kw;
    return m_CmdText;
}

CString CCarnet::matAt(int i) {
    assert(isValid(i));
    m_MatText.Empty();
    if (const CString* np = PointNumber(m_Elements.GetAt(i), m_Types.GetAt(i))) m_MatText = *np;
    return m_MatText;
}

CString CCarnet::symAt(int i) {
    assert(isValid(i));
    m_SymText.Empty();
    const unsigned int code = m_Types.GetAt(i);
    const void* p = m_Elements.GetAt(i);
    if (code >= 1001 && code <= 1006 && p) {
        const ElementOps* ops = ElementOpsFor(code);
        if (ops && ops->sy) m_SymText = *ops->sy(p);
    }
    return m_SymText;
}

CString CCarnet::parAt(int i) {
    assert(isValid(i));
    m_ParText.Empty();
    const ElementOps* ops = ElementOpsFor(m_Types.GetAt(i));
    void* p = m_Elements.GetAt(i);
    if (ops && ops->params && p) ops->params(p, m_ParText);
    return m_ParText;
}
