#include <gtest/gtest.h>

#include "ptp/tTLVFactory.h"
#include "tests/ptp/CodecTestSupport.h"

// Reserved bits and octets are ignored when read and written as zero, and a fault record
// is read to the length it gives.

using namespace nQVPTP000;

namespace {

TEST(ReservedBitsTest, IgnoredWhenReadAndWrittenAsZero) {
    const std::pair<const char*, const char*> rows[] = {
        // received | written
        {"00 01 00 04 20 05 | C8 | 77", "00 01 00 04 20 05 | C8 | 00"},  // PRIORITY1
        {"00 01 00 04 20 0C | F2 | 00", "00 01 00 04 20 0C | 02 | 00"},  // VERSION_NUMBER
        {"00 01 00 04 20 13 | FF | A0", "00 01 00 04 20 13 | 08 | A0"},  // TIMESCALE_PROPERTIES
        {"00 01 00 06 20 11 | 00 25 | FF | 00", "00 01 00 06 20 11 | 00 25 | 07 | 00"},
        {"00 01 00 06 20 03 | FF FE | FF | 20", "00 01 00 06 20 03 | FF FE | 3F | 20"},
        // DEFAULT_DATA_SET: flags, and the reserved octets after them and the domain
        {"00 01 00 16 20 00 | FF | 55 | 00 01 | 80 | F8 FE FF FF | 80 | 01 02 03 04 05 06 07 08 |"
         "00 | 66",
         "00 01 00 16 20 00 | 03 | 00 | 00 01 | 80 | F8 FE FF FF | 80 | 01 02 03 04 05 06 07 08 |"
         "00 | 00"},
        // FAULT_LOG: a record 2 octets longer than its fields; they are skipped
        {"00 01 00 16 00 06 | 00 01 | 00 10 | 00 00 00 00 00 00 00 00 00 00 | 07 | 00 00 00 |"
         "AB CD",
         "00 01 00 16 00 06 | 00 01 | 00 10 | 00 00 00 00 00 00 00 00 00 00 | 07 | 00 00 00 |"
         "00 00"},
    };
    for (const auto& [received, written] : rows) {
        SCOPED_TRACE(received);
        qvtest::Datagram datagram(received);
        tStatus status;
        const auto tlv = tTLVFactory::createTLV(datagram.unit(), status);
        ASSERT_NE(tlv, nullptr) << status.code;
        EXPECT_EQ(qvtest::encode(*tlv), qvtest::hex(written));
    }
}

}  // namespace
