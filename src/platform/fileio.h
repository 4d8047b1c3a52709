// Reading a file once and writing one whole or not at all: the way the
// library loads and saves field books, backups and stores, offered to hosts
// and tools that write files of their own.
#pragma once

#include <sys/stat.h>
#include <sys/types.h>

#include <algorithm>
#include <cstddef>
#include <cstdio>
#include <functional>
#include <string_view>

// What a file was when it was read: a writer given it refuses to replace a
// file that someone else has written since.
struct CarnetFileState {
    dev_t device = 0;
    ino_t inode = 0;
    off_t size = -1;          // -1: no file known
    long long modified = 0;   // modification time, in nanoseconds
    // Whether a file is described.
    bool IsKnown() const { return size >= 0; }
    // Whether both describe the same file with the same size and time.
    bool operator==(const CarnetFileState& o) const {
        return device == o.device && inode == o.inode && size == o.size && modified == o.modified;
    }
    bool operator!=(const CarnetFileState& o) const { return !(*this == o); }
};

// The state of the file at path (links followed); unknown when there is none.
CarnetFileState CarnetStateOf(const char* path);

// The bytes of a file, read with one call into memory of their own: a
// regular file whole, anything else (a pipe, a terminal, a device) up to
// kStreamLimit bytes. Memory that Release gives up goes back to the system.
class CarnetFileBytes {
public:
    // The most bytes read from what is not a regular file (/dev/zero never ends).
    static constexpr size_t kStreamLimit = size_t{256} << 20;

    CarnetFileBytes() = default;
    ~CarnetFileBytes();
    CarnetFileBytes(const CarnetFileBytes&) = delete;
    CarnetFileBytes& operator=(const CarnetFileBytes&) = delete;

    // Reads the file, forgetting what was read before. 0, or the errno:
    // EISDIR for a folder, EFBIG for a stream longer than kStreamLimit,
    // ENOMEM when the bytes do not fit in memory.
    int Read(const char* path);
    // The bytes read; valid until the next Read or the destruction.
    std::string_view View() const { return std::string_view(m_data, m_size); }
    // The bytes, for a caller that rewrites them in place (a conversion that
    // never lengthens them) and then keeps only the first `size` (Shrink).
    char* Data() { return m_data; }
    void Shrink(size_t size) { m_size = std::min(m_size, size); }
    // The state of the file read (unknown for what is not a regular file).
    const CarnetFileState& State() const { return m_state; }
    // The bytes before `offset` are no longer needed: their memory is given
    // back, whole pages only. Reading them afterwards is an error.
    void Release(size_t offset);

private:
    void Free();

    char* m_data = nullptr;
    size_t m_size = 0;
    size_t m_mapped = 0;    // bytes of the mapping that holds them
    size_t m_released = 0;  // bytes given back from the start
    CarnetFileState m_state;
};

// Writes the new bytes of a file to a stream; returns 0, or an errno.
using CarnetFill = std::function<int(std::FILE*)>;

struct CarnetWriteOptions {
    // Permissions of a new file, less the umask.
    unsigned int newMode = 0666;
    // When given, the file takes this file's permissions and owner (as far
    // as the process may give them) instead of those of the file it replaces.
    const struct stat* like = nullptr;
    // Refuse (ELOOP) a link at the path, and (EINVAL, EISDIR) anything but a
    // regular file, instead of following the link and writing to a device
    // or a pipe in place.
    bool regularOnly = false;
    // The bytes go after those the file holds (read first; a device or a
    // pipe is opened for appending).
    bool append = false;
    // When known, the file at the path must still be this one (same device,
    // inode, size and time), else ESTALE: someone else wrote it meanwhile.
    // A file that is gone is no conflict.
    CarnetFileState expected;
    // When given, receives the state of the file written.
    CarnetFileState* written = nullptr;
};

// Puts the bytes that `fill` writes in the file at path; 0, or the errno (the
// file is then as it was). A new or regular file is replaced as a whole: the
// bytes go to a temporary file beside it (".carnet." with 8 hexadecimal
// digits of the name and a random part, so that the name always fits), are
// flushed to disk, and the temporary file is renamed over the file; it keeps
// the permissions and owner of the file it replaces. Temporary files of the
// same name that an ended process left (same owner, older than this
// process, not locked) are removed first. A link is followed, except one
// that another user owns in a folder with the sticky bit that is writable
// by all (EACCES). A device, pipe or terminal is written to in place.
int CarnetWriteFile(const char* path, const CarnetFill& fill, const CarnetWriteOptions& options = CarnetWriteOptions());

// Removes the temporary files of the writes under way, for a signal handler
// that then ends the process: async-signal-safe.
void CarnetRemovePendingFiles();
