#include "ptp/tProtocolDataUnit.h"

#include <gtest/gtest.h>

#include <vector>

#include "tests/support/Hex.h"

using nQVPTP000::tProtocolDataUnit;

namespace {

// Bit fields fill an octet from its high bit, across octet boundaries; a whole-octet field
// starts on the next octet; numbers are big-endian, 48-bit ones keep their low 48 bits.
TEST(tProtocolDataUnitTest, FieldsOfEveryWidthRoundTrip) {
    tStatus status;
    tProtocolDataUnit unit(status);
    unit.writeNibble(0xA, status);
    unit.writeBoolean(true, status);
    unit.writeUInteger16(0x1234, status);
    for (int i = 0; i < 6; ++i) {
        unit.writeBoolean(false, status);
    }
    unit.writeNibble(0xF, status);
    unit.writeInteger64(-2, status);
    unit.writeInteger8(-128, status);
    unit.writeUInteger48((1ULL << 48) | 0x010203040506ULL, status);
    EXPECT_EQ(qvtest::hexText(unit.getBuffer(), unit.getLength()),
              "A8 12 34 03 C0 FF FF FF FF FF FF FF FE 80 01 02 03 04 05 06");
    std::uint8_t nibble = 0;
    bool flag = false;
    std::uint16_t u16 = 0;
    std::int64_t i64 = 0;
    std::int8_t i8 = 0;
    std::uint64_t u48 = 0;
    unit.readNibble(nibble, status);
    unit.readBoolean(flag, status);
    unit.readUInteger16(u16, status);
    for (int i = 0; i < 6; ++i) {
        unit.readBoolean(flag, status);
    }
    unit.readNibble(nibble, status);
    unit.readInteger64(i64, status);
    unit.readInteger8(i8, status);
    unit.readUInteger48(u48, status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(u16, 0x1234);
    EXPECT_EQ(nibble, 0xF);
    EXPECT_EQ(i64, -2);
    EXPECT_EQ(i8, -128);
    EXPECT_EQ(u48, 0x010203040506ULL);
}

// A read past the data fails with -52012 and consumes and changes nothing; a unit grows and
// keeps what it holds.
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
