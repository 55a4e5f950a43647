#include <gtest/gtest.h>

#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tManagementMessage.h"
#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;
using qvtest::encode;
using qvtest::hex;

namespace {

TEST(tManagementMessageTest, DefaultRequestOctets) {
    tStatus status;
    tManagementMessage message(status);
    EXPECT_EQ(message.getHeader()->getMessageLength(), 48);  // header and body, no TLV
    message.setPayload(std::make_unique<tNullManagementTLV>(), status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(
        encode(message),
        hex("0D | 02 | 00 36 | 00 | 00 | 00 00 |"      // Management | v2 | length | domain | flags
            "00 00 00 00 00 00 00 00 | 00 00 00 00 |"  // correctionField | reserved
            "FF FF FF FF FF FF FF FF | FF FF |"        // sourcePortIdentity
            "00 00 | 04 | 7F |"                  // sequenceId | controlField | logMessageInterval
            "FF FF FF FF FF FF FF FF | FF FF |"  // targetPortIdentity: all ports, all clocks
            "00 | 00 | 00 | 00 |"                // hops | hops | GET | reserved
            "00 01 | 00 02 | 00 00"));           // NULL_MANAGEMENT
}

TEST(tManagementMessageTest, AssignCopiesHeaderAndTLVsButNotTheBody) {
    tStatus status;
    tManagementMessage source(status);
    source.getHeader()->setSequenceId(0x4321, status);
    source.setActionField(tManagementMessagePayload::kCommand, status);
    source.setPayload(std::make_unique<tNullManagementTLV>(), status);

    tManagementMessage copy(status);
    copy.assign(source, status);
    copy.assign(copy, status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(copy.getHeader()->getSequenceId(), 0x4321);
    ASSERT_EQ(copy.getSuffix()->getCount(), 1U);
    EXPECT_NE(copy.getSuffix()->getTLV(0, status), source.getSuffix()->getTLV(0, status));
    EXPECT_EQ(copy.getActionField(), tManagementMessagePayload::kGet);
}

TEST(tManagementMessageTest, NoPayloadFromAnEmptyMessageOrAnExtension) {
    tStatus status;
    const tManagementMessage empty(status);
    EXPECT_EQ(empty.getPayload(status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);

    status.reset();
    const auto message =
        qvtest::decodeMessage(encode(empty) + "| 00 03 | 00 06 | 00 21 D6 | FF FF FF", status);
    ASSERT_NE(message, nullptr);
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
    EXPECT_EQ(dynamic_cast<const tManagementMessage&>(*message).getPayload(status), nullptr);
    EXPECT_EQ(status.code, kStatusUnsupported);
}

}  // namespace
