// Free-text elements: a comment and a command, each written back exactly as
// held.
#pragma once

#include <cstdio>

#include <carnet/cstring.h>
#include <carnet/txtwnd.h>

class CComment {
protected:
    CString m_Str;

public:
    CComment() = default;
    CComment(const CString& s) : m_Str(s) {}
    CComment(const char* s) : m_Str(s) {}
    CComment(const CComment&) = default;
    CComment& operator=(const CComment&) = default;
    ~CComment() = default;

    CString& Str() { return m_Str; }
    const CString& Str() const { return m_Str; }
    void setStr(const CString& s) { m_Str = s; }
    void setStr(const char* s) { m_Str = s; }

    void Params(CString& out) const { out = m_Str; }
    void Infos(CString& out) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;
};

class CCommand {
protected:
    CString m_Cmd;

public:
    CCommand() = default;
    CCommand(const CString& s) : m_Cmd(s) {}
    CCommand(const char* s) : m_Cmd(s) {}
    CCommand(const CCommand&) = default;
    CCommand& operator=(const CCommand&) = default;
    ~CCommand() = default;

    CString& getCmd() { return m_Cmd; }
    const CString& getCmd() const { return m_Cmd; }
    // Replaces the text; false when it was already that text.
    bool setCmd(const CString& s) { return setCmd(s.GetString()); }
    bool setCmd(const char* s);
    // Appends a word, after one blank when the text is not empty.
    void addCmd(const CString& s) { addCmd(s.GetString()); }
    void addCmd(const char* s);

    void Params(CString& out) const { out = m_Cmd; }
    void Infos(CString& out) const;
    void Print(CNorvexTxtWnd* wnd, int n) const;
    void Write(std::FILE* f, int n) const;
};
