#include "tests/support/NetworkNamespaceEntry.h"

#include <fcntl.h>
#include <sched.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace qvtest {

namespace {

// The calling thread's own namespace link: /proc/self would name the main thread's.
constexpr const char* kThreadNamespace = "/proc/thread-self/ns/net";

}  // namespace

NetworkNamespaceEntry::NetworkNamespaceEntry(const std::string& nameSpace) {
    previous_ = open(kThreadNamespace, O_RDONLY | O_CLOEXEC);
    if (previous_ < 0) {
        failure_ = std::string("cannot open ") + kThreadNamespace + ": " + std::strerror(errno);
        return;
    }
    const std::string path = "/run/netns/" + nameSpace;
    const int target = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    if (target < 0) {
        failure_ = "cannot open " + path + ": " + std::strerror(errno);
        return;
    }
    if (setns(target, CLONE_NEWNET) == 0) {
        entered_ = true;
    } else {
        failure_ = "setns " + path + ": " + std::strerror(errno);
    }
    close(target);
}

NetworkNamespaceEntry::~NetworkNamespaceEntry() {
    if (entered_) {
        setns(previous_, CLONE_NEWNET);
    }
    if (previous_ >= 0) {
        close(previous_);
    }
}

}  // namespace qvtest
