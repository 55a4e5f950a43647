#include <gtest/gtest.h>

#include <string>

#include "tests/ptp/CodecTestSupport.h"

using namespace nQVPTP000;

namespace {

// A RESPONSE from 02-00-00-FF-FE-00-00-01:1 to 02-51-56-FF-FE-00-00-01:1, sequenceId 7, the
// given messageLength octet, up to its TLVs (48 octets).
std::string response(std::string_view length) {
    return "0D 02 00 " + std::string(length) +
           " | 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 | 02 00 00 FF FE 00 00 01 00 01 |"
           "00 07 04 7F | 02 51 56 FF FE 00 00 01 00 01 | 00 00 02 00 |";
}

// Received TLVs whose lengthField disagrees with their fields, or that are malformed, and
// the datagram that the decoded message writes back: each TLV framed by its own fields, a
// malformed one left out and the ones after it kept.
const std::pair<std::string, std::string> kCases[] = {
    {response("3A") + "00 01 00 06 20 05 | C8 00 | AA BB",  // PRIORITY1
     response("38") + "00 01 00 04 20 05 | C8 00"},
    // An error status that the datagram's end cuts inside its text keeps its refusal.
    {response("44") + "00 02 00 10 | 00 02 20 00 00 00 00 00 | 03 61",
     response("3E") + "00 02 00 0A | 00 02 20 00 00 00 00 00 | 00 00"},
    // FAULT_LOG, one record whose faultRecordLength 5 is below its fields' 14, then PRIORITY1
    {response("50") + "00 01 00 14 00 06 | 00 01 | 00 05 | 00 00 00 00 00 00 00 00 00 00 |" +
         "07 | 00 00 00 | 00 01 00 04 20 05 | C8 00",
     response("38") + "00 01 00 04 20 05 | C8 00"},
    // CLOCK_DESCRIPTION whose protocol address (protocol 1) claims 18 octets: it is unknown.
    {response("6E") + "00 01 00 3A 00 01 | 80 00 | 0A 49 45 45 45 20 38 30 32 2E 33 |" +
         "00 06 00 1B 21 01 02 03 | 00 01 00 12 01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E" +
         "0F 10 11 12 | 00 1B 21 00 | 00 | 00 | 00 | 00 1B 19 00 01 00",
     response("5C") + "00 01 00 28 00 01 | 80 00 | 0A 49 45 45 45 20 38 30 32 2E 33 |" +
         "00 06 00 1B 21 01 02 03 | FF FE 00 00 | 00 1B 21 00 | 00 | 00 | 00 | 00 1B 19 00 01 00"},
};

TEST(TLVWrittenBackTest, DecodedMessageAndCopiesOfItsTLVsAreFramedByTheirFields) {
    for (const auto& [received, written] : kCases) {
        tStatus status;
        const auto message = qvtest::decodeMessage(received, status);
        ASSERT_NE(message, nullptr) << received << ": " << status.code;
        EXPECT_EQ(qvtest::encode(*message), qvtest::hex(written)) << received;
        const tTLV& first = *message->getSuffix()->getTLV(0, status);
        EXPECT_EQ(qvtest::encode(*first.clone(status)), qvtest::encode(first)) << received;
    }
}

}  // namespace
