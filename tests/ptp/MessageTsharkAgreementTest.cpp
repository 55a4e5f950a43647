#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tManagementMessage.h"
#include "tests/ptp/MessageTestSupport.h"
#include "tests/support/TsharkDecode.h"

// Messages written by the codec, decoded by tshark: every field must read back as written.

using namespace nQVPTP000;

namespace {

const std::uint8_t kSourceIdentity[] = {0x02, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, 0x55};
const std::uint8_t kTargetIdentity[] = {0x00, 0x1B, 0x21, 0xFF, 0xFE, 0x01, 0x02, 0x03};

std::vector<std::uint8_t> octetsOf(const tPTPMessage& message) {
    return qvtest::hexOctets(qvtest::encode(message));
}

class MessageTsharkAgreementTest : public ::testing::Test {
  protected:
    void SetUp() override { QV_REQUIRE_TSHARK(); }

    // A request as the management client builds it: action, target, payload, then domain
    // and source port identity on the header, and the sequence id.
    static tManagementMessage& request(tManagementMessage& message,
                                       std::unique_ptr<tManagementMessagePayload> payload) {
        tStatus status;
        message.setActionField(tManagementMessagePayload::kGet, status);
        message.setTargetPortIdentity(tPortIdentity(tClockIdentity(kTargetIdentity), 1), status);
        message.setPayload(std::move(payload), status);
        message.getHeader()->setDomainNumber(3, status);
        message.getHeader()->setSourcePortIdentity(
            tPortIdentity(tClockIdentity(kSourceIdentity), 0x1234), status);
        message.getHeader()->setSequenceId(0xBEEF, status);
        EXPECT_TRUE(status.succeeded());
        return message;
    }

