#include <gtest/gtest.h>

#include <string>

#include "ptp/tPTPMessage.h"
#include "tests/ptp/MessageTestSupport.h"

using namespace nQVPTP000;
using qvtest::decodeMessage;
using qvtest::encode;
using qvtest::hex;

namespace {

// A RESPONSE from 02-00-00-FF-FE-00-00-01:1 to 02-51-56-FF-FE-00-00-01:1, sequenceId 7, the
// given messageLength, up to its TLVs (48 octets).
std::string response(std::string_view length) {
    std::string text = "0D 02 00 ";
    text += length;
    text += " | 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 |";
    text += "02 00 00 FF FE 00 00 01 00 01 | 00 07 | 04 | 7F |";
    text += "02 51 56 FF FE 00 00 01 00 01 | 00 | 00 | 02 | 00 |";
    return text;
}

// Received TLVs whose framing disagrees with their fields, or that are malformed, and the
// datagram that the decoded message writes back: each TLV framed by its own fields, a
// malformed one left out, the ones after it kept.
struct Case {
    const char* name;
    std::string received;
    std::string written;
};

const Case kCases[] = {
    {"PRIORITY1 with two surplus octets",
     response("3A") + "00 01 00 06 20 05 | C8 00 | AA BB",  //
     response("38") + "00 01 00 04 20 05 | C8 00"},
    {"UTC_PROPERTIES with two surplus octets",
     response("3C") + "00 01 00 08 20 11 | 00 25 07 00 | 00 00",
     response("3A") + "00 01 00 06 20 11 | 00 25 07 00"},
    {"error status with four surplus octets",
     response("44") + "00 02 00 10 | 00 02 20 00 00 00 00 00 | 03 61 62 63 | 00 00 00 00",
     response("40") + "00 02 00 0C | 00 02 20 00 00 00 00 00 | 03 61 62 63"},
    {"error status cut inside its text by the datagram's end",
     response("44") + "00 02 00 10 | 00 02 20 00 00 00 00 00 | 03 61",
     response("3E") + "00 02 00 0A | 00 02 20 00 00 00 00 00 | 00 00"},
    // numberOfFaultRecords 1 | faultRecordLength 5, below the 14 octets of its fields
    {"FAULT_LOG with a short faultRecordLength, then PRIORITY1",
     response("50") + "00 01 00 14 00 06 | 00 01 | 00 05 | 00 00 00 00 00 00 00 00 00 00 |" +
         "07 | 00 | 00 | 00 |" + "00 01 00 04 20 05 | C8 00",
     response("38") + "00 01 00 04 20 05 | C8 00"},
    // ordinary clock | "IEEE 802.3" | a MAC address | protocol 1 claiming 18 octets | OUI |
    // reserved | three empty texts | profileIdentity: the address becomes unknown.
    {"CLOCK_DESCRIPTION with an 18-octet protocol address",
     response("6E") + "00 01 00 3A 00 01 | 80 00 | 0A 49 45 45 45 20 38 30 32 2E 33 |" +
         "00 06 00 1B 21 01 02 03 | 00 01 00 12 " +
         "01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E 0F 10 11 12 |" +
         "00 1B 21 | 00 | 00 | 00 | 00 | 00 1B 19 00 01 00",
     response("5C") + "00 01 00 28 00 01 | 80 00 | 0A 49 45 45 45 20 38 30 32 2E 33 |" +
         "00 06 00 1B 21 01 02 03 | FF FE 00 00 |" +
         "00 1B 21 | 00 | 00 | 00 | 00 | 00 1B 19 00 01 00"},
};

TEST(TLVWrittenBackTest, DecodedMessageAndCopiesOfItsTLVsAreWrittenFramedByTheirFields) {
    for (const Case& row : kCases) {
        tStatus status;
        const auto message = decodeMessage(row.received, status);
        ASSERT_NE(message, nullptr) << row.name << ": " << status.code;
        EXPECT_EQ(encode(*message), hex(row.written)) << row.name;
        const tMessageSuffix& suffix = *message->getSuffix();
        for (std::size_t i = 0; i < suffix.getCount(); ++i) {
            const tTLV& tlv = *suffix.getTLV(i, status);
            EXPECT_EQ(encode(*tlv.clone(status)), encode(tlv)) << row.name;
        }
    }
}

}  // namespace
