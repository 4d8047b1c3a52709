#include "platform/storefile_internal.h"

#include <carnet/fileio.h>

#include <cerrno>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace carnet_storefile {
namespace {

// Keeps errno of the first failure across the clean-up calls that follow it.
int Fail(int err) { return err ? err : EIO; }

}  // namespace

int ReadAll(const std::string& path, std::string& out) {
    out.clear();
    // Not blocking at the open: a store that is a pipe without a writer is
    // refused below like any other that is not a regular file.
    const int fd = ::open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (fd < 0) return Fail(errno);
    struct stat st;
    const int err = ::fstat(fd, &st) != 0 ? Fail(errno) : S_ISDIR(st.st_mode) ? EISDIR
                                                                  : !S_ISREG(st.st_mode) ? EINVAL : 0;
    ::close(fd);
    if (err) return err;
    CarnetFileBytes bytes;
    if (int failed = bytes.Read(path.c_str())) return failed;
    out.assign(bytes.View());
    return 0;
}

int ReplaceAtomicallyWith(const std::string& path, unsigned int newMode, const Filler& fill) {
    CarnetWriteOptions options;
    options.newMode = newMode;
    return CarnetWriteFile(path.c_str(), fill, options);
}

int WriteAllTo(std::FILE* f, const std::string& data) {
    if (std::fwrite(data.data(), 1, data.size(), f) != data.size()) return Fail(errno);
    return 0;
}

int ReplaceAtomically(const std::string& path, const std::string& data, unsigned int newMode) {
    return ReplaceAtomicallyWith(path, newMode, [&data](std::FILE* f) { return WriteAllTo(f, data); });
}

int MakeFolders(const std::string& path, unsigned int mode) {
    if (path.empty()) return ENOENT;
    struct stat st;
    if (::stat(path.c_str(), &st) == 0) return S_ISDIR(st.st_mode) ? 0 : ENOTDIR;
    std::string::size_type slash = path.find_last_not_of('/');
    slash = slash == std::string::npos ? std::string::npos : path.rfind('/', slash);
    if (slash != std::string::npos && slash > 0) {
        if (int err = MakeFolders(path.substr(0, slash), mode)) return err;
    }
    if (::mkdir(path.c_str(), static_cast<mode_t>(mode)) != 0 && errno != EEXIST) return Fail(errno);
    return 0;
}

}  // namespace carnet_storefile
