#include <carnet/comment.h>

#include <carnet/cp1252.h>
#include <carnet/element_types.h>

#include "records/record_internal.h"

namespace {

// Keyword, one blank, then the text untouched.
void TextLine(CString& out, unsigned int typeCode, const CString& text) {
    out.Empty();
    carnet_line::AppendKeyword(out, CarnetKeyword(typeCode));
    out += ' ';
    out += text;
}

}  // namespace

void CComment::Infos(CString& out) const { TextLine(out, TypeCode<CComment>::value, m_Str); }
void CComment::Print(CNorvexTxtWnd* wnd, int n) const { carnet_record::PrintLine(*this, wnd, n); }
void CComment::Write(std::FILE* f, int n) const { carnet_record::WriteLine(*this, f, n); }

bool CCommand::setCmd(const char* s) {
    if (cp1252::Compare(m_Cmd, s) == 0) return false;  // a null s compares as ""
    m_Cmd = s;
    return true;
}

void CCommand::addCmd(const char* s) {
    if (!m_Cmd.IsEmpty()) m_Cmd += ' ';
    m_Cmd += s;
}

void CCommand::Infos(CString& out) const { TextLine(out, TypeCode<CCommand>::value, m_Cmd); }
void CCommand::Print(CNorvexTxtWnd* wnd, int n) const { carnet_record::PrintLine(*this, wnd, n); }
void CCommand::Write(std::FILE* f, int n) const { carnet_record::WriteLine(*this, f, n); }
