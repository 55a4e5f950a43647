#ifndef QV_PLATFORM_MUTEX_H
#define QV_PLATFORM_MUTEX_H

#include <memory>
#include <mutex>
#include <string>
#include <string_view>

namespace qv::dsc::osdep {

// On Windows (MutexWin32.cpp) it is the named kernel mutex "Global\<name>" with a security
// descriptor that lets every process open it; path() answers that name.
//
// A lock shared by every process of every user on the computer, known by name: an advisory
// lock (flock) on the file "<folder>/qv-1588-<name>.lock". The folder is $QV_LOCK_DIR when
// set (tests), otherwise /run/lock, or /tmp on a system without it.
//
// The file is created readable and writable by every user whatever the umask and opened
// read-only (all flock needs), and never
// opened through a symbolic link, so another user can neither lock others out by owning
// it nor redirect it elsewhere. The kernel drops the lock of a process that ends, so a
// holder that dies releases it. Failures throw qv::dsc::osdep::WinError (source "Mutex").
//
// The lock is owned by a thread: every Mutex of one name in a process shares one in-process
// lock, taken before the flock (which belongs to the open file and so cannot tell the
// threads of one process apart). Threads sharing one Mutex, and Mutex objects of the same
// name, exclude each other; the thread that acquired releases. The lock is not recursive.
class Mutex {
  public:
    static constexpr const char* kFolderVariable = "QV_LOCK_DIR";

    // Creates or opens the lock file; a name that is empty or holds '/' is refused.
    explicit Mutex(std::string_view name);
    ~Mutex();
    Mutex(const Mutex&) = delete;
    Mutex& operator=(const Mutex&) = delete;

    // Waits without limit.
    void acquire();
    void release() noexcept;

    const std::string& path() const { return path_; }
    static std::string pathOf(std::string_view name);

    // Holds the lock for the life of a scope.
    class Holder {
      public:
        explicit Holder(Mutex& mutex) : mutex_(mutex) { mutex_.acquire(); }
        ~Holder() { mutex_.release(); }
        Holder(const Holder&) = delete;
        Holder& operator=(const Holder&) = delete;

      private:
        Mutex& mutex_;
    };

  private:
    // The in-process lock of a path, shared by every Mutex of it that is alive: the
    // system-wide lock excludes processes, this one the threads of this process.
    static std::shared_ptr<std::mutex> threadLockOf(const std::string& path);

    std::string path_;
    std::shared_ptr<std::mutex> threads_;  // shared by every Mutex of this path
    int fd_ = -1;
};

}  // namespace qv::dsc::osdep

#endif
