// Saving a field book and keeping a backup of its previous file. Whatever
// goes wrong, a file on disk is either the old one or the complete new one:
// the new bytes go to a temporary file that then replaces the file as a
// whole (a device or a pipe, which cannot be replaced, is written to
// instead).
#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <string>

#include <carnet/ccarnet.h>
#include <carnet/filedlg.h>
#include <carnet/messages.h>

#include "file/file_texts_internal.h"
#include "platform/storefile_internal.h"

namespace {

// New files get the usual rw-rw-rw- less the umask, as fopen gives.
constexpr unsigned int kNewFileMode = 0666;

int Failed(int err) { return err ? err : EIO; }

using carnet_storefile::Filler;

// Writes to something that is not a regular file (a terminal, a pipe,
// /dev/null): it cannot be replaced, only written to.
int WriteInPlace(const std::string& path, bool append, const Filler& fill) {
    std::FILE* f = std::fopen(path.c_str(), append ? "ab" : "wb");
    if (!f) return Failed(errno);
    int err = fill(f);
    if (std::fflush(f) != 0 && !err) err = Failed(errno);
    if (std::ferror(f) && !err) err = EIO;
    if (std::fclose(f) != 0 && !err) err = Failed(errno);
    return err;
}

// Puts the bytes that `fill` writes in the file (after its present bytes
// when appending). A regular or new file is replaced as a whole, keeping its
// permissions. Returns 0 or an errno.
int StoreBytes(const std::string& path, bool append, unsigned int newMode, const Filler& fill) {
    struct stat st;
    const bool exists = ::stat(path.c_str(), &st) == 0;
    if (exists && !S_ISREG(st.st_mode)) return WriteInPlace(path, append, fill);
    if (!exists || !append) return carnet_storefile::ReplaceAtomicallyWith(path, newMode, fill);
    std::string previous;
    if (int err = carnet_storefile::ReadAll(path, previous)) return err;
    return carnet_storefile::ReplaceAtomicallyWith(path, newMode, [&](std::FILE* f) {
        if (int err = carnet_storefile::WriteAllTo(f, previous)) return err;
        return fill(f);
    });
}

// The book as Write gives it, with lines numbered from 1, streamed to the
// file as it is formatted.
Filler BookLines(CCarnet& book) {
    return [&book](std::FILE* f) {
        book.Write(f, 1);
        return std::ferror(f) ? Failed(errno) : 0;
    };
}

// The backup sits beside the file: its last three characters become "sbk".
std::string BackUpName(const std::string& name) {
    if (name.size() < 3) return "sbk";
    return name.substr(0, name.size() - 3) + "sbk";
}

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

    if (StoreBytes(path.str(), bAppend, kNewFileMode, BookLines(*this)) != 0) {
        // A failed save leaves the book naming the file it was loaded from.
        m_FileName = previous;
        ShowWarning(pParent, carnet_texts::kCannotSave, path.GetString());
        return 0;
    }
    if (!given.IsEmpty()) m_FileName = given;
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

void CCarnet::BackUp() {
    // Only a file can be copied: a folder or a device has no previous version.
    struct stat st;
    if (::stat(m_FileName.GetString(), &st) != 0 || !S_ISREG(st.st_mode)) return;
    std::string data;
    if (carnet_storefile::ReadAll(m_FileName.str(), data) != 0) return;
    // A new backup is no more readable by others than the file it copies.
    StoreBytes(BackUpName(m_FileName.str()), false, st.st_mode & 0777,
               [&data](std::FILE* f) { return carnet_storefile::WriteAllTo(f, data); });
}
