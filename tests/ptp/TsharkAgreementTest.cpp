#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "tests/ptp/PduTestSupport.h"
#include "tests/support/TsharkDecode.h"

using namespace nQVPTP000;

namespace {

// A management message header and body written out by hand around the TLV under test, so
// that tshark sees a complete datagram: GET to all ports of all clocks.
std::vector<std::uint8_t> managementAround(const tTLV& tlv) {
    const std::string body = qvtest::encode(tlv);
    const auto payload = qvtest::hexOctets(body);
    auto datagram = qvtest::hexOctets(
        "0D 02 00 00 00 00 00 00 | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
        "FF FF FF FF FF FF FF FF FF FF | 00 00 | 04 | 7F |"
        "FF FF FF FF FF FF FF FF FF FF | 00 | 00 | 00 | 00");
    datagram.insert(datagram.end(), payload.begin(), payload.end());
    datagram[3] = static_cast<std::uint8_t>(datagram.size());
    return datagram;
}

class TsharkAgreementTest : public ::testing::Test {
  protected:
    void SetUp() override { QV_REQUIRE_TSHARK(); }
};

TEST_F(TsharkAgreementTest, ErrorStatusTlvWithDisplayText) {
    const tManagementErrorStatusTLV tlv(0x2005, tManagementErrorStatusTLV::kWrongValue,
                                        "Unsupported clockAccuracy value");
    const qvtest::TsharkDecode decoded(managementAround(tlv));
    EXPECT_EQ(decoded.show("ptp.v2.mm.tlvType"), "2");
    EXPECT_EQ(decoded.show("ptp.v2.mm.managementErrorId"), "4");
    EXPECT_EQ(decoded.show("ptp.v2.mm.managementId"), "8197");
    EXPECT_EQ(decoded.show("ptp.v2.mm.displayData"), "Unsupported clockAccuracy value");
}

}  // namespace
