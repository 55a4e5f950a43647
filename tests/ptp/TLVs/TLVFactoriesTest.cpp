#include <gtest/gtest.h>

#include "ptp/TLVs/tLXIConsortiumNotDefinedTLV.h"
#include "ptp/tTLVFactory.h"
#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;
using qvtest::Datagram;

namespace {

std::unique_ptr<tTLV> createFrom(std::string_view text, tStatus& status) {
    Datagram datagram(text);
    return tTLVFactory::createTLV(datagram.unit(), status);
}

TEST(tTLVFactoryTest, UnsupportedTypeIsSkippedWithItsLength) {
    Datagram datagram("00 08 | 00 04 | 01 02 03 04 | 00 01 00 02 00 00");
    tStatus status;
    EXPECT_EQ(tTLVFactory::createTLV(datagram.unit(), status), nullptr);
    EXPECT_EQ(status.code, kStatusUnsupported);
    status.reset();
    const auto next = tTLVFactory::createTLV(datagram.unit(), status);
    ASSERT_NE(next, nullptr);
    EXPECT_EQ(next->getTlvType(), tTLV::kManagement);
}

TEST(tTLVFactoryTest, EmptyDataEndsWithNoData) {
    tStatus status;
    EXPECT_EQ(createFrom("", status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

// Organization extensions: the LXI NOT_DEFINED TLV is built, the rest is traced and skipped.
class tOrganizationExtensionTLVFactoryTest : public ::testing::Test {
  protected:
    // The trace text written while the TLV is created, without the line header and without
    // the line end that closes every trace line.
    std::string rejectionTrace(std::string_view text) {
        qvtest::DebugOutputCapture capture;
        tStatus status;
        EXPECT_EQ(createFrom(text, status), nullptr);
        EXPECT_EQ(status.code, kStatusUnsupported);
        const std::string traced = capture.text();
        EXPECT_EQ(traced.rfind("[qvptp3u--", 0), 0U) << traced;
        EXPECT_EQ(traced.back(), '\n');
        return traced.substr(traced.find("] ") + 2, traced.size() - traced.find("] ") - 3);
    }
};

TEST_F(tOrganizationExtensionTLVFactoryTest, UnsupportedOrganizationsAreTraced) {
    // ORGANIZATION_EXTENSION | lengthField 8 | organizationId | organizationSubType | data
    EXPECT_EQ(rejectionTrace("00 03 | 00 08 | 00 21 D6 | 00 00 01 | AA BB"),
              "Unsupported organizationSubType 000001 for" + std::string(28, ' ') +
                  "organization 0021d6\n");
    EXPECT_EQ(rejectionTrace("00 03 | 00 06 | 02 A5 3C | 12 34 56"),
              "Unsupported organizationSubType 123456 for" + std::string(22, ' ') +
                  "organization 02a53c\n");
    EXPECT_EQ(rejectionTrace("00 03 | 00 06 | 00 80 C2 | 00 00 01"),
              "Unsupported organizationId 0080c2\n");
}

TEST_F(tOrganizationExtensionTLVFactoryTest, RejectedTLVIsSkippedWhole) {
    Datagram datagram(
        "00 03 | 00 0C | 00 80 C2 | 00 00 01 | 00 01 00 02 00 00 | 00 01 00 02 00 00");
    tStatus status;
    {
        qvtest::DebugOutputCapture capture;
        EXPECT_EQ(tTLVFactory::createTLV(datagram.unit(), status), nullptr);
    }
    status.reset();
    // The data that looked like a TLV was part of the rejected one.
    const auto next = tTLVFactory::createTLV(datagram.unit(), status);
    ASSERT_NE(next, nullptr);
    status.reset();
    EXPECT_EQ(tTLVFactory::createTLV(datagram.unit(), status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST_F(tOrganizationExtensionTLVFactoryTest, LXIDataIsReadAndTraced) {
    tStatus status;
    // ORGANIZATION_EXTENSION | lengthField 9 | LXI Consortium | NOT_DEFINED | "abc"
    const auto tlv = createFrom("00 03 | 00 09 | 00 21 D6 | FF FF FF | 61 62 63", status);
    ASSERT_TRUE(status.succeeded());
    const auto* lxi = dynamic_cast<const tLXIConsortiumNotDefinedTLV*>(tlv.get());
    ASSERT_NE(lxi, nullptr);
    EXPECT_EQ(lxi->getDataLength(), 3);
    EXPECT_EQ(lxi->getLengthField(), 9);
    EXPECT_EQ(qvtest::traceText(*lxi), "LXI Consortium NOT_DEFINED TLV data field: abc\n");
    const auto copy = lxi->clone(status);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(qvtest::encode(*copy), qvtest::hex("00 03 | 00 09 | 00 21 D6 | FF FF FF | 61 62 63"));
}

TEST_F(tOrganizationExtensionTLVFactoryTest, LXIWithoutData) {
    tStatus status;
    const auto tlv = createFrom("00 03 | 00 06 | 00 21 D6 | FF FF FF", status);
    ASSERT_TRUE(status.succeeded());
    EXPECT_EQ(qvtest::traceText(*tlv), "LXI Consortium NOT_DEFINED TLV data field: \n");
    EXPECT_EQ(qvtest::encode(tLXIConsortiumNotDefinedTLV()),
              qvtest::hex("00 03 00 06 00 21 D6 FF FF FF"));
}

TEST_F(tOrganizationExtensionTLVFactoryTest, LXILengthFieldTooShortForItsIdentifiers) {
    // lengthField 4 cannot hold the six octets of the identifiers: the TLV is dropped.
    Datagram datagram("00 03 | 00 04 | 00 21 D6 FF | 00 01 00 02 00 00");
    tStatus status;
    EXPECT_EQ(tTLVFactory::createTLV(datagram.unit(), status), nullptr);
    EXPECT_EQ(status.code, kStatusUnsupported);
    status.reset();
    EXPECT_NE(tTLVFactory::createTLV(datagram.unit(), status), nullptr);

    // Decoding the data field directly with such a lengthField is refused, not wrapped.
    tLXIConsortiumNotDefinedTLV lxi;
    tStatus set;
    lxi.setDataLength(0xFFFE, set, 1);  // lengthField 0xFFFE + 6 = 4 in 16 bits
    ASSERT_EQ(lxi.getLengthField(), 4);
    Datagram data("01 02 03 04");
    tStatus read;
    lxi.deserializeDataField(data.unit(), read);
    EXPECT_EQ(read.code, kStatusBadContent);
    EXPECT_EQ(lxi.getDataLength(), 0);
}

TEST_F(tOrganizationExtensionTLVFactoryTest, LXILengthBeyondTheDatagram) {
    tStatus status;
    EXPECT_EQ(createFrom("00 03 | FF FF | 00 21 D6 | FF FF FF | 61 62 63", status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

}  // namespace
