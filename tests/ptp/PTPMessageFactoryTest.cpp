#include <gtest/gtest.h>

#include "ptp/TLVs/tManagementErrorStatusTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tManagementIdTable.h"
#include "ptp/tManagementMessage.h"
#include "tests/ptp/MessageTestSupport.h"
#include "tests/support/FailingAllocation.h"

using namespace nQVPTP000;
using qvtest::decodeMessage;
using qvtest::headerHex;
using qvtest::managementBodyHex;

namespace {

// NULL_MANAGEMENT TLV: tlvType MANAGEMENT | lengthField 2 | managementId 0
constexpr const char* kNullTlv = "00 01 | 00 02 | 00 00 |";

std::string managementHex(std::string_view length, std::string_view tlvs) {
    std::string text = headerHex("0D", length, "04") + managementBodyHex();
    text += tlvs;
    return text;
}

const tManagementMessage* asManagement(const std::unique_ptr<tPTPMessage>& message) {
    return dynamic_cast<const tManagementMessage*>(message.get());
}

TEST(tPTPMessageFactoryTest, MessageLengthIsNotComparedWithTheDatagram) {
    tStatus exact;
    tStatus claimed;
    const auto right = decodeMessage(managementHex("00 36", kNullTlv), exact);
    const auto wrong = decodeMessage(managementHex("03 E8", kNullTlv), claimed);  // 1000
    ASSERT_TRUE(exact.succeeded());
    ASSERT_TRUE(claimed.succeeded());
    ASSERT_NE(asManagement(wrong), nullptr);
    EXPECT_EQ(wrong->getHeader()->getMessageLength(), 1000);
    EXPECT_EQ(wrong->getSuffix()->getCount(), 1U);
    EXPECT_EQ(qvtest::encode(*wrong), qvtest::encode(*right));
}

TEST(tPTPMessageFactoryTest, HeaderWithoutManagementBodyIsCut) {
    tStatus status;
    EXPECT_EQ(decodeMessage(headerHex("0D", "00 22", "04"), status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tPTPMessageFactoryTest, OnlyVersionTwoIsAccepted) {
    for (const char* type : {"00", "0D", "02"}) {
        std::string text = headerHex(type, "00 36", "00") + managementBodyHex() + kNullTlv;
        text[4] = '1';  // versionPTP 1
        tStatus status;
        EXPECT_EQ(decodeMessage(text, status), nullptr);
        EXPECT_EQ(status.code, kStatusBadContent) << type;
    }
}

TEST(tPTPMessageFactoryTest, PeerDelayAndReservedTypesAreNotDecoded) {
    for (const char* type : {"02", "03", "0A", "04", "0F"}) {
        tStatus status;
        EXPECT_EQ(
            decodeMessage(headerHex(type, "00 36", "05") + "00 00 00 00 00 00 00 00 00 00", status),
            nullptr);
        EXPECT_EQ(status.code, kStatusUnsupported) << type;
    }
}

TEST(tPTPMessageFactoryTest, NothingIsDoneAfterAnEarlierError) {
    tStatus status;
    status.set(kStatusSocketError, "x", "y", 1);
    EXPECT_EQ(decodeMessage(managementHex("00 36", kNullTlv), status), nullptr);
    EXPECT_EQ(status.code, kStatusSocketError);
}

TEST(tPTPMessageFactoryTest, NoAllocationFailureLeavesAHalfBuiltMessage) {
    const std::string text = managementHex(
        "00 3C", std::string(kNullTlv) + "00 01 | 00 02 | 00 00");  // two NULL_MANAGEMENT TLVs
    for (unsigned nth = 1;; ++nth) {
        tStatus status;
        std::unique_ptr<tPTPMessage> message;
        qvtest::Datagram datagram(text);
        bool triggered = false;
        {
            qvtest::ScopedAllocationFailure failure(nth);
            message = tPTPMessageFactory::createMessage(datagram.unit(), status);
            triggered = failure.triggered();
        }
        if (!triggered) {
            ASSERT_TRUE(status.succeeded());
            EXPECT_EQ(message->getSuffix()->getCount(), 2U);
            break;
        }
        EXPECT_EQ(message, nullptr) << nth;
        EXPECT_EQ(status.code, kStatusNoMemory) << nth;
    }
}

// Reading the TLVs of a received message.
class tMessageSuffixTest : public ::testing::Test {
  protected:
    std::unique_ptr<tPTPMessage> decode(std::string_view tlvs) {
        status_.reset();
        auto message = decodeMessage(managementHex("00 30", tlvs), status_);
        EXPECT_TRUE(status_.succeeded()) << status_.code;
        return message;
    }
    std::uint16_t managementIdAt(const tPTPMessage& message, std::size_t index) {
        auto* tlv =
            dynamic_cast<tManagementMessagePayload*>(message.getSuffix()->getTLV(index, status_));
        return tlv == nullptr ? 0xFFFF : tlv->getManagementId();
    }
    tStatus status_;
};

TEST_F(tMessageSuffixTest, EndOfDataAfterTheBodyMeansNoTLV) {
    const auto message = decode("");
    ASSERT_NE(message, nullptr);
    EXPECT_EQ(message->getSuffix()->getCount(), 0U);
}

TEST_F(tMessageSuffixTest, TLVOfAnotherTypeIsSkippedWhole) {
    // tlvType 8 | lengthField 4 | four octets that would read as a MANAGEMENT TLV
    const auto message = decode(std::string("00 08 | 00 04 | 00 01 00 00 |") + kNullTlv);
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
    EXPECT_EQ(managementIdAt(*message, 0), kNullManagement);
}

TEST_F(tMessageSuffixTest, UnknownManagementIdIsSkippedWithItsDataField) {
    // MANAGEMENT | lengthField 8 | managementId 0x2014 | a dataField that holds the octets of
    // a NULL_MANAGEMENT TLV: they belong to the unknown TLV and are no TLV of their own.
    const auto message = decode(std::string("00 01 | 00 08 | 20 14 |") + kNullTlv);
    EXPECT_EQ(message->getSuffix()->getCount(), 0U);
}

TEST_F(tMessageSuffixTest, LengthFieldDecidesWhereTheNextTLVStarts) {
    // NULL_MANAGEMENT announcing two octets more than it has: they are skipped.
    auto message = decode(std::string("00 01 | 00 04 | 00 00 | 00 01 |") + kNullTlv);
    ASSERT_EQ(message->getSuffix()->getCount(), 2U);
    EXPECT_EQ(managementIdAt(*message, 1), kNullManagement);

    // An error status TLV too short for its fixed fields is dropped; the next one is read.
    message = decode(std::string("00 02 | 00 04 | 00 02 20 00 |") + kNullTlv);
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
    EXPECT_EQ(managementIdAt(*message, 0), kNullManagement);

    // A lengthField below the managementId's two octets.
    message = decode(std::string("00 01 | 00 00 |") + kNullTlv);
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
}

TEST_F(tMessageSuffixTest, DatagramEndingInsideATLVKeepsTheTLVsBefore) {
    const auto message = decode(std::string(kNullTlv) + "00 02 | 00 08 | 00 02");
    ASSERT_EQ(message->getSuffix()->getCount(), 1U);
    EXPECT_EQ(managementIdAt(*message, 0), kNullManagement);
}

TEST_F(tMessageSuffixTest, GetTLVBeyondTheList) {
    const tMessageSuffix suffix;
    tStatus status;
    EXPECT_EQ(suffix.getTLV(0, status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST(tMessageSuffixGrowthTest, LostTLVIsReportedAndRemembered) {
    tMessageSuffix suffix;
    tStatus status;
    suffix.addTLV(std::make_unique<tNullManagementTLV>(), status);
    auto second = std::make_unique<tNullManagementTLV>();
    {
        qvtest::ScopedAllocationFailure failure(1);  // the room for two elements
        suffix.addTLV(std::move(second), status);
        ASSERT_TRUE(failure.triggered());
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    EXPECT_EQ(suffix.getCount(), 1U);

    tStatus later;
    suffix.clear(later);
    EXPECT_EQ(later.code, kStatusNoMemory);
    EXPECT_EQ(suffix.getCount(), 0U);
}

TEST(tMessageSuffixTraceTest, EachTLVIsFramed) {
    tMessageSuffix suffix;
    tStatus status;
    suffix.addTLV(std::make_unique<tNullManagementTLV>(), status);
    suffix.addTLV(std::make_unique<tManagementErrorStatusTLV>(), status);
    EXPECT_EQ(qvtest::traceText(suffix),
              "--- Begin TLV 0 ---tlvType 1 lengthField 2 managementId: 0000 --- End TLV 0 ---"
              "--- Begin TLV 1 ---tlvType 2 lengthField 10 --- End TLV 1 ---");
}

}  // namespace
