#include <gtest/gtest.h>

#include "ptp/tMessageHeader.h"
#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::hex;
using tFlag = tMessageHeader::tFlag;

namespace {

TEST(tMessageHeaderTest, DefaultHeaderOctets) {
    const tMessageHeader header;
    EXPECT_EQ(header.getSize(), 34);
    EXPECT_EQ(
        encode(header),
        hex("0B | 02 | 00 00 | 00 | 00 | 00 00 |"  // Announce | v2 | length | domain | | flags
            "00 00 00 00 00 00 00 00 |"            // correctionField
            "00 00 00 00 |"                        // reserved
            "FF FF FF FF FF FF FF FF | FF FF |"    // sourcePortIdentity: all ports of all
            "00 00 | 00 | 7F"));                   // sequenceId | controlField | logInterval
}

TEST(tMessageHeaderTest, FlagsTakeTheirBitsInBothOctets) {
    tMessageHeader header;
    tStatus status;
    header.setFlag(tFlag::twoStep, true, status);
    header.setFlag(tFlag::leap61, true, status);
    const std::string octets = encode(header);
    EXPECT_EQ(octets.substr(6 * 3, 5), "02 01");

    // All sixteen bits set: the four reserved bits are ignored, every flag is read.
    Datagram datagram(
        "0B 02 00 22 00 00 | FF FF | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
        "00 1B 21 FF FE 01 02 03 00 01 | 00 00 | 05 | 00");
    tMessageHeader received(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded());
    for (unsigned i = 0; i < tMessageHeader::kFlagCount; ++i) {
        EXPECT_TRUE(received.getFlag(static_cast<tFlag>(i))) << i;
    }
    // SECURE, profileSpecific2, profileSpecific1, 0, 0, unicast, twoStep, alternateMaster;
    // 0, 0, frequencyTraceable, timeTraceable, ptpTimescale, UTC offset valid, leap59, leap61
    EXPECT_EQ(encode(received).substr(6 * 3, 5), "E7 3F");
}

TEST(tMessageHeaderTest, MessageTypeSetsControlField) {
    const std::pair<std::uint32_t, std::uint8_t> cases[] = {{0x0, 0}, {0x1, 1}, {0x8, 2}, {0x9, 3},
                                                            {0xD, 4}, {0xB, 5}, {0x2, 5}, {0xC, 5}};
    for (const auto& [type, control] : cases) {
        tMessageHeader header;
        tStatus status;
        header.setMessageType(type, status);
        EXPECT_EQ(header.getMessageType(), type);
        EXPECT_EQ(header.getControlField(), control) << type;
    }
}

TEST(tMessageHeaderTest, SettersChangeNothingAfterAnError) {
    tMessageHeader header;
    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    header.setMessageType(0xD, failed);
    header.setDomainNumber(3, failed);
    header.setSequenceId(9, failed);
    header.setMessageLength(54, failed);
    header.setFlag(tFlag::twoStep, true, failed);
    EXPECT_EQ(encode(header), encode(tMessageHeader()));
}

TEST(tMessageHeaderTest, CutHeaderFailsWithNoData) {
    Datagram datagram("0D 02 00 36 00 00 00 00 00 00");
    tStatus status;
    tMessageHeader header(datagram.unit(), status);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tMessageHeaderTest, TraceDump) {
    tMessageHeader header;
    tStatus status;
    header.setFlag(tFlag::leap59, true, status);
    EXPECT_EQ(qvtest::traceText(header),
              "--- Begin Message Header ---\n"
              "transportSpecific: 0\n"
              "messageType: 0xb\n"
              "versionPTP: 2\n"
              "messageLength: 0\n"
              "domainNumber: 0\n"
              "alternateMasterFlag: FALSE\n"
              "twoStepFlag: FALSE\n"
              "unicastFlag: FALSE\n"
              "profileSpecific1: FALSE\n"
              "profileSpecific2: FALSE\n"
              "SECURE: FALSE\n"
              "leap61: FALSE\n"
              "leap59: TRUE\n"
              "currentUTCOffsetValid: FALSE\n"
              "ptpTimescale: FALSE\n"
              "timeTraceable: FALSE\n"
              "frequencyTraceable: FALSE\n"
              "correctionField: 0\n"
              "sourcePortIdentity: clockIdentity: ffffffffffffffff portNumber: 65535\n"
              "sequenceId: 0\n"
              "controlField: 0\n"
              "logMessageInterval: 127\n"
              "--- End Message Header ---\n");
}

}  // namespace
