// Loading a field book: from a file, or from bytes a host already holds,
// line by line through the same loop and reader.
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <functional>
#include <string>

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

namespace {

// The loader's one loop: every line of the bytes it is given read and
// stored, the element counter kept from one call to the next.
struct Lines {
    CCarnet& book;
    CNorvexTxtWnd* wnd;
    int bAppend;
    int counter;

    Lines(CCarnet& b, CNorvexTxtWnd* w, int append) : book(b), wnd(w), bAppend(append), counter(0) {
        if (!bAppend)
            book.removeAll(1);
        else
            counter = book.length();
    }
    bool operator()(std::string_view line, size_t) {
        if (!line.empty() && carnet_reader::ReadOneLine(book, wnd, line, counter, bAppend)) ++counter;
        return true;
    }
};

// Reads a regular file 256 KiB at a time, every complete line handed to
// `lines` as it comes: the text is never held whole beside the book it
// becomes, and what is read stays in the caches while it is cut.
void ReadByChunks(int fd, Lines& lines) {
    std::string buffer(size_t{1} << 18, '\0');
    size_t held = 0;
    for (;;) {
        // A line longer than the buffer makes it grow.
        if (held == buffer.size()) buffer.resize(buffer.size() * 2);
        const ssize_t n = ::read(fd, &buffer[held], buffer.size() - held);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) break;
        const void* last = ::memrchr(&buffer[held], '\n', static_cast<size_t>(n));
        held += static_cast<size_t>(n);
        if (!last) continue;
        const size_t whole = static_cast<size_t>(static_cast<const char*>(last) - buffer.data()) + 1;
        carnet_file::ForEachLine(std::string_view(buffer.data(), whole), std::ref(lines));
        std::memmove(&buffer[0], &buffer[whole], held - whole);
        held -= whole;
    }
    carnet_file::ForEachLine(std::string_view(buffer.data(), held), std::ref(lines));
}

}  // namespace

int CCarnet::Load(CNorvexTxtWnd* pWnd, const CString& fileName, int bAppend, CWnd* pParent) {
    // The name may be one of our own members; keep a copy before anything changes.
    const CString name = fileName;
    if (name.IsEmpty() && !FileOpen(m_FileName, pParent)) return 0;
    const CString path = name.IsEmpty() ? m_FileName : name;

    const int fd = ::open(path.GetString(), O_RDONLY | O_CLOEXEC);
    struct stat st;
    const bool opened = fd >= 0 && ::fstat(fd, &st) == 0 && !S_ISDIR(st.st_mode);
    // What is not a regular file (a pipe, a device) may never end: it is
    // read whole first, within a bound, and refused beyond it.
    CarnetFileBytes stream;
    if (!opened || (!S_ISREG(st.st_mode) && stream.Read(path.GetString()) != 0)) {
        if (fd >= 0) ::close(fd);
        ShowWarning(pParent, carnet_texts::kCannotOpen, path.GetString());
        return 0;
    }
    if (S_ISREG(st.st_mode)) {
        Lines lines(*this, pWnd, bAppend);
        ReadByChunks(fd, lines);
    } else {
        LoadBytes(pWnd, stream.View(), m_ParamFile, bAppend);
    }
    ::close(fd);
    if (!bAppend) {
        if (!name.IsEmpty()) m_FileName = name;
        m_FileState = S_ISREG(st.st_mode) ? CarnetStateOf(path.GetString()) : CarnetFileState();
    }
    return length() >= 1 ? 1 : 0;
}

int CCarnet::LoadBytes(CNorvexTxtWnd* pWnd, std::string_view bytes, const CString& paramFile, int bAppend,
                       const std::function<void(size_t)>& released) {
    m_ParamFile = paramFile;
    if (!bAppend) m_FileState = CarnetFileState();
    Lines lines(*this, pWnd, bAppend);
    // The caller may give back the bytes read every few megabytes, so that
    // the text and the book it becomes are not both held whole.
    constexpr size_t kReleaseStep = size_t{4} << 20;
    size_t nextRelease = kReleaseStep;
    carnet_file::ForEachLine(bytes, [&](std::string_view line, size_t end) {
        lines(line, end);
        if (released && end >= nextRelease) {
            released(end);
            nextRelease = end + kReleaseStep;
        }
        return true;
    });
    return length() >= 1 ? 1 : 0;
}
