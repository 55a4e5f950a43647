#ifndef QV_TESTS_SUPPORT_TSHARKDECODE_H
#define QV_TESTS_SUPPORT_TSHARKDECODE_H

#include <cstdint>
#include <string>
#include <vector>

#include "tests/support/NetworkTestGuard.h"

namespace qvtest {

// An independent decoding of one PTP datagram: the octets are wrapped in UDP/IPv4 with
// text2pcap and dissected by tshark; every ptp.* field that tshark shows is kept with its
// displayed value ("show") and its raw hex ("value").
class TsharkDecode {
  public:
    struct Field {
        std::string name;
        std::string show;
        std::string value;
    };

    // Whether tshark and text2pcap are installed.
    static bool available();

    explicit TsharkDecode(const std::vector<std::uint8_t>& datagram, std::uint16_t port = 320);

    const std::vector<Field>& fields() const { return fields_; }
    // The displayed values of every field of that name, in datagram order.
    std::vector<std::string> shows(const std::string& name) const;
    // The displayed value of the first field of that name, or "<absent>".
    std::string show(const std::string& name) const;
    // The raw hex of the first field of that name, or "<absent>".
    std::string value(const std::string& name) const;

  private:
    std::vector<Field> fields_;
};

}  // namespace qvtest

// First statement of a test that decodes with tshark: skips it when tshark is missing, or
// fails it under CI=true, where it must run.
#define QV_REQUIRE_TSHARK()                                                     \
    do {                                                                        \
        if (!qvtest::TsharkDecode::available()) {                               \
            if (qvtest::runningUnderCi()) {                                     \
                FAIL() << "tshark is not installed, and CI must run this test"; \
            }                                                                   \
            GTEST_SKIP() << "tshark is not installed";                          \
        }                                                                       \
    } while (false)

#endif
