// Faults of the file system made on purpose: refusals that root does not
// meet (the tests run as root, where a permission refuses nothing) and
// device nodes that stand for /dev/null, /dev/zero and /dev/full inside the
// test's own folder, so that a wrong write can never reach the machine's.
#pragma once

#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/wait.h>
#include <unistd.h>

#include <functional>
#include <string>

namespace fault_test {

// Runs fn in a child process for which permissions count: as root, the child
// first becomes the unprivileged user "nobody". Returns what fn returned
// (under 256), or -1 when the child could not run it.
inline int WithoutPrivileges(const std::function<int()>& fn) {
    const pid_t pid = ::fork();
    if (pid == 0) {
        if (::geteuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0)) ::_exit(255);
        ::_exit(fn() & 0xFF);
    }
    int status = 0;
    if (pid < 0 || ::waitpid(pid, &status, 0) != pid || !WIFEXITED(status)) return -1;
    return WEXITSTATUS(status) == 255 ? -1 : WEXITSTATUS(status);
}

// The character devices the tests copy, by their numbers on Linux.
enum class Device { Null = 3, Zero = 5, Full = 7 };

// Makes a device node at path; false when the system does not allow it.
inline bool MakeDevice(const std::string& path, Device device) {
    return ::mknod(path.c_str(), S_IFCHR | 0666, makedev(1, static_cast<unsigned int>(device))) == 0;
}

// Still the device node it was made as (not replaced by a file).
inline bool IsDevice(const std::string& path) {
    struct stat st;
    return ::lstat(path.c_str(), &st) == 0 && S_ISCHR(st.st_mode);
}

}  // namespace fault_test
