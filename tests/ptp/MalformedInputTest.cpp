#include <gtest/gtest.h>

#include "ptp/TLVs/tFaultLogTLV.h"
#include "ptp/tManagementMessage.h"
#include "tests/ptp/CodecTestSupport.h"

// Datagrams that are cut, oversized or malformed, or that put a TLV's framing to the test:
// what the message factory makes of each. One row per case; the octets follow the standard's
// layout, field by field.

using namespace nQVPTP000;

namespace {

// A header: version 2 and messageLength 54 unless told otherwise (messageLength is never
// compared with the datagram), domain 0, no flags, source 001b21.fffe.010203-1, sequence 0x0102.
std::string header(const char* type, const char* version = "02", const char* length = "00 36") {
    return std::string(type) + " " + version + " | " + length +
           " | 00 | 00 | 00 00 | 00 00 00 00 00 00 00 00 | 00 00 00 00 |"
           "00 1B 21 FF FE 01 02 03 | 00 01 | 01 02 | 05 | 7F |";
}

// A GET to all ports of all clocks, up to its first TLV.
const std::string kGet = header("0D") + "FF FF FF FF FF FF FF FF FF FF | 00 | 00 | 00 | 00 |";
const std::string kNull = "00 01 | 00 02 | 00 00 |";  // NULL_MANAGEMENT

struct Row {
    const char* name;
    std::string octets;
    std::int32_t status;  // of the factory; 0 when it makes a message
    const char* kept;     // the management ids of the TLVs kept, "ext" for another TLV
};

const std::vector<Row>& malformedDatagrams() {
    static const std::vector<Row> rows = {
        // The header and the message bodies.
        {"cut inside the header", "0D 02 00 36 00 00 00 00 00 00", kStatusNoData, ""},
        {"Announce cut after 50 octets",
         header("0B") + "00 00 00 00 00 00 | 00 00 00 00 | 00 25 | 00 | 80 | 06 21", kStatusNoData,
         ""},
        {"version 1 Sync", header("00", "01") + "00 00 00 00 00 01 | 00 00 00 02",
         kStatusBadContent, ""},
        {"Pdelay_Req", header("02") + "00 00 00 00 00 00 00 00 00 00", kStatusUnsupported, ""},
        {"reserved type 4", header("04") + "00 00 00 00 00 00 00 00 00 00", kStatusUnsupported, ""},
        {"reserved actionField 5", header("0D") + "FF FF FF FF FF FF FF FF FF FF | 00 00 05 00",
         kStatusBadContent, ""},
        {"ACKNOWLEDGE", header("0D") + "FF FF FF FF FF FF FF FF FF FF | 00 00 04 00" + kNull, 0,
         "0000"},
        {"messageLength beyond the datagram",
         header("0D", "02", "03 E8") + "FF FF FF FF FF FF FF FF FF FF | 00 00 00 00 |" + kNull, 0,
         "0000"},
        // The TLV list.
        {"no TLV", kGet, 0, ""},
        {"TLV of another type skipped whole", kGet + "00 08 | 00 04 | 00 01 00 00 |" + kNull, 0,
         "0000"},
        {"unknown management id skipped with its data field",
         kGet + "00 01 | 00 08 | 20 14 |" + kNull, 0, ""},
        {"lengthField longer than the data field", kGet + "00 01 | 00 04 | 00 00 | 00 01 |" + kNull,
         0, "0000 0000"},
        {"lengthField below the managementId", kGet + "00 01 | 00 00 |" + kNull, 0, "0000"},
        {"datagram ending inside a TLV", kGet + kNull + "00 02 | 00 08 | 00 02", 0, "0000"},
        // The error status.
        {"error status too short for its fields", kGet + "00 02 | 00 04 | 00 02 20 00 |" + kNull, 0,
         "0000"},
        {"error status text cut short",
         kGet + "00 02 | 00 10 | 00 04 | 20 05 | 00 00 00 00 | 05 61 62", 0, "2005"},
        // Organization extensions.
        {"LXI NOT_DEFINED", kGet + "00 03 | 00 09 | 00 21 D6 | FF FF FF | 61 62 63", 0, "ext"},
        {"unknown organization skipped",
         kGet + "00 03 | 00 0C | 00 80 C2 | 00 00 01 |" + kNull + kNull, 0, "0000"},
        {"LXI lengthField too short for its identifiers",
         kGet + "00 03 | 00 04 | 00 21 D6 FF |" + kNull, 0, "0000"},
        // Lengths inside a TLV's data field.
        {"physicalAddressLength beyond its TLV",
         kGet + "00 01 00 0B 00 01 | 80 00 | 00 | FF FF | 01 02 03 04 |" + kNull, 0, "0000"},
        {"65535 fault records announced, one present",
         kGet +
             "00 01 00 14 00 06 | FF FF | 00 0E | 00 00 00 00 00 05 00 00 00 07 | 07 | 00 00 00 |" +
             kNull,
         0, "0000"},
        // Pads: each is counted in lengthField and consumed, so the next TLV is read whole.
        {"clock description of odd length",
         kGet +
             "00 01 00 1E 00 01 | 80 00 | 01 61 | 00 00 | 00 01 00 04 A9 FE 01 01 |"
             "00 00 00 | 00 | 00 | 00 | 00 | 00 00 00 00 00 00 | 00 |" +
             kNull,
         0, "0001 0000"},
        {"fault record of odd size",
         kGet +
             "00 01 00 16 00 06 | 00 01 | 00 0F | 00 00 00 00 00 00 00 00 00 00 |"
             "03 | 01 61 | 00 | 00 | 00 |" +
             kNull,
         0, "0006 0000"},
    };
    return rows;
}

std::string kept(const tPTPMessage& message) {
    std::string ids;
    tStatus status;
    for (std::size_t i = 0; i < message.getSuffix()->getCount(); ++i) {
        const auto* tlv = message.getSuffix()->getTLV(i, status);
        char id[8] = "ext";
        if (const auto* payload = dynamic_cast<const tManagementMessagePayload*>(tlv)) {
            std::snprintf(id, sizeof id, "%04x", payload->getManagementId());
        }
        ids += (ids.empty() ? "" : " ") + std::string(id);
    }
    return ids;
}

TEST(MalformedInputTest, EachDatagramDecodesAsTheStandardSays) {
    for (const Row& row : malformedDatagrams()) {
        SCOPED_TRACE(row.name);
        tStatus status;
        const auto message = qvtest::decodeMessage(row.octets, status);
        EXPECT_EQ(status.code, row.status);
        EXPECT_EQ(message == nullptr, row.status != 0);
        EXPECT_EQ(message != nullptr ? kept(*message) : "", row.kept);
    }
}

// A count of records with the octets of one: decoding stops at the first record cut short
// and takes no memory in proportion to the count.
TEST(MalformedInputTest, FaultRecordCountIsNoAllocationSize) {
    qvtest::Datagram datagram(
        "00 01 00 14 00 06 | FF FF | 00 0E | 00 00 00 00 00 05 00 00 00 07 | 07 | 00 00 00");
    tFaultLogTLV log;
    tStatus status;
    log.deserialize(datagram.unit(), status);
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_LE(log.getFaultRecords().capacity(), 2U);
}

}  // namespace
