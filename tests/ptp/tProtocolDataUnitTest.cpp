#include "ptp/tProtocolDataUnit.h"

#include <gtest/gtest.h>

#include <vector>

using nQVPTP000::tProtocolDataUnit;

namespace {

// Fields of every width go through the unit in the tshark agreement tests; what those cannot
// show is a read past the data: it fails with -52012 and consumes and changes nothing. A unit
// grows and keeps what it holds.
TEST(tProtocolDataUnitTest, ReadsPastTheDataFailWhole) {
    tStatus status;
    tProtocolDataUnit unit(status);
    std::vector<std::uint8_t> octets(300, 0x42);
    unit.writeOctets(octets.data(), octets.size(), status);
    std::vector<std::uint8_t> back(301, 9);
    unit.readOctets(back.data(), back.size(), status);
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_EQ(back[0], 9);
    tStatus fresh;
    unit.readOctets(back.data(), 300, fresh);
    EXPECT_EQ(std::vector<std::uint8_t>(back.begin(), back.begin() + 300), octets);
    std::uint16_t wide = 0xBEEF;
    unit.readUInteger16(wide, fresh);
    EXPECT_EQ(fresh.code, kStatusNoData);
    EXPECT_EQ(wide, 0xBEEF);

    tStatus partial;
    unit.reset();
    unit.writeNibble(0xA, partial);
    unit.readOctet(back[0], partial);  // half an octet is no octet
    EXPECT_EQ(partial.code, kStatusNoData);
}

}  // namespace
