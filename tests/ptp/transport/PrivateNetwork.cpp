#include "tests/ptp/transport/PrivateNetwork.h"

#include <sched.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <cstring>

namespace qvtest {

namespace {

const char* const kSetup[] = {
    "ip link set lo up",
    "ip link add qvt0 address 02:00:00:00:00:01 type veth peer name qvt1 address "
    "02:00:00:00:00:02",
    "ip addr add 169.254.10.1/24 dev qvt0",
    "ip link set qvt0 up",
    "ip link set qvt1 up",
    "ip route add 224.0.0.0/4 dev qvt0",
};

bool setUp(std::string& reason) {
    if (geteuid() != 0) {
        reason = "not running as root";
        return false;
    }
    if (unshare(CLONE_NEWNET) != 0) {
        reason = std::string("unshare(CLONE_NEWNET): ") + std::strerror(errno);
        return false;
    }
    for (const char* command : kSetup) {
        if (std::system(command) != 0) {
            reason = std::string("failed: ") + command;
            return false;
        }
    }
    return true;
}

}  // namespace

bool PrivateNetwork::enter(std::string& reason) {
    static std::string failure;
    static const bool entered = setUp(failure);
    reason = failure;
    return entered;
}

}  // namespace qvtest
