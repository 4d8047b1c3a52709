#include <sys/stat.h>


#include <carnet/ccarnet.h>
#include <carnet/filedlg.h>
#include <carnet/messages.h>

#include "file/file_texts_internal.h"
#include "file/line_reader_internal.h"
#include "file/reader_internal.h"

int CCarnet::FileOpen(const CString& initialName, CWnd* pParent) {
    FileDialogRequest request{false, carnet_texts::kOpenTitle, carnet_texts::kFilter, initialName.GetString(),
                              OFN_FILEMUSTEXIST | OFN_NOREADONLYRETURN};
    std::string chosen;
    if (!CallFileDialog(request, chosen)) return 0;
    struct stat st;
    if (stat(chosen.c_str(), &st) != 0) {
        // The chosen file is gone: say so and load nothing, rather than
        // falling back on the previous file without a word.
        ShowWarning(pParent, carnet_texts::kCannotOpen, initialName.GetString());
        return 0;
    }
    m_FileName = chosen;
    return 1;
}

int CCarnet::Load(CNorvexTxtWnd* pWnd, const CString& fileName, const CString& paramFile, int bAppend,
                  CWnd* pParent) {
    m_ParamFile = paramFile;
    return Load(pWnd, fileName, bAppend, pParent);
}

int CCarnet::Load(CNorvexTxtWnd* pWnd, const CString& fileName, int bAppend, CWnd* pParent) {
    // The name may be one of our own members; keep a copy before anything changes.
    const CString name = fileName;
    if (name.IsEmpty() && !FileOpen(m_FileName, pParent)) return 0;
    const CString path = name.IsEmpty() ? m_FileName : name;

    carnet_file::LineReader in(path.GetString());
    if (!in.IsOpen()) {
        ShowWarning(pParent, carnet_texts::kCannotOpen, path.GetString());
        return 0;
    }
    int counter = 0;
    if (!bAppend)
        removeAll(1);
    else
        counter = length();

    for (std::string_view line; in.Next(line);) {
        if (line.empty()) continue;
        if (carnet_reader::ReadOneLine(*this, pWnd, line, counter, bAppend)) ++counter;
    }
    if (!bAppend && !name.IsEmpty()) m_FileName = name;
    return length() >= 1 ? 1 : 0;
}
