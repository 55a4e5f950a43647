#include "tests/support/NetworkNamespaceEntry.h"

#include <fcntl.h>
#include <sched.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

namespace qvtest {

NetworkNamespaceEntry::NetworkNamespaceEntry(const std::string& nameSpace) {
    // The calling thread's own namespace link: /proc/self would name the main thread's.
    previous_ = open("/proc/thread-self/ns/net", O_RDONLY | O_CLOEXEC);
    const std::string path = "/run/netns/" + nameSpace;
    const int target = previous_ < 0 ? -1 : open(path.c_str(), O_RDONLY | O_CLOEXEC);
    entered_ = target >= 0 && setns(target, CLONE_NEWNET) == 0;
    if (!entered_) {
        failure_ = "cannot enter " + path + ": " + std::strerror(errno);
    }
    if (target >= 0) {
        close(target);
    }
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
