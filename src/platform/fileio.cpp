#include <carnet/fileio.h>

#include <dirent.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <string>

namespace {

int Fail(int err) { return err ? err : EIO; }

long long Nanoseconds(const struct timespec& t) { return static_cast<long long>(t.tv_sec) * 1000000000LL + t.tv_nsec; }

CarnetFileState StateOf(const struct stat& st) {
    CarnetFileState state;
    state.device = st.st_dev;
    state.inode = st.st_ino;
    state.size = st.st_size;
    state.modified = Nanoseconds(st.st_mtim);
    return state;
}

std::string FolderOf(const std::string& path) {
    const std::string::size_type slash = path.rfind('/');
    if (slash == std::string::npos) return ".";
    if (slash == 0) return "/";
    return path.substr(0, slash);
}

std::string NameOf(const std::string& path) {
    const std::string::size_type slash = path.rfind('/');
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

// When this process started, in nanoseconds since the epoch, to the clock
// tick; 0 when unknown (no temporary file then counts as left by an ended
// process).
long long ProcessStart() {
    static const long long start = [] {
        long long ticks = -1;
        if (std::FILE* f = std::fopen("/proc/self/stat", "r")) {
            std::string text;
            char chunk[512];
            for (size_t n; (n = std::fread(chunk, 1, sizeof chunk, f)) > 0;) text.append(chunk, n);
            std::fclose(f);
            // The command name may hold anything up to its last ')'; the
            // start time, in ticks since the boot, is the 20th field after it.
            const std::string::size_type close = text.rfind(')');
            const char* p = close == std::string::npos ? nullptr : text.c_str() + close + 1;
            for (int field = 0; p && field < 20; ++field) {
                while (*p == ' ') ++p;
                if (field == 19) ticks = std::atoll(p);
                while (*p && *p != ' ') ++p;
            }
        }
        const long hz = ::sysconf(_SC_CLK_TCK);
        struct timespec now, sinceBoot;
        if (ticks < 0 || hz <= 0 || ::clock_gettime(CLOCK_REALTIME, &now) != 0 ||
            ::clock_gettime(CLOCK_BOOTTIME, &sinceBoot) != 0)
            return 0LL;
        return Nanoseconds(now) - Nanoseconds(sinceBoot) + ticks * (1000000000LL / hz);
    }();
    return start;
}

// The names of the temporary files under way, for CarnetRemovePendingFiles.
// A write registers its name while the file exists; writes do not nest
// deeper than a few (a save reads the stores, it does not write them).
constexpr int kPendingSlots = 8;
std::atomic<const char*> g_pending[kPendingSlots];

class Pending {
public:
    explicit Pending(const char* path) {
        for (int i = 0; i < kPendingSlots && m_slot < 0; ++i) {
            const char* none = nullptr;
            if (g_pending[i].compare_exchange_strong(none, path)) m_slot = i;
        }
    }
    ~Pending() {
        if (m_slot >= 0) g_pending[m_slot].store(nullptr);
    }
    Pending(const Pending&) = delete;
    Pending& operator=(const Pending&) = delete;

private:
    int m_slot = -1;
};

// The beginning of the temporary names for a file: 8 hexadecimal digits of
// its name (FNV-1a), so that a save finds its own leftovers, and the name
// always fits whatever the length of the file's.
std::string TemporaryPrefix(const std::string& name) {
    std::uint32_t hash = 2166136261u;
    for (unsigned char c : name) hash = (hash ^ c) * 16777619u;
    static const char digits[] = "0123456789abcdef";
    std::string prefix = ".carnet.";
    for (int shift = 28; shift >= 0; shift -= 4) prefix += digits[(hash >> shift) & 15];
    return prefix + ".";
}

// Removes the temporary files of the same name that an ended process left:
// ours, older than this process, and not locked by a write under way.
void RemoveLeftovers(const std::string& folder, const std::string& prefix) {
    const long long start = ProcessStart();
    DIR* dir = start > 0 ? ::opendir(folder.c_str()) : nullptr;
    if (!dir) return;
    const int dfd = ::dirfd(dir);
    while (const struct dirent* entry = ::readdir(dir)) {
        const std::string name = entry->d_name;
        if (name.size() != prefix.size() + 6 || name.compare(0, prefix.size(), prefix) != 0) continue;
        struct stat st;
        if (::fstatat(dfd, name.c_str(), &st, AT_SYMLINK_NOFOLLOW) != 0 || !S_ISREG(st.st_mode) ||
            st.st_uid != ::geteuid() || Nanoseconds(st.st_mtim) >= start)
            continue;
        const int fd = ::openat(dfd, name.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC);
        if (fd < 0) continue;
        if (::flock(fd, LOCK_EX | LOCK_NB) == 0) ::unlinkat(dfd, name.c_str(), 0);
        ::close(fd);
    }
    ::closedir(dir);
}

// The file that a write to path replaces: the end of its chain of links.
// A link that another user owns in a sticky folder writable by all is not
// followed (EACCES), as the system itself refuses to follow it there; a
// chain that ends nowhere is ENOENT.
int ResolveTarget(const std::string& path, bool refuseLinks, std::string& target) {
    target = path;
    for (int hops = 0;; ++hops) {
        struct stat st;
        if (::lstat(target.c_str(), &st) != 0) return hops > 0 ? ENOENT : 0;
        if (!S_ISLNK(st.st_mode)) return 0;
        if (refuseLinks || hops >= 40) return ELOOP;
        const std::string folder = FolderOf(target);
        struct stat dir;
        if (::stat(folder.c_str(), &dir) != 0) return Fail(errno);
        if ((dir.st_mode & S_ISVTX) && (dir.st_mode & S_IWOTH) && st.st_uid != ::geteuid() &&
            st.st_uid != dir.st_uid)
            return EACCES;
        std::string link(static_cast<size_t>(st.st_size > 0 ? st.st_size : 255) + 1, '\0');
        const ssize_t n = ::readlink(target.c_str(), &link[0], link.size());
        if (n < 0) return Fail(errno);
        if (static_cast<size_t>(n) >= link.size()) return ENAMETOOLONG;  // changed while read
        link.resize(static_cast<size_t>(n));
        if (link[0] == '/') {
            target = link;
        } else {
            target = folder;
            target += '/';
            target += link;
        }
    }
}

// Writes to something that is not a regular file (a terminal, a pipe,
// /dev/null): it cannot be replaced, only written to.
int WriteInPlace(const std::string& path, bool append, const CarnetFill& fill) {
    std::FILE* f = std::fopen(path.c_str(), append ? "ab" : "wb");
    if (!f) return Fail(errno);
    int err = fill(f);
    if (std::fflush(f) != 0 && !err) err = Fail(errno);
    if (std::ferror(f) && !err) err = EIO;
    if (std::fclose(f) != 0 && !err) err = Fail(errno);
    return err;
}

}  // namespace

CarnetFileState CarnetStateOf(const char* path) {
    struct stat st;
    if (!path || ::stat(path, &st) != 0) return CarnetFileState();
    return StateOf(st);
}

CarnetFileBytes::~CarnetFileBytes() { Free(); }

void CarnetFileBytes::Free() {
    if (m_data) ::munmap(m_data, m_mapped);
    m_data = nullptr;
    m_size = m_mapped = m_released = 0;
    m_state = CarnetFileState();
}

int CarnetFileBytes::Read(const char* path) {
    Free();
    const int fd = path ? ::open(path, O_RDONLY | O_CLOEXEC) : -1;
    if (fd < 0) return path ? Fail(errno) : ENOENT;
    struct stat st;
    if (::fstat(fd, &st) != 0 || S_ISDIR(st.st_mode)) {
        const int err = S_ISDIR(st.st_mode) ? EISDIR : Fail(errno);
        ::close(fd);
        return err;
    }
    const bool regular = S_ISREG(st.st_mode);
    // A regular file is read as it is now: bytes appended meanwhile belong
    // to a later version, which the state below does not describe.
    const size_t page = static_cast<size_t>(::sysconf(_SC_PAGESIZE));
    const size_t wanted = regular ? static_cast<size_t>(st.st_size) : kStreamLimit + 1;
    size_t room = regular ? wanted : page * 16;
    int err = 0;
    while (err == 0 && m_size < wanted) {
        if (m_size == m_mapped) {
            // Memory of its own, so that Release can give it back; a stream's
            // grows as it comes.
            const size_t bigger = m_mapped == 0 ? (room + page - 1) / page * page : m_mapped * 2;
            void* p = m_mapped == 0 ? ::mmap(nullptr, bigger, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0)
                                    : ::mremap(m_data, m_mapped, bigger, MREMAP_MAYMOVE);
            if (p == MAP_FAILED) {
                err = ENOMEM;
                break;
            }
            m_data = static_cast<char*>(p);
            m_mapped = bigger;
        }
        const ssize_t n = ::read(fd, m_data + m_size, std::min(m_mapped, wanted) - m_size);
        if (n == 0) break;
        if (n < 0) {
            if (errno != EINTR) err = Fail(errno);
            continue;
        }
        m_size += static_cast<size_t>(n);
    }
    ::close(fd);
    if (err == 0 && !regular && m_size > kStreamLimit) err = EFBIG;
    if (err != 0) {
        Free();
        return err;
    }
    if (regular) {
        m_state = StateOf(st);
        m_state.size = static_cast<off_t>(m_size);
    }
    return 0;
}

void CarnetFileBytes::Release(size_t offset) {
    const size_t page = static_cast<size_t>(::sysconf(_SC_PAGESIZE));
    const size_t end = std::min(offset, m_size) / page * page;
    if (!m_data || end <= m_released) return;
    ::madvise(m_data + m_released, end - m_released, MADV_DONTNEED);
    m_released = end;
}

int CarnetWriteFile(const char* path, const CarnetFill& fill, const CarnetWriteOptions& options) {
    if (!path || !*path) return ENOENT;
    std::string target;
    if (int err = ResolveTarget(path, options.regularOnly, target)) return err;
    struct stat st;
    const bool exists = ::stat(target.c_str(), &st) == 0;
    if (exists && S_ISDIR(st.st_mode)) return EISDIR;
    if (exists && !S_ISREG(st.st_mode)) return options.regularOnly ? EINVAL : WriteInPlace(target, options.append, fill);

    // What an appended file already holds, read once; the file must still
    // be that one when it is replaced.
    CarnetFileBytes previous;
    CarnetFileState expected = options.expected;
    if (exists && options.append) {
        if (int err = previous.Read(target.c_str())) return err;
        if (!expected.IsKnown()) expected = previous.State();
    }

    const std::string folder = FolderOf(target);
    const std::string prefix = TemporaryPrefix(NameOf(target));
    RemoveLeftovers(folder, prefix);
    std::string temp = folder + "/" + prefix + "XXXXXX";
    // Named as pending before it exists: mkostemp writes the name in place,
    // so a signal that comes just after the file is made finds it.
    const Pending pending(temp.c_str());
    const int fd = ::mkostemp(&temp[0], O_CLOEXEC);
    if (fd < 0) return Fail(errno);
    // Held until the file is closed: a later save sees that it is alive.
    ::flock(fd, LOCK_EX | LOCK_NB);

    int err = 0;
    const struct stat* from = options.like ? options.like : (exists ? &st : nullptr);
    if (from) {
        // Keeping the owner needs privileges; without them the file simply
        // becomes ours, as with any editor, so a refusal is not a failure.
        if (::fchown(fd, from->st_uid, from->st_gid) != 0) {
        }
        if (::fchmod(fd, from->st_mode & 07777) != 0) err = Fail(errno);
    } else if (::fchmod(fd, static_cast<mode_t>(options.newMode) & ~CurrentUmask() & 07777) != 0) {
        err = Fail(errno);
    }
    std::FILE* f = err ? nullptr : ::fdopen(fd, "wb");
    if (f) {
        // Large writes: the stream goes to the disk in few calls.
        std::setvbuf(f, nullptr, _IOFBF, 1 << 16);
        const std::string_view before = previous.View();
        if (!before.empty() && std::fwrite(before.data(), 1, before.size(), f) != before.size()) err = Fail(errno);
        if (!err) err = fill(f);
        if (!err && std::fflush(f) != 0) err = Fail(errno);
        if (!err && std::ferror(f)) err = EIO;
        if (!err && ::fsync(fd) != 0) err = Fail(errno);
        if (!err && expected.IsKnown()) {
            const CarnetFileState now = CarnetStateOf(target.c_str());
            if (now.IsKnown() && now != expected) err = ESTALE;
        }
        struct stat mine;
        if (!err && options.written && ::fstat(fd, &mine) == 0) *options.written = StateOf(mine);
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
    const int dir = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (dir >= 0) {
        ::fsync(dir);
        ::close(dir);
    }
    return 0;
}

void CarnetRemovePendingFiles() {
    for (std::atomic<const char*>& slot : g_pending)
        if (const char* path = slot.exchange(nullptr)) ::unlink(path);
}
