#ifndef QV_TESTS_SUPPORT_NETWORKTESTGUARD_H
#define QV_TESTS_SUPPORT_NETWORKTESTGUARD_H

#include <gtest/gtest.h>

#include <initializer_list>
#include <string>

namespace qvtest {

// Why tests on the private test network cannot run here ("" when they can): they need
// root, working "ip netns", tools/testnet and the given programs (e.g. "ptp4l", "ptpd").
std::string testNetworkUnavailableReason(std::initializer_list<const char*> programs);

// Whether the environment variable CI is "true": a network test that cannot run is then a
// failure, not a skip.
bool runningUnderCi();

}  // namespace qvtest

// First statement of a network test: skips it with the reason when the test network cannot
// be made, or fails it under CI=true. Arguments: the programs the test needs, as strings.
#define QV_REQUIRE_TEST_NETWORK(...)                                                             \
    do {                                                                                         \
        const std::string qvNetworkReason = qvtest::testNetworkUnavailableReason({__VA_ARGS__}); \
        if (!qvNetworkReason.empty()) {                                                          \
            if (qvtest::runningUnderCi()) {                                                      \
                FAIL() << "network test cannot run under CI: " << qvNetworkReason;               \
            }                                                                                    \
            GTEST_SKIP() << "network test skipped: " << qvNetworkReason;                         \
        }                                                                                        \
    } while (false)

#endif
