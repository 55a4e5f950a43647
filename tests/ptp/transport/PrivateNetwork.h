#ifndef QV_TESTS_PTP_TRANSPORT_PRIVATENETWORK_H
#define QV_TESTS_PTP_TRANSPORT_PRIVATENETWORK_H

#include <string>

#include "tests/support/NetworkTestGuard.h"

namespace qvtest {

// Moves the calling thread, and every thread and process that it starts afterwards, into a
// network namespace of its own: loopback, and a veth pair qvt0/qvt1 (MACs
// 02:00:00:00:00:01 and :02, 169.254.10.1/24 on qvt0) with the multicast route on qvt0.
// The namespace has no name and vanishes with the process, so nothing is left behind,
// whatever way the test ends. Call on the main thread before any socket is made.
class PrivateNetwork {
  public:
    // Enters it once per process; false with `reason` when it cannot (no root).
    static bool enter(std::string& reason);
};

}  // namespace qvtest

// Skips the test without the private network, or fails it under CI=true.
#define QV_REQUIRE_PRIVATE_NETWORK()                                                  \
    do {                                                                              \
        std::string qvReason;                                                         \
        if (!qvtest::PrivateNetwork::enter(qvReason)) {                               \
            if (qvtest::runningUnderCi()) {                                           \
                FAIL() << "private test network needed under CI: " << qvReason;       \
            }                                                                         \
            GTEST_SKIP() << "needs a private network namespace (root): " << qvReason; \
        }                                                                             \
    } while (false)

#endif