    static void expectRequestHeader(const qvtest::TsharkDecode& decoded, const char* length) {
        EXPECT_EQ(decoded.show("ptp.v2.messagetype"), "0x0d");
        EXPECT_EQ(decoded.show("ptp.v2.versionptp"), "2");
        EXPECT_EQ(decoded.show("ptp.v2.messagelength"), length);
        EXPECT_EQ(decoded.show("ptp.v2.domainnumber"), "3");
        EXPECT_EQ(decoded.show("ptp.v2.flags"), "0x0000");
        EXPECT_EQ(decoded.show("ptp.v2.clockidentity"), "0x021122fffe334455");
        EXPECT_EQ(decoded.show("ptp.v2.sourceportid"), "4660");
        EXPECT_EQ(decoded.show("ptp.v2.sequenceid"), "48879");
        EXPECT_EQ(decoded.show("ptp.v2.controlfield"), "4");
        EXPECT_EQ(decoded.show("ptp.v2.logmessageperiod"), "127");
        EXPECT_EQ(decoded.show("ptp.v2.mm.targetportidentity"), "0x001b21fffe010203");
        EXPECT_EQ(decoded.show("ptp.v2.mm.targetportid"), "1");
        EXPECT_EQ(decoded.show("ptp.v2.mm.startingboundaryhops"), "0");
        EXPECT_EQ(decoded.show("ptp.v2.mm.boundaryhops"), "0");
        EXPECT_EQ(decoded.show("ptp.v2.mm.action"), "0");
    }
};

TEST_F(MessageTsharkAgreementTest, NullManagementRequest) {
    tStatus status;
    tManagementMessage message(status);
    request(message, std::make_unique<tNullManagementTLV>());
    const auto octets = octetsOf(message);
    ASSERT_EQ(octets.size(), 54U);
    const qvtest::TsharkDecode decoded(octets);
    expectRequestHeader(decoded, "54");
    EXPECT_EQ(decoded.show("ptp.v2.mm.tlvType"), "1");
    EXPECT_EQ(decoded.show("ptp.v2.mm.lengthField"), "2");
    EXPECT_EQ(decoded.show("ptp.v2.mm.managementId"), "0");
}

TEST_F(MessageTsharkAgreementTest, ErrorStatusPayloadWithDisplayText) {
    tStatus status;
    tManagementMessage message(status);
    request(message,
            std::make_unique<tManagementErrorStatusTLV>(
                0x2005, tManagementErrorStatusTLV::kNotSupported, "Unsupported actionField"));
    const qvtest::TsharkDecode decoded(octetsOf(message));
    expectRequestHeader(decoded, "84");
    EXPECT_EQ(decoded.show("ptp.v2.mm.tlvType"), "2");
    EXPECT_EQ(decoded.show("ptp.v2.mm.lengthField"), "32");
    EXPECT_EQ(decoded.show("ptp.v2.mm.managementErrorId"), "6");
    EXPECT_EQ(decoded.show("ptp.v2.mm.managementId"), "8197");
    EXPECT_EQ(decoded.show("ptp.v2.mm.displayData"), "Unsupported actionField");
}

// Sync and Announce are only ever received; written back they must still read as received.
TEST_F(MessageTsharkAgreementTest, SyncWrittenBack) {
    tStatus status;
    std::string text = qvtest::headerHex("00", "00 2C", "00") + "00 01 02 03 04 05 | 3B 9A C9 FF";
    text.replace(text.find("00 00 |"), 5, "02 08");  // flags: twoStepFlag, ptpTimescale
    const auto message = qvtest::decodeMessage(text, status);
    ASSERT_NE(message, nullptr);
    const qvtest::TsharkDecode decoded(octetsOf(*message), 319);
    EXPECT_EQ(decoded.show("ptp.v2.messagetype"), "0x00");
    EXPECT_EQ(decoded.show("ptp.v2.messagelength"), "44");
    EXPECT_EQ(decoded.show("ptp.v2.flags.twostep"), "1");
    EXPECT_EQ(decoded.show("ptp.v2.flags.timescale"), "1");
    EXPECT_EQ(decoded.show("ptp.v2.clockidentity"), "0x001b21fffe010203");
    EXPECT_EQ(decoded.show("ptp.v2.sequenceid"), "258");
    EXPECT_EQ(decoded.show("ptp.v2.sdr.origintimestamp.seconds"), "4328719365");
    EXPECT_EQ(decoded.show("ptp.v2.sdr.origintimestamp.nanoseconds"), "999999999");
}

TEST_F(MessageTsharkAgreementTest, AnnounceWrittenBack) {
    tStatus status;
    const auto message = qvtest::decodeMessage(
        qvtest::headerHex("0B", "00 40", "05") +
            "00 00 00 00 00 00 | 00 00 00 00 |"      // originTimestamp
            "00 25 | 00 | 80 |"                      // currentUtcOffset 37 | reserved | priority1
            "06 21 4E 5D | 7F |"                     // grandmasterClockQuality | priority2 127
            "00 1B 21 FF FE 0A 0B 0C | 00 03 | 20",  // identity | stepsRemoved 3 | GPS
        status);
    ASSERT_NE(message, nullptr);
    const qvtest::TsharkDecode decoded(octetsOf(*message));
    EXPECT_EQ(decoded.show("ptp.v2.messagetype"), "0x0b");
    EXPECT_EQ(decoded.show("ptp.v2.an.origincurrentutcoffset"), "37");
    EXPECT_EQ(decoded.show("ptp.v2.an.priority1"), "128");
    EXPECT_EQ(decoded.show("ptp.v2.an.grandmasterclockclass"), "6");
    EXPECT_EQ(decoded.show("ptp.v2.an.grandmasterclockaccuracy"), "0x21");
    EXPECT_EQ(decoded.show("ptp.v2.an.grandmasterclockvariance"), "20061");
    EXPECT_EQ(decoded.show("ptp.v2.an.priority2"), "127");
    EXPECT_EQ(decoded.show("ptp.v2.an.grandmasterclockidentity"), "0x001b21fffe0a0b0c");
    EXPECT_EQ(decoded.show("ptp.v2.an.localstepsremoved"), "3");
    EXPECT_EQ(decoded.show("ptp.v2.timesource"), "0x20");
}

}  // namespace
