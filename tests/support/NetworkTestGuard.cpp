#include "tests/support/NetworkTestGuard.h"

#include <unistd.h>

#include <cstdlib>

#include "tests/support/TestNetwork.h"

namespace qvtest {

std::string testNetworkUnavailableReason(std::initializer_list<const char*> programs) {
    if (geteuid() != 0) {
        return "needs root to create network namespaces (run as root, e.g. sudo ctest -L "
               "network)";
    }
    if (access(TestNetwork::toolPath().c_str(), X_OK) != 0) {
        return TestNetwork::toolPath() + " is missing or not executable";
    }
    if (runCommand("ip netns list").exitStatus != 0) {
        return "\"ip netns\" does not work here (iproute2 missing or no namespace support)";
    }
    for (const char* program : programs) {
        if (runCommand(std::string("command -v ") + program).exitStatus != 0) {
            return std::string(program) + " is not installed (tools/install-deps installs it)";
        }
    }
    return "";
}

bool runningUnderCi() {
    const char* ci = std::getenv("CI");
    return ci != nullptr && std::string(ci) == "true";
}

}  // namespace qvtest
