#include "platform/Mutex.h"

#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <map>

#include "platform/WinError.h"

namespace qv::dsc::osdep {

namespace {

constexpr const char* kSource = "Mutex";
constexpr mode_t kEveryone = 0666;
// Read-only: a file that another user created first with a narrower mode must still lock.
constexpr int kOpenFlags = O_RDONLY | O_NOFOLLOW | O_CLOEXEC | O_NONBLOCK;

std::string lockFolder() {
    const char* chosen = std::getenv(Mutex::kFolderVariable);
    if (chosen != nullptr && *chosen != '\0') {
        return chosen;
    }
    struct stat info {};
    return stat("/run/lock", &info) == 0 && S_ISDIR(info.st_mode) ? "/run/lock" : "/tmp";
}

// Opens the existing file first and creates it only when it is absent: a world-writable
// sticky folder (protected_regular) refuses O_CREAT on a file that another user owns.
// Only the creator sets the mode, on its own new file.
int openLockFile(const std::string& path) {
    for (;;) {
        const int fd = open(path.c_str(), kOpenFlags);
        if (fd >= 0 || errno != ENOENT) {
            return fd;
        }
        const int created = open(path.c_str(), kOpenFlags | O_CREAT | O_EXCL, kEveryone);
        if (created >= 0) {
            if (fchmod(created, kEveryone) != 0) {
                const int error = errno;
                close(created);
                errno = error;
                return -1;
            }
            return created;
        }
        if (errno != EEXIST) {
            return -1;
        }
        // Another process created it in between: open that one.
    }
}

}  // namespace

std::string Mutex::pathOf(std::string_view name) {
    return lockFolder() + "/qv-1588-" + std::string(name) + ".lock";
}

Mutex::Mutex(std::string_view name) {
    if (name.empty() || name.find_first_of(std::string_view("/\0", 2)) != name.npos) {
        throw WinError(EINVAL, kSource, __LINE__);
    }
    path_ = pathOf(name);
    threads_ = threadLockOf(path_);
    fd_ = openLockFile(path_);
    if (fd_ < 0) {
        throw WinError(kSource, __LINE__);
    }
    struct stat info {};
    if (fstat(fd_, &info) != 0 || !S_ISREG(info.st_mode)) {
        const int error = errno;
        close(fd_);
        throw WinError(S_ISREG(info.st_mode) ? error : EINVAL, kSource, __LINE__);
    }
}

Mutex::~Mutex() {
    close(fd_);
}

void Mutex::acquire() {
    std::unique_lock<std::mutex> thread(*threads_);
    while (flock(fd_, LOCK_EX) != 0) {
        if (errno != EINTR) {
            throw WinError(kSource, __LINE__);
        }
    }
    thread.release();  // held until release()
}

void Mutex::release() noexcept {
    // Unlocking an open file cannot fail in a way a caller could mend.
    flock(fd_, LOCK_UN);
    threads_->unlock();
}

}  // namespace qv::dsc::osdep
