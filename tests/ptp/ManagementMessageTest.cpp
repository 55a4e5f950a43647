#include <gtest/gtest.h>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tManagementMessage.h"
#include "tests/ptp/MessageTestSupport.h"

using namespace nQVPTP000;
using qvtest::decodeMessage;
using qvtest::encode;
using qvtest::headerHex;
using qvtest::hex;
using qvtest::managementBodyHex;

namespace {

// The 34-octet header of a default request with the given messageLength octets.
std::string requestHeaderHex(std::string_view length) {
    std::string text = "0D | 02 |";  // transportSpecific 0, Management | versionPTP 2
    text += length;
    text +=
        "| 00 | 00 | 00 00 |"                      // domainNumber | reserved | flags
        "00 00 00 00 00 00 00 00 | 00 00 00 00 |"  // correctionField | reserved
        "FF FF FF FF FF FF FF FF | FF FF |"        // sourcePortIdentity
        "00 00 | 04 | 7F |";                       // sequenceId | controlField | logInterval
    return text;
}

constexpr const char* kRequestBody =
    "FF FF FF FF FF FF FF FF | FF FF |"  // targetPortIdentity: all ports of all clocks
    "00 | 00 | 00 | 00 |";               // starting hops | hops | GET | reserved

TEST(tManagementMessageTest, EmptyAndNullManagementRequestOctets) {
    tStatus status;
    tManagementMessage message(status);
    // Without a TLV: header and body only, 48 octets.
    EXPECT_EQ(message.getSize(), 48);
    EXPECT_EQ(message.getHeader()->getMessageLength(), 48);
    message.setActionField(tManagementMessagePayload::kGet, status);
    message.setPayload(std::make_unique<tNullManagementTLV>(), status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(encode(message), hex(requestHeaderHex("00 36") + kRequestBody +
                                   "00 01 | 00 02 | 00 00"));  // NULL_MANAGEMENT TLV
}

TEST(tManagementMessageTest, SetPayloadReplacesThePayloadAndKeepsTheLength) {
    tStatus status;
    tManagementMessage message(status);
    message.setPayload(std::make_unique<tNullManagementTLV>(), status);
    message.setPayload(
        std::make_unique<tManagementErrorStatusTLV>(0x2005, 0x0006, "Unsupported actionField"),
        status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(message.getSuffix()->getCount(), 1U);
    EXPECT_EQ(message.getPayload(status)->getManagementId(), 0x2005);
    EXPECT_EQ(message.getHeader()->getMessageLength(), 48 + 36);
}

TEST(tManagementMessageTest, ReservedActionFieldIsRejected) {
    for (const char* action : {"05", "0F"}) {
        tStatus status;
        const auto message =
            decodeMessage(headerHex("0D", "00 30", "04") + managementBodyHex(action), status);
        EXPECT_EQ(message, nullptr);
        EXPECT_EQ(status.code, kStatusBadContent) << action;
    }
    tStatus status;
    const auto message =
        decodeMessage(headerHex("0D", "00 30", "04") + managementBodyHex("04"), status);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(dynamic_cast<const tManagementMessage&>(*message).getActionField(),
              tManagementMessagePayload::kAcknowledge);
}

TEST(tManagementMessageTest, GetPayloadOfAnEmptyMessage) {
    tStatus status;
    const tManagementMessage message(status);
    EXPECT_EQ(message.getPayload(status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tManagementMessageTest, GetPayloadRefusesAnOrganizationExtension) {
    // ORGANIZATION_EXTENSION | lengthField 6 | LXI Consortium | NOT_DEFINED
    tStatus status;
    const auto message = decodeMessage(headerHex("0D", "00 3A", "04") + managementBodyHex() +
                                           "00 03 | 00 06 | 00 21 D6 | FF FF FF",
                                       status);
    ASSERT_NE(message, nullptr);
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
    EXPECT_EQ(dynamic_cast<const tManagementMessage&>(*message).getPayload(status), nullptr);
    EXPECT_EQ(status.code, kStatusUnsupported);
}

TEST(tManagementMessageTest, UnknownManagementIdGivesNoPayload) {
    tStatus status;
    const auto message = decodeMessage(headerHex("0D", "00 34", "04") + managementBodyHex() +
                                           "00 01 | 00 02 | 20 14",  // managementId 0x2014
                                       status);
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->getSuffix()->getCount(), 0U);
}

TEST(tManagementMessageTest, AssignCopiesHeaderAndTLVsButNotTheBody) {
    tStatus status;
    tManagementMessage source(status);
    source.getHeader()->setSequenceId(0x4321, status);
    source.getHeader()->setDomainNumber(2, status);
    source.setActionField(tManagementMessagePayload::kCommand, status);
    source.setPayload(std::make_unique<tNullManagementTLV>(), status);

    tManagementMessage copy(status);
    copy.assign(source, status);
    copy.assign(copy, status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(copy.getHeader()->getSequenceId(), 0x4321);
    EXPECT_EQ(copy.getHeader()->getDomainNumber(), 2);
    ASSERT_EQ(copy.getSuffix()->getCount(), 1U);
    EXPECT_NE(copy.getSuffix()->getTLV(0, status), source.getSuffix()->getTLV(0, status));
    EXPECT_EQ(copy.getActionField(), tManagementMessagePayload::kGet);
}

TEST(tManagementMessageTest, TraceDump) {
    tStatus status;
    tManagementMessage message(status);
    message.setPayload(std::make_unique<tNullManagementTLV>(), status);
    const std::string text = qvtest::traceText(message);
    const std::string headerEnd = "--- End Message Header ---\n";
    ASSERT_EQ(text.rfind("--- Begin Management Message ---\n--- Begin Message Header ---\n", 0),
              0U);
    EXPECT_EQ(text.substr(text.find(headerEnd) + headerEnd.size()),
              "targetPortIdentity: clockIdentity: ffffffffffffffff portNumber: 65535\n"
              "startingBoundaryHops: 0 boundaryHops: 0 actionField: 0 "
              "--- Begin TLV 0 ---tlvType 1 lengthField 2 managementId: 0000 --- End TLV 0 ---"
              "--- End Management Message ---\n");
}

}  // namespace
