#include "platform/storefile_internal.h"

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

std::string FolderOf(const std::string& path) {
    std::string::size_type slash = path.rfind('/');
    if (slash == std::string::npos) return ".";
    if (slash == 0) return "/";
    return path.substr(0, slash);
}

std::string NameOf(const std::string& path) {
    std::string::size_type slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

// The umask without changing it: reading it through umask() would briefly
// alter it for every thread of the host.
mode_t CurrentUmask() {
    mode_t mask = 022;
    if (std::FILE* f = std::fopen("/proc/self/status", "r")) {
        char tag[16];
        unsigned int value = 0;
        while (std::fscanf(f, "%15s", tag) == 1) {
            if (std::string(tag) == "Umask:" && std::fscanf(f, "%o", &value) == 1) {
                mask = static_cast<mode_t>(value & 0777);
                break;
            }
        }
        std::fclose(f);
    }
    return mask;
}

// The file a write must replace: the target of a symbolic link, so that the
// link itself survives.
int ResolveTarget(const std::string& path, std::string& target) {
    struct stat st;
    target = path;
    if (::lstat(path.c_str(), &st) == 0 && S_ISLNK(st.st_mode)) {
        char* real = ::realpath(path.c_str(), nullptr);
        if (!real) return Fail(errno);
        target = real;
        std::free(real);
    }
    return 0;
}

}  // namespace

int ReadAll(const std::string& path, std::string& out) {
    out.clear();
    int fd = ::open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (fd < 0) return Fail(errno);
    // Room for the whole file and one byte to see its end, so that a store
    // is read with one allocation; what has no size grows as it comes.
    size_t step = 1 << 16;
    struct stat st;
    if (::fstat(fd, &st) == 0 && S_ISREG(st.st_mode) && st.st_size > 0) step = static_cast<size_t>(st.st_size) + 1;
    size_t used = 0;
    for (;;) {
        if (out.size() == used) out.resize(used + step);
        ssize_t n = ::read(fd, &out[used], out.size() - used);
        if (n == 0) break;
        if (n < 0) {
            if (errno == EINTR) continue;
            int err = Fail(errno);
            ::close(fd);
            out.clear();
            return err;
        }
        used += static_cast<size_t>(n);
    }
    out.resize(used);
    ::close(fd);
    return 0;
}

int ReplaceAtomicallyWith(const std::string& path, unsigned int newMode, const Filler& fill) {
    if (path.empty()) return ENOENT;
    std::string target;
    if (int err = ResolveTarget(path, target)) return err;
    const std::string folder = FolderOf(target);
    std::string temp = folder + "/." + NameOf(target) + ".XXXXXX";
    int fd = ::mkstemp(&temp[0]);
    if (fd < 0) return Fail(errno);

    struct stat old;
    int err = 0;
    if (::stat(target.c_str(), &old) == 0) {
        if (::fchmod(fd, old.st_mode & 07777) != 0) err = Fail(errno);
        // Keeping the owner needs privileges; without them the file simply
        // becomes ours, as with any editor, so a refusal is not a failure.
        if (!err && ::fchown(fd, old.st_uid, old.st_gid) != 0) {
        }
    } else if (::fchmod(fd, static_cast<mode_t>(newMode) & ~CurrentUmask() & 07777) != 0) {
        err = Fail(errno);
    }
    std::FILE* f = err ? nullptr : ::fdopen(fd, "wb");
    if (f) {
        // Large writes: the stream goes to the disk in few calls.
        std::setvbuf(f, nullptr, _IOFBF, 1 << 16);
        err = fill(f);
        if (!err && std::fflush(f) != 0) err = Fail(errno);
        if (!err && std::ferror(f)) err = EIO;
        if (!err && ::fsync(fd) != 0) err = Fail(errno);
        if (std::fclose(f) != 0 && !err) err = Fail(errno);
    } else {
        if (!err) err = Fail(errno);
        ::close(fd);
    }
    if (!err && ::rename(temp.c_str(), target.c_str()) != 0) err = Fail(errno);
    if (err) {
        ::unlink(temp.c_str());
        return err;
    }
    // Makes the rename itself durable; a failure here no longer endangers the
    // data, so it is not reported.
    int dir = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (dir >= 0) {
        ::fsync(dir);
        ::close(dir);
    }
    return 0;
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
