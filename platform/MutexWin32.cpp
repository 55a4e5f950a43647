#include <windows.h>
// After windows.h, which it needs.
#include <sddl.h>

#include <cstdint>
#include <map>

#include "platform/Mutex.h"
#include "platform/WinError.h"

namespace qv::dsc::osdep {

// Windows backend: a named kernel mutex. The handle is kept in the integer member that the
// POSIX backend uses for its descriptor; kernel handles are 32-bit significant, so the
// round trip through HandleToLong/LongToHandle is exact.
//
// A kernel mutex belongs to the thread that acquired it and would let that thread acquire
// it again; the in-process lock taken before it keeps the lock non-recursive, as on POSIX.

namespace {

constexpr const char* kSource = "Mutex";
constexpr std::size_t kDescriptorOctets = 4096;
// Every x86-64 Windows belongs to the NT family at version 5.2 or later, where terminal
// services are present: the name lives in the namespace shared by all sessions.
constexpr const char* kSessionPrefix = "Global\\";
// A mandatory label of low integrity with the no-write-up policy.
constexpr const char* kLowIntegrityLabel = "S:(ML;;NW;;;LW)";

// A descriptor that lets every process, one of low integrity too, open the mutex: a present
// but null access list, and the low label when the system knows integrity levels.
class tOpenDescriptor {
  public:
    tOpenDescriptor() {
        SECURITY_DESCRIPTOR absolute{};
        if (InitializeSecurityDescriptor(&absolute, SECURITY_DESCRIPTOR_REVISION) == 0 ||
            SetSecurityDescriptorDacl(&absolute, TRUE, nullptr, FALSE) == 0) {
            throw WinError(kSource, __LINE__);
        }
        PSECURITY_DESCRIPTOR labelled = nullptr;
        if (ConvertStringSecurityDescriptorToSecurityDescriptorA(
                kLowIntegrityLabel, SDDL_REVISION_1, &labelled, nullptr) != 0) {
            BOOL present = FALSE;
            BOOL defaulted = FALSE;
            PACL label = nullptr;
            if (GetSecurityDescriptorSacl(labelled, &present, &label, &defaulted) != 0 &&
                present != FALSE) {
                SetSecurityDescriptorSacl(&absolute, TRUE, label, FALSE);
            }
        }
        DWORD size = sizeof(buffer_);
        const BOOL made = MakeSelfRelativeSD(&absolute, buffer_, &size);
        const DWORD error = GetLastError();
        LocalFree(labelled);
        if (made == 0) {
            throw WinError(static_cast<int>(error), kSource, __LINE__);
        }
        attributes_.nLength = sizeof(attributes_);
        attributes_.lpSecurityDescriptor = buffer_;
        attributes_.bInheritHandle = FALSE;
    }

    SECURITY_ATTRIBUTES* attributes() { return &attributes_; }

  private:
    alignas(void*) std::uint8_t buffer_[kDescriptorOctets] = {};
    SECURITY_ATTRIBUTES attributes_{};
};

HANDLE handleOf(int stored) {
    return LongToHandle(stored);
}

}  // namespace

std::string Mutex::pathOf(std::string_view name) {
    return kSessionPrefix + std::string(name);
}

Mutex::Mutex(std::string_view name) {
    if (name.empty() || name.find_first_of(std::string_view("\\\0", 2)) != name.npos) {
        throw WinError(ERROR_INVALID_PARAMETER, kSource, __LINE__);
    }
    path_ = pathOf(name);
    threads_ = threadLockOf(path_);
    tOpenDescriptor descriptor;
    const HANDLE handle = CreateMutexA(descriptor.attributes(), FALSE, path_.c_str());
    if (handle == nullptr) {
        throw WinError(kSource, __LINE__);
    }
    fd_ = HandleToLong(handle);
}

Mutex::~Mutex() {
    CloseHandle(handleOf(fd_));
}

void Mutex::acquire() {
    std::unique_lock<std::mutex> thread(*threads_);
    // A holder that ended without releasing leaves the mutex abandoned: it is ours now.
    const DWORD result = WaitForSingleObject(handleOf(fd_), INFINITE);
    if (result != WAIT_OBJECT_0 && result != WAIT_ABANDONED) {
        throw WinError(kSource, __LINE__);
    }
    thread.release();  // held until release()
}

void Mutex::release() noexcept {
    ReleaseMutex(handleOf(fd_));
    threads_->unlock();
}

}  // namespace qv::dsc::osdep
