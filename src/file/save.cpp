// Saving a field book and keeping a backup of its previous file. Whatever
// goes wrong, a file on disk is either the old one or the complete new one:
// the new bytes are prepared in memory and replace the file as a whole
// (a device or a pipe, which cannot be replaced, is written to instead).
#include <sys/stat.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
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

// Writes to something that is not a regular file (a terminal, a pipe,
// /dev/null): it cannot be replaced, only written to.
int WriteInPlace(const std::string& path, const std::string& data, bool append) {
    std::FILE* f = std::fopen(path.c_str(), append ? "ab" : "wb");
    if (!f) return Failed(errno);
    int err = 0;
    if (std::fwrite(data.data(), 1, data.size(), f) != data.size()) err = Failed(errno);
    if (std::fflush(f) != 0 && !err) err = Failed(errno);
    if (std::fclose(f) != 0 && !err) err = Failed(errno);
    return err;
}

// Puts data in the file (after its present bytes when appending). A regular
// or new file is replaced as a whole, keeping its permissions. Returns 0 or
// an errno.
int StoreBytes(const std::string& path, const std::string& data, bool append, unsigned int newMode) {
    struct stat st;
    const bool exists = ::stat(path.c_str(), &st) == 0;
    if (exists && !S_ISREG(st.st_mode)) return WriteInPlace(path, data, append);
    if (!exists || !append) return carnet_storefile::ReplaceAtomically(path, data, newMode);
    std::string whole;
    if (int err = carnet_storefile::ReadAll(path, whole)) return err;
    whole += data;
    return carnet_storefile::ReplaceAtomically(path, whole, newMode);
}

// The book as Write gives it, with lines numbered from 1.
int WriteToMemory(CCarnet& book, std::string& out) {
    char* buffer = nullptr;
    size_t size = 0;
    std::FILE* f = ::open_memstream(&buffer, &size);
    if (!f) return Failed(errno);
    book.Write(f, 1);
    int err = std::ferror(f) ? EIO : 0;
    if (std::fclose(f) != 0 && !err) err = Failed(errno);
    if (!err) out.assign(buffer, size);
    std::free(buffer);
    return err;
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

    std::string block;
    int err = WriteToMemory(*this, block);
    if (!err) err = StoreBytes(path.str(), block, bAppend, kNewFileMode);
    if (err) {
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
    StoreBytes(BackUpName(m_FileName.str()), data, false, st.st_mode & 0777);
}
