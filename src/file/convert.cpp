// Switching an element off into a comment that holds its file line, and
// back. Both go through the line reader, so a converted element is built and
// checked exactly as a loaded one.
#include <carnet/ccarnet.h>
#include <carnet/comment.h>

#include "core/dispatch_internal.h"

void CCarnet::changeObjectIntoComment(CNorvexTxtWnd* pWnd, int i) {
    assert(isValid(i));
    const unsigned int code = m_Types.GetAt(i);
    // A comment stays as it is; a type without a one-line file text (a
    // traverse path) cannot become one.
    if (code == TypeCode<CComment>::value) return;
    void* old = m_Elements.GetAt(i);
    const ElementOps* ops = ElementOpsFor(code);
    if (!old || !ops || !ops->infos) return;
    CString line("Commentaire ");
    CString infos;
    ops->infos(old, infos);
    line += infos;
    int index = i;
    if (ReadLine(pWnd, line, index, 0)) removeElement(old, code);
}

void CCarnet::changeCommentIntoObject(CNorvexTxtWnd* pWnd, int i) {
    assert(isValid(i));
    if (m_Types.GetAt(i) != TypeCode<CComment>::value) return;
    auto* comment = static_cast<CComment*>(m_Elements.GetAt(i));
    if (!comment) return;
    CString text = comment->Str();
    int index = i;
    void* made = ReadLine(pWnd, text, index, 0);
    // A new path is appended rather than written over the comment; the
    // comment then stays, so nothing is lost and nothing is freed twice.
    if (made && m_Elements.GetAt(i) == made) removeElement(comment, TypeCode<CComment>::value);
}
