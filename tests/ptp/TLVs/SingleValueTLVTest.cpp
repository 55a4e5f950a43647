#include <gtest/gtest.h>

#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tDelayMechanismTLV.h"
#include "ptp/TLVs/tEnablePortTLV.h"
#include "ptp/TLVs/tFaultLogTLV.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "ptp/TLVs/tLogSyncIntervalTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tTimescalePropertiesTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/TLVs/tVersionNumberTLV.h"
#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::hex;
using qvtest::traceText;

namespace {

tStatus decode(tTLV& tlv, std::string_view octets) {
    Datagram datagram(octets);
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    return status;
}

TEST(SingleValueTLVTest, ValueOctetForms) {
    tStatus status;
    tVersionNumberTLV version;
    version.setValue(2, status);
    EXPECT_EQ(encode(version), hex("00 01 00 04 20 0C | 02 | 00"));
    ASSERT_TRUE(decode(version, "00 01 00 04 20 0C | F2 | 00").succeeded());
    EXPECT_EQ(version.getValue(), 2);  // the high nibble is reserved

    tSlaveOnlyTLV slaveOnly;
    slaveOnly.setValue(true, status);
    EXPECT_EQ(encode(slaveOnly), hex("00 01 00 04 20 08 | 01 | 00"));
    slaveOnly.setValue(false, status);
    ASSERT_TRUE(decode(slaveOnly, "00 01 00 04 20 08 | FF | 00").succeeded());
    EXPECT_TRUE(slaveOnly.getValue());  // only the last bit counts
    EXPECT_EQ(traceText(slaveOnly),
              "tlvType 1 lengthField 4 managementId: 0x2008 slaveOnly: true(1)\n");

    tLogSyncIntervalTLV sync;
    sync.setValue(-1, status);
    EXPECT_EQ(encode(sync), hex("00 01 00 04 20 0B | FF | 00"));
    EXPECT_EQ(traceText(sync),
              "tlvType 1 lengthField 4 managementId: 0x200b logSyncInterval: -1\n");

    tPriority1TLV priority1;
    EXPECT_EQ(priority1.getValue(), 0);
    ASSERT_TRUE(decode(priority1, "00 01 00 04 20 05 | C8 | 77").succeeded());
    EXPECT_EQ(priority1.getValue(), 200);  // the reserved octet is ignored
    EXPECT_EQ(traceText(priority1),
              "tlvType 1 lengthField 4 managementId: 0x2005 priority1: 200\n");
    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    priority1.setValue(1, failed);
    EXPECT_EQ(priority1.getValue(), 200);

    const tClockAccuracyTLV accuracy;
    EXPECT_EQ(encode(accuracy), hex("00 01 00 04 20 10 | FE | 00"));
    EXPECT_EQ(traceText(accuracy),
              "tlvType 1 lengthField 4 managementId: 0x2010 clockAccuracy: 0xfe\n");
    EXPECT_EQ(tDelayMechanismTLV().getValue(), 1);  // E2E
}

TEST(SingleValueTLVTest, PropertyFlags) {
    const tTimescalePropertiesTLV timescale;
    // PTP timescale (0x08), INTERNAL_OSCILLATOR
    EXPECT_EQ(encode(timescale), hex("00 01 00 04 20 13 | 08 | A0"));
    EXPECT_EQ(traceText(timescale),
              "tlvType 1 lengthField 4 managementId: 0x2013 PTP: true(1) timeSource: 160\n");

    tTraceabilityPropertiesTLV traceability;
    ASSERT_TRUE(decode(traceability, "00 01 00 04 20 12 | FF | 00").succeeded());
    EXPECT_TRUE(traceability.getFrequencyTraceable() && traceability.getTimeTraceable());
    EXPECT_EQ(encode(traceability), hex("00 01 00 04 20 12 | 30 | 00"));
    EXPECT_EQ(traceText(traceability),
              "tlvType 1 lengthField 4 managementId: 0x2012 FTRA: true(1) TTRA: true(1)\n");

    tUTCPropertiesTLV utc;
    EXPECT_EQ(utc.getLengthField(), 6);
    ASSERT_TRUE(decode(utc, "00 01 00 06 20 11 | 00 25 | 07 | 00").succeeded());
    EXPECT_EQ(utc.getCurrentUtcOffset(), 37);
    EXPECT_TRUE(utc.getCurrentUtcOffsetValid() && utc.getLeap59() && utc.getLeap61());
    EXPECT_EQ(encode(utc), hex("00 01 00 06 20 11 | 00 25 | 07 | 00"));
    EXPECT_EQ(traceText(utc),
              "tlvType 1 lengthField 6 managementId: 0x2011 currentUtcOffset: 37 "
              "UTCV: true(1) LI59: true(1) LI61: true(1)\n");
}

TEST(SingleValueTLVTest, TimeInitializeAndCommands) {
    tTimeTLV time;
    EXPECT_EQ(time.getLengthField(), 12);
    tStatus status;
    time.setCurrentTime(tTimestamp(0x0000000100000002, 3), status);
    // 48-bit seconds, 32-bit nanoseconds
    EXPECT_EQ(encode(time), hex("00 01 00 0C 20 0F | 00 01 00 00 00 02 | 00 00 00 03"));
    EXPECT_EQ(traceText(time),
              "tlvType 1 lengthField 12 managementId: 0x200f currentTime: "
              "secondsField: 4294967298 nanosecondsField: 3\n");

    const tInitializeTLV initialize(0x1234);
    EXPECT_EQ(encode(initialize), hex("00 01 00 04 00 05 | 12 34"));
    EXPECT_EQ(traceText(initialize),
              "tlvType 1 lengthField 4 managementId: 0x0005 initializationKey: 0x1234\n");

    const tEnablePortTLV enable;
    EXPECT_EQ(encode(enable), hex("00 01 00 02 20 0D"));
    EXPECT_EQ(traceText(enable), "tlvType 1 lengthField 2 managementId: 0x200d ");
}

TEST(FaultLogTLVTest, DefaultAndOneEmptyRecord) {
    tFaultLogTLV log;
    EXPECT_EQ(log.getLengthField(), 4);
    EXPECT_EQ(encode(log), hex("00 01 00 04 00 06 | 00 00"));
    EXPECT_EQ(traceText(log), "tlvType 1 lengthField 4 managementId: 0x0006 ");

    const char* one =
        "00 01 00 14 00 06 | 00 01 |"        // lengthField 20, one record
        "00 0E |"                            // faultRecordLength 14
        "00 00 00 00 00 05 | 00 00 00 07 |"  // faultTime 5 s 7 ns
        "07 | 00 | 00 | 00";                 // severity DEBUG, three empty texts
    ASSERT_TRUE(decode(log, one).succeeded());
    EXPECT_EQ(log.getLengthField(), 20);
    EXPECT_FALSE(log.getPadNeeded());
    ASSERT_EQ(log.getFaultRecords().size(), 1U);
    EXPECT_EQ(log.getFaultRecords()[0].getSize(), tFaultRecord::kMinimumSize);
    EXPECT_EQ(log.getFaultRecords()[0].getFaultTime().getSeconds(), 5U);
    EXPECT_EQ(encode(log), hex(one));
    EXPECT_EQ(traceText(log.getFaultRecords()[0]),
              "faultRecordLength: 14 faultTime: secondsField: 5 nanosecondsField: 7 "
              "severityCode: 0x07 faultName:  faultValue:  faultDescription: ");
}

TEST(FaultLogTLVTest, OddRecordIsPadded) {
    const char* odd =
        "00 01 00 16 00 06 | 00 01 | 00 0F | 00 00 00 00 00 00 00 00 00 00 |"
        "03 | 01 61 | 00 | 00 | 00 | 5A";  // faultName "a", pad, next octet
    Datagram datagram(odd);
    tFaultLogTLV log;
    tStatus status;
    log.deserialize(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_TRUE(log.getPadNeeded());
    EXPECT_EQ(log.getLengthField(), 22);
    std::uint8_t next = 0;
    datagram.unit().readOctet(next, status);
    EXPECT_EQ(next, 0x5A);
}

// A count of 65535 records with one record's octets present: the decoding stops at the
// first record cut short and keeps nothing in proportion to the count.
TEST(FaultLogTLVTest, HugeCountWithoutTheData) {
    tFaultLogTLV log;
    const tStatus status = decode(log,
                                  "00 01 00 14 00 06 | FF FF |"
                                  "00 0E | 00 00 00 00 00 05 00 00 00 07 | 07 | 00 00 00");
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_LE(log.getFaultRecords().capacity(), 2U);
}

// A record whose length claims more than its fields is read to that length; one that
// claims less is malformed.
TEST(FaultLogTLVTest, RecordLengthDecidesWhereTheNextRecordStarts) {
    tFaultLogTLV log;
    ASSERT_TRUE(decode(log,
                       "00 01 00 18 00 06 | 00 01 |"
                       "00 10 | 00 00 00 00 00 00 00 00 00 00 | 07 | 00 00 00 | AB CD")
                    .succeeded());
    EXPECT_EQ(log.getLengthField(), 22);
    EXPECT_EQ(encode(log), hex("00 01 00 16 00 06 | 00 01 |"
                               "00 10 | 00 00 00 00 00 00 00 00 00 00 | 07 | 00 00 00 | 00 00"));

    tFaultLogTLV shortRecord;
    EXPECT_EQ(decode(shortRecord,
                     "00 01 00 14 00 06 | 00 01 |"
                     "00 02 | 00 00 00 00 00 00 00 00 00 00 | 07 | 00 00 00")
                  .code,
              kStatusBadContent);
}

}  // namespace
