#include <carnet/ccarnet.h>

#include "core/dispatch_internal.h"

void* CCarnet::copyElement(int from, int to) {
    assert(isValid(from));
    if (from == to) return nullptr;
    const unsigned int t = m_Types.GetAt(from);
    const void* src = m_Elements.GetAt(from);
    const ElementOps* ops = ElementOpsFor(t);
    void* copy = ops && src ? ops->copy(src) : nullptr;
    if (to >= length())
        append(copy, t);
    else if (to >= 0)
        insertAt(to, copy, t);
    return copy;
}

const CCarnet& CCarnet::operator=(const CCarnet& other) {
    if (&other == this) return *this;
    removeAll(1);
    m_Elements.Reserve(other.length());
    m_Types.Reserve(other.length());
    for (int i = 0; i < other.length(); ++i) {
        const unsigned int t = other.m_Types.GetAt(i);
        const void* src = other.m_Elements.GetAt(i);
        const ElementOps* ops = ElementOpsFor(t);
        if (!ops || !src) continue;
        if (void* copy = ops->assignNew(src)) append(copy, t);
    }
    m_FileName = other.m_FileName;
    m_ParamFile = other.m_ParamFile;
    m_FileState = other.m_FileState;
    m_CmdText = other.m_CmdText;
    m_MatText = other.m_MatText;
    m_ParText = other.m_ParText;
    m_SymText = other.m_SymText;
    return *this;
}
