#include <gtest/gtest.h>

#include "ptp/tTLVFactory.h"
#include "tests/ptp/CodecTestSupport.h"

// The trace texts of the codec's objects, from the octets they were decoded from.

using namespace nQVPTP000;

namespace {

// What follows the header dump in a message's trace.
TEST(TraceTextTest, MessageBodies) {
    // Version 2, domain 0, no flags, source 001b21.fffe.010203-1, sequence 0x0102.
    auto header = [](const char* typeVersionLength) {
        return std::string(typeVersionLength) +
               " | 00 | 00 | 00 00 | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
               "00 1B 21 FF FE 01 02 03 | 00 01 | 01 02 | 05 | 00 |";
    };
    const std::pair<std::string, const char*> rows[] = {
        // GET NULL_MANAGEMENT and an error status TLV, to all ports of all clocks
        {header("0D 02 00 40") +
             "FF FF FF FF FF FF FF FF FF FF | 00 | 00 | 00 | 00 | 00 01 00 02 00 00 |"
             "00 02 00 08 00 06 20 05 00 00 00 00",
         "targetPortIdentity: clockIdentity: ffffffffffffffff portNumber: 65535\n"
         "startingBoundaryHops: 0 boundaryHops: 0 actionField: 0 "
         "--- Begin TLV 0 ---tlvType 1 lengthField 2 managementId: 0000 --- End TLV 0 ---"
         "--- Begin TLV 1 ---tlvType 2 lengthField 8 --- End TLV 1 ---"
         "--- End Management Message ---\n"},
    };
    for (const auto& [octets, body] : rows) {
        tStatus status;
        const auto message = qvtest::decodeMessage(octets, status);
        ASSERT_NE(message, nullptr) << status.code;
        const std::string text = qvtest::traceText(*message);
        const std::string headerEnd = "--- End Message Header ---\n";
        EXPECT_EQ(text.substr(text.find(headerEnd) + headerEnd.size()), body);
    }
}

TEST(TraceTextTest, TLVs) {
    const std::pair<const char*, const char*> rows[] = {
        {"00 01 00 14 20 01 | 00 02 | FF FF FF FF FF FF 00 00 | 00 00 00 00 00 0A 00 00",
         "tlvType 1 lengthField 20 managementId: 0x2001 stepsRemoved2 "
         "offsetFromMasterscaledNanoseconds: -65536 meanPathDelayscaledNanoseconds: 655360\n"},
        {"00 03 | 00 09 | 00 21 D6 | FF FF FF | 61 62 63",
         "LXI Consortium NOT_DEFINED TLV data field: abc\n"},
    };
    for (const auto& [octets, text] : rows) {
        qvtest::Datagram datagram(octets);
        tStatus status;
        const auto tlv = tTLVFactory::createTLV(datagram.unit(), status);
        ASSERT_NE(tlv, nullptr) << octets;
        EXPECT_EQ(qvtest::traceText(*tlv), text);
    }
}

// Organization extensions other than LXI's are traced as they are dropped.
TEST(TraceTextTest, RejectedOrganizationExtensions) {
    const std::pair<const char*, std::string> rows[] = {
        {"00 03 | 00 08 | 00 21 D6 | 00 00 01 | AA BB",
         "Unsupported organizationSubType 000001 for" + std::string(28, ' ') +
             "organization 0021d6\n"},
        {"00 03 | 00 06 | 00 80 C2 | 00 00 01", "Unsupported organizationId 0080c2\n"},
    };
    for (const auto& [octets, expected] : rows) {
        qvtest::DebugOutputCapture capture;
        qvtest::Datagram datagram(octets);
        tStatus status;
        EXPECT_EQ(tTLVFactory::createTLV(datagram.unit(), status), nullptr);
        EXPECT_EQ(status.code, kStatusUnsupported);
        const std::string traced = capture.text();
        EXPECT_EQ(traced.rfind("[qvptp3u--", 0), 0U) << traced;
        EXPECT_EQ(traced.substr(traced.find("] ") + 2), expected + "\n");  // and the line end
    }
}

}  // namespace
