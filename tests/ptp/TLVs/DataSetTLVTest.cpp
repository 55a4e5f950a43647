#include <gtest/gtest.h>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::hex;
using qvtest::traceText;

namespace {

// Decodes a whole TLV (tlvType onward) into `tlv`; the status afterwards.
tStatus decode(tTLV& tlv, std::string_view octets) {
    Datagram datagram(octets);
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    return status;
}

TEST(DataSetTLVTest, DefaultDataSetDefaults) {
    const tDefaultDataSetTLV tlv;
    EXPECT_EQ(tlv.getLengthField(), 22);
    EXPECT_EQ(encode(tlv),
              hex("00 01 | 00 16 | 20 00 |"    // MANAGEMENT, lengthField 22, DEFAULT_DATA_SET
                  "00 |"                       // flags: SO 0, TSC 0
                  "00 |"                       // reserved
                  "00 01 |"                    // numberPorts 1
                  "64 |"                       // priority1 100
                  "BB FE FF FF |"              // clockQuality 187, 0xFE, 0xFFFF
                  "64 |"                       // priority2 100
                  "00 00 00 00 00 00 00 00 |"  // clockIdentity
                  "00 | 00"));                 // domainNumber 0, reserved
    EXPECT_EQ(traceText(tlv), "tlvType 1 lengthField 22 managementId: 0x2000 ");
}

TEST(DataSetTLVTest, CurrentDataSetWireFormAndTrace) {
    tCurrentDataSetTLV tlv;
    ASSERT_TRUE(decode(tlv,
                       "00 01 00 14 20 01 | 00 02 |"  // stepsRemoved 2
                       "FF FF FF FF FF FF 00 00 |"    // offsetFromMaster -1 ns
                       "00 00 00 00 00 0A 00 00")     // meanPathDelay 10 ns
                    .succeeded());
    EXPECT_EQ(tlv.getStepsRemoved(), 2);
    EXPECT_EQ(tlv.getOffsetFromMaster().getNanoseconds(), -1);
    EXPECT_EQ(tlv.getMeanPathDelay().getNanoseconds(), 10);
    EXPECT_EQ(traceText(tlv),
              "tlvType 1 lengthField 20 managementId: 0x2001 stepsRemoved2 "
              "offsetFromMasterscaledNanoseconds: -65536 meanPathDelayscaledNanoseconds: 655360\n");
}

TEST(DataSetTLVTest, ParentDataSetDefaults) {
    const tParentDataSetTLV tlv;
    EXPECT_EQ(tlv.getLengthField(), 34);
    EXPECT_EQ(encode(tlv), hex("00 01 | 00 22 | 20 02 |"
                               "FF FF FF FF FF FF FF FF | FF FF |"  // parentPortIdentity
                               "00 | 00 |"                          // PS 0, reserved
                               "FF FF |"        // observedParentOffsetScaledLogVariance
                               "7F FF FF FF |"  // observedParentClockPhaseChangeRate
                               "00 |"           // grandmasterPriority1
                               "BB FE FF FF |"  // grandmasterClockQuality
                               "00 |"           // grandmasterPriority2
                               "00 00 00 00 00 00 00 00"));  // grandmasterIdentity
    EXPECT_EQ(traceText(tlv),
              "tlvType 1 lengthField 34 managementId: 0x2002 parent port identityclockIdentity: "
              "ffffffffffffffff portNumber: 65535\nPSfalse(0)observedParentOffsetScaledLogVariance"
              "65535observedParentClockPhaseChangeRate2147483647grandmasterPriority10"
              "grandmasterIdentity0000000000000000grandmasterPriority20grandmasterClockQuality"
              "clockClass: 187 clockAccuracy: 0xfe offsetScaledLogVariance: 0xffff\n");
}

TEST(DataSetTLVTest, TimePropertiesFlags) {
    tTimePropertiesDataSetTLV tlv;
    // currentUtcOffset -2; flags with the two high bits set as well; timeSource GPS
    ASSERT_TRUE(decode(tlv, "00 01 00 06 20 03 | FF FE | FF | 20").succeeded());
    EXPECT_EQ(tlv.getCurrentUtcOffset(), -2);
    EXPECT_TRUE(tlv.getFrequencyTraceable() && tlv.getTimeTraceable() && tlv.getPtpTimescale() &&
                tlv.getCurrentUtcOffsetValid() && tlv.getLeap59() && tlv.getLeap61());
    EXPECT_EQ(tlv.getTimeSource(), 0x20);
    // All six flags are 0x3F: the two high bits go out as 0.
    EXPECT_EQ(encode(tlv), hex("00 01 00 06 20 03 | FF FE | 3F | 20"));
    EXPECT_EQ(traceText(tlv),
              "tlvType 1 lengthField 6 managementId: 0x2003 currentUtcOffset: -2 "
              "UTCV: true(1) LI59: true(1) LI61: true(1)\n");
    EXPECT_EQ(encode(tTimePropertiesDataSetTLV()), hex("00 01 00 06 20 03 | 00 00 | 00 | A0"));
}

TEST(DataSetTLVTest, PortDataSetDefaultsEndWithVersionNibble) {
    const tPortDataSetTLV tlv;
    EXPECT_EQ(tlv.getLengthField(), 28);
    EXPECT_EQ(encode(tlv), hex("00 01 | 00 1C | 20 04 |"
                               "FF FF FF FF FF FF FF FF | FF FF |"  // portIdentity
                               "01 | 01 |"  // INITIALIZING, logMinDelayReqInterval 1
                               "00 00 00 00 00 01 00 00 |"  // peerMeanPathDelay 1 ns
                               "01 | 01 | 01 | 01 | 00 |"   // intervals, timeout, E2E
                               "02"));                      // reserved nibble, version 2
    tPortDataSetTLV received;
    ASSERT_TRUE(decode(received,
                       "00 01 00 1C 20 04 | 02 00 00 FF FE 00 00 01 | 00 01 | 06 | FD |"
                       "00 00 00 00 00 00 00 00 | FE | 03 | FF | 02 | 01 | F2")
                    .succeeded());
    EXPECT_EQ(received.getPortState(), 6);
    EXPECT_EQ(received.getLogMinDelayReqInterval(), -3);
    EXPECT_EQ(received.getLogAnnounceInterval(), -2);
    EXPECT_EQ(received.getLogSyncInterval(), -1);
    EXPECT_EQ(received.getDelayMechanism(), 2);
    EXPECT_EQ(received.getVersionNumber(), 2);  // the reserved high nibble is dropped
}

TEST(DataSetTLVTest, ClockDescriptionDefaults) {
    const tClockDescriptionTLV tlv;
    EXPECT_EQ(tlv.getLengthField(), 24);
    EXPECT_FALSE(tlv.getPadNeeded());
    EXPECT_EQ(encode(tlv), hex("00 01 | 00 18 | 00 01 |"
                               "00 00 |"               // clockType
                               "00 |"                  // physicalLayerProtocol empty
                               "00 00 |"               // physicalAddressLength 0, no address
                               "FF FE 00 00 |"         // protocolAddress: unknown protocol, empty
                               "02 A5 3C | 00 |"       // manufacturerIdentity, reserved
                               "00 | 00 | 00 |"        // product, revision, user description
                               "00 00 00 00 00 00"));  // profileIdentity
    EXPECT_TRUE(tlv.getPhysicalAddress().empty());
    EXPECT_EQ(traceText(tlv), "tlvType 1 lengthField 24 managementId: 0x0001 ");
}

// A clock description of odd data length (as a real clock sent it): the pad octet is counted
// in lengthField and consumed, so the TLV after it is read from its first octet.
TEST(DataSetTLVTest, ClockDescriptionOddLengthIsPadded) {
    const char* octets =
        "00 01 | 00 36 | 00 01 |"                    // lengthField 54
        "80 00 |"                                    // ordinary clock
        "0A 49 45 45 45 20 38 30 32 2E 33 |"         // "IEEE 802.3"
        "00 06 | 02 00 00 00 00 01 |"                // physical address, 6 octets
        "00 01 | 00 04 | A9 FE 01 01 |"              // UDP/IPv4 169.254.1.1
        "00 00 00 | 00 |"                            // manufacturerIdentity, reserved
        "02 3B 3B | 02 3B 3B | 05 61 6C 70 68 61 |"  // ";;", ";;", "alpha"
        "00 1B 19 00 01 00 |"                        // profileIdentity
        "00 |"                                       // pad
        "00 01 00 02 00 00";                         // the next TLV
    Datagram datagram(octets);
    tClockDescriptionTLV tlv;
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(tlv.getLengthField(), 54);
    EXPECT_TRUE(tlv.getPadNeeded());
    EXPECT_TRUE(tlv.getOrdinaryClock());
    EXPECT_FALSE(tlv.getBoundaryClock());
    EXPECT_EQ(tlv.getPhysicalLayerProtocol().view(), "IEEE 802.3");
    ASSERT_EQ(tlv.getPhysicalAddressLength(), 6);
    EXPECT_EQ(tlv.getPhysicalAddress()[5], 1);
    EXPECT_EQ(tlv.getProtocolAddress().getAddressField()[3], 1);
    EXPECT_EQ(tlv.getUserDescription().view(), "alpha");
    EXPECT_EQ(tlv.getProfileIdentity()[1], 0x1B);
    std::uint16_t next = 0;
    datagram.unit().readUInteger16(next, status);
    EXPECT_EQ(next, 0x0001);
    EXPECT_EQ(encode(tlv), hex(std::string(octets).substr(0, std::string(octets).rfind('|'))));

    const tClockDescriptionTLV copy(tlv);
    EXPECT_EQ(encode(copy), encode(tlv));
    EXPECT_NE(copy.getPhysicalAddress().data(), tlv.getPhysicalAddress().data());
}

// Lengths that disagree with the octets present: a physicalAddressLength of 65535 with four
// octets behind it ends with -52012 and no memory taken for the claimed length.
TEST(DataSetTLVTest, ClockDescriptionAddressLongerThanTheData) {
    tClockDescriptionTLV tlv;
    const tStatus status = decode(tlv, "00 01 00 18 00 01 | 80 00 | 00 | FF FF | 01 02 03 04");
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_TRUE(tlv.getPhysicalAddress().empty());
}

TEST(DataSetTLVTest, UserDescriptionPadRule) {
    tUserDescriptionTLV tlv;
    EXPECT_EQ(tlv.getLengthField(), 4);  // empty text (1) + pad + managementId
    tStatus status;
    tlv.setUserDescription(tPTPText("abc", status), status);
    EXPECT_EQ(tlv.getLengthField(), 6);
    EXPECT_EQ(encode(tlv), hex("00 01 00 06 00 02 | 03 61 62 63"));
    tlv.setUserDescription(tPTPText("ab", status), status);
    EXPECT_EQ(tlv.getLengthField(), 6);
    EXPECT_EQ(encode(tlv), hex("00 01 00 06 00 02 | 02 61 62 | 00"));
    EXPECT_EQ(traceText(tlv),
              "tlvType 1 lengthField 6 managementId: 0x0002 user description: ab\n");

    // Decoding consumes the pad octet.
    Datagram datagram("00 01 00 06 00 02 | 02 78 79 | 00 | 5A");
    tUserDescriptionTLV received;
    received.deserialize(datagram.unit(), status);
    EXPECT_EQ(received.getUserDescription().view(), "xy");
    std::uint8_t next = 0;
    datagram.unit().readOctet(next, status);
    EXPECT_EQ(next, 0x5A);

    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    tlv.setUserDescription(tPTPText("changed", status), failed);
    EXPECT_EQ(tlv.getUserDescription().view(), "ab");
}

}  // namespace
