// Saving a field book and keeping a backup of its previous file. Whatever
// goes wrong, a file on disk is either the old one or the complete new one
// (CarnetWriteFile); a device or a pipe, which cannot be replaced, is
// written to instead.
#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <string>

#include <carnet/ccarnet.h>
#include <carnet/filedlg.h>
#include <carnet/messages.h>

#include "file/file_texts_internal.h"

namespace {

int Failed(int err) { return err ? err : EIO; }

}  // namespace

int CCarnet::FileSave(const CString& initialName) {
    FileDialogRequest request{true, carnet_texts::kSaveTitle, carnet_texts::kFilter, initialName.GetString(),
                              OFN_HIDEREADONLY | OFN_OVERWRITEPROMPT | OFN_PATHMUSTEXIST};
    std::string chosen;
    if (!CallFileDialog(request, chosen)) return 0;
    m_FileName = chosen;
    return 1;
}

int CCarnet::Save(const CString& fileName, CWnd* pParent, bool bAppend) {
    // The name may be our own m_FileName, which the dialog changes.
    const CString given = fileName;
    const CString previous = m_FileName;
    if (given.IsEmpty() && !FileSave(m_FileName)) return 0;
    const CString path = given.IsEmpty() ? m_FileName : given;

    // The book's own file must still be the one that was read: another
    // writer's lines would otherwise be lost without a word.
    CarnetWriteOptions options;
    if (path == previous) options.expected = m_FileState;
    options.append = bAppend;
    CarnetFileState written;
    options.written = &written;
    const int err = CarnetWriteFile(path.GetString(), [this](std::FILE* f) {
        Write(f, 1);
        return std::ferror(f) ? Failed(errno) : 0;
    }, options);
    if (err != 0) {
        // A failed save leaves the book naming the file it was loaded from.
        m_FileName = previous;
        ShowWarning(pParent, carnet_texts::kCannotSave, path.GetString());
        return 0;
    }
    if (!given.IsEmpty()) m_FileName = given;
    // The file written is the one the book now stands for.
    m_FileState = written;
    return 1;
}

void CCarnet::Write(std::FILE* f, int n) {
    WriteOptions(f);
    for (int i = 0; i < length(); ++i) writeAt(i, f, n > 0 ? n + i : 0);
}

void CCarnet::Write(std::FILE* f, const CString& paramFile, int n) {
    m_ParamFile = paramFile;
    Write(f, n);
}

CString CCarnet::BackUpName() const {
    // The rule applies to the file name only, never across a folder.
    const std::string path = m_FileName.str();
    const size_t slash = path.rfind('/');
    const size_t name = slash == std::string::npos ? 0 : slash + 1;
    if (path.size() - name < 3) return CString(path + ".sbk");
    return CString(path.substr(0, path.size() - 3) + "sbk");
}

void CCarnet::BackUp() { TryBackUp(nullptr); }

int CCarnet::TryBackUp(int* error) {
    int err = 0;
    int made = -1;
    // Only a file can be copied: a folder or a device has no previous version.
    struct stat st;
    const CString backup = BackUpName();
    CarnetFileBytes data;
    if (::stat(m_FileName.GetString(), &st) != 0 || !S_ISREG(st.st_mode)) {
        made = 0;
    } else if (backup == m_FileName) {
        err = EEXIST;
    } else if ((err = data.Read(m_FileName.GetString())) == 0) {
        // The backup is a new regular file with the book's permissions; a
        // link, a folder, a pipe or a device at its name is refused, never
        // followed or written to.
        CarnetWriteOptions options;
        options.like = &st;
        options.regularOnly = true;
        err = CarnetWriteFile(backup.GetString(), [&data](std::FILE* f) {
            const std::string_view bytes = data.View();
            return std::fwrite(bytes.data(), 1, bytes.size(), f) == bytes.size() ? 0 : Failed(errno);
        }, options);
        if (err == 0) made = 1;
    }
    if (error) *error = err;
    return made;
}
