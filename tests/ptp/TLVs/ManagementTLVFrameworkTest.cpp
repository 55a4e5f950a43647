#include <gtest/gtest.h>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/iManagedClock.h"
#include "ptp/tManagementIdTable.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/ptp/InMemoryManagedClock.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::hex;
using qvtest::traceText;

namespace {

TEST(tTLVTest, SetDataLengthPadsToTheAlignment) {
    tNullManagementTLV tlv;
    tStatus status;
    // tManagementTLV adds the two octets of managementId: 7 + 2 = 9.
    EXPECT_EQ(tlv.setDataLength(7, status, 2), 1);
    EXPECT_EQ(tlv.getLengthField(), 10);
    EXPECT_EQ(tlv.setDataLength(7, status, 1), 0);
    EXPECT_EQ(tlv.getLengthField(), 9);

    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    EXPECT_EQ(tlv.setDataLength(0, failed, 2), 0);
    EXPECT_EQ(tlv.getLengthField(), 9);
}

TEST(tNullManagementTLVTest, WireFormTraceAndTableRow) {
    const tNullManagementTLV tlv;
    // tlvType MANAGEMENT, lengthField 2, managementId NULL_MANAGEMENT
    EXPECT_EQ(encode(tlv), hex("00 01 | 00 02 | 00 00"));
    EXPECT_EQ(tlv.getSize(), 6);
    EXPECT_EQ(traceText(tlv), "tlvType 1 lengthField 2 managementId: 0000 ");
    const tManagementIdEntry* row = findManagementId(kNullManagement);
    ASSERT_NE(row, nullptr);
    EXPECT_STREQ(row->name, "NULL_MANAGEMENT");
    EXPECT_EQ(row->create()->getManagementId(), kNullManagement);
    EXPECT_EQ(findManagementId(0x2014), nullptr);
}

TEST(tManagementErrorStatusTLVTest, DefaultWireForm) {
    // tlvType 2, lengthField 10, NOT_SUPPORTED, managementId 0, reserved x4, empty text, pad
    EXPECT_EQ(encode(tManagementErrorStatusTLV()),
              hex("00 02 | 00 0A | 00 06 | 00 00 | 00 00 00 00 | 00 | 00"));
}

TEST(tManagementErrorStatusTLVTest, TextOfOddSizeNeedsNoPad) {
    const tManagementErrorStatusTLV tlv(0x2005, 0x0006, "Unsupported actionField");
    EXPECT_EQ(tlv.getLengthField(), 32);
    EXPECT_EQ(tlv.getSize(), 36);
    EXPECT_EQ(encode(tlv),
              hex("00 02 | 00 20 | 00 06 | 20 05 | 00 00 00 00 | 17"
                  "55 6E 73 75 70 70 6F 72 74 65 64 20 61 63 74 69 6F 6E 46 69 65 6C 64"));
}

TEST(tManagementErrorStatusTLVTest, DecodesWithoutDisplayData) {
    // NO_SUCH_ID for DEFAULT_DATA_SET, lengthField 8, nothing after the reserved octets.
    Datagram datagram("00 02 | 00 08 | 00 02 | 20 00 | 00 00 00 00");
    tManagementErrorStatusTLV tlv(1, 1, "previous");
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(tlv.getManagementErrorId(), 0x0002);
    EXPECT_EQ(tlv.getManagementId(), 0x2000);
    EXPECT_EQ(tlv.getDisplayData().getLengthField(), 0);
    // Written back, it is the 12 octets it came as, in agreement with its lengthField.
    EXPECT_EQ(encode(tlv), hex("00 02 | 00 08 | 00 02 | 20 00 | 00 00 00 00"));
    EXPECT_EQ(tlv.getSize(), 12);
}

TEST(tManagementErrorStatusTLVTest, DisplayDataCutShortIsForgiven) {
    Datagram datagram("00 02 | 00 10 | 00 04 | 20 05 | 00 00 00 00 | 05 61 62");
    tManagementErrorStatusTLV tlv;
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(tlv.getManagementErrorId(), tManagementErrorStatusTLV::kWrongValue);
}

TEST(tManagementErrorStatusTLVTest, CutInsideTheFixedFieldsStaysAnError) {
    Datagram datagram("00 02 | 00 08 | 00 02 | 20");
    tManagementErrorStatusTLV tlv;
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tManagementMessagePayloadTest, RespondAnswersWithACopyOrAnErrorStatus) {
    qvtest::InMemoryManagedClock clock;  // neither answer reads the clock
    tNullManagementTLV null;
    tStatus status;
    auto answer = null.respond(tManagementMessagePayload::kCommand, clock, 1, status);
    ASSERT_NE(answer, nullptr);
    EXPECT_NE(answer.get(), &null);
    EXPECT_EQ(answer->getManagementId(), kNullManagement);

    tManagementErrorStatusTLV refusal(0x2005, 0x0002, nullptr);
    auto unsupported = refusal.respond(tManagementMessagePayload::kGet, clock, 1, status);
    ASSERT_NE(unsupported, nullptr);
    auto* error = dynamic_cast<tManagementErrorStatusTLV*>(unsupported.get());
    ASSERT_NE(error, nullptr);
    EXPECT_EQ(error->getManagementErrorId(), tManagementErrorStatusTLV::kNotSupported);
    EXPECT_EQ(error->getManagementId(), 0x2005);
    EXPECT_EQ(error->getDisplayData().view(), "Unsupported actionField");
}

}  // namespace
