// Loading a field book: from a file read once into memory, or from bytes a
// host already holds, line by line through the same reader.
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

    CarnetFileBytes bytes;
    if (bytes.Read(path.GetString()) != 0) {
        ShowWarning(pParent, carnet_texts::kCannotOpen, path.GetString());
        return 0;
    }
    const CString paramFile = m_ParamFile;
    const int loaded = LoadBytes(pWnd, bytes.View(), paramFile, bAppend, [&bytes](size_t done) { bytes.Release(done); });
    if (!bAppend) {
        if (!name.IsEmpty()) m_FileName = name;
        m_FileState = bytes.State();
    }
    return loaded;
}

int CCarnet::LoadBytes(CNorvexTxtWnd* pWnd, std::string_view bytes, const CString& paramFile, int bAppend,
                       const std::function<void(size_t)>& released) {
    m_ParamFile = paramFile;
    int counter = 0;
    if (!bAppend) {
        removeAll(1);
        m_FileState = CarnetFileState();
    } else {
        counter = length();
    }
    // The caller may give back the bytes read every few megabytes, so that
    // the text and the book it becomes are not both held whole.
    constexpr size_t kReleaseStep = size_t{4} << 20;
    size_t nextRelease = kReleaseStep;
    carnet_file::ForEachLine(bytes, [&](std::string_view line, size_t end) {
        if (!line.empty() && carnet_reader::ReadOneLine(*this, pWnd, line, counter, bAppend)) ++counter;
        if (released && end >= nextRelease) {
            released(end);
            nextRelease = end + kReleaseStep;
        }
        return true;
    });
    return length() >= 1 ? 1 : 0;
}
