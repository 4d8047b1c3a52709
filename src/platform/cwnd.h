// Owner-window stand-in. It also holds the texts of dialog controls, which
// the point-number field exchange reads and writes.
#pragma once

#include <map>

#include <carnet/cstring.h>

class CWnd {
public:
    CWnd() = default;
    virtual ~CWnd() = default;
    void SetDlgItemText(int id, const char* text) { m_items[id] = CString(text); }
    // Copies the control's text into out and returns its length (an unknown
    // control reads as empty).
    int GetDlgItemText(int id, CString& out) const {
        auto it = m_items.find(id);
        out = it == m_items.end() ? CString() : it->second;
        return out.GetLength();
    }

private:
    std::map<int, CString> m_items;
};
