#ifndef QV_TESTS_SUPPORT_TSHARKDECODE_H
#define QV_TESTS_SUPPORT_TSHARKDECODE_H

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "tests/support/NetworkTestGuard.h"

namespace qvtest {

// tshark's fields of one datagram in datagram order: name ("ptp.v2.mm.priority1") and the
// value it displays ("100", "0x0d", "IEEE 802.3"). "_ws.malformed" marks a datagram that
// tshark found malformed.
using TsharkFields = std::vector<std::pair<std::string, std::string>>;

// Whether tshark and text2pcap are installed.
bool tsharkAvailable();

// An independent decoding of PTP datagrams: all of them go into one capture file (UDP/IPv4
// from 169.254.0.1 to 224.0.1.129, port 320: PTP decodes alike on either port) that
// one tshark process dissects. Starting tshark takes about a second: decode in one batch.
std::vector<TsharkFields> tsharkDecode(const std::vector<std::vector<std::uint8_t>>& datagrams);

}  // namespace qvtest

// First statement of a test that decodes with tshark: skips it when tshark is missing, or
// fails it under CI=true, where it must run.
#define QV_REQUIRE_TSHARK()                                                     \
    do {                                                                        \
        if (!qvtest::tsharkAvailable()) {                                       \
            if (qvtest::runningUnderCi()) {                                     \
                FAIL() << "tshark is not installed, and CI must run this test"; \
            }                                                                   \
            GTEST_SKIP() << "tshark is not installed";                          \
        }                                                                       \
    } while (false)

#endif
