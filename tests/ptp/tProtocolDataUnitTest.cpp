#include "ptp/tProtocolDataUnit.h"

#include <gtest/gtest.h>

#include <vector>

#include "tests/support/FailingAllocation.h"
#include "tests/support/Hex.h"

using nQVPTP000::tProtocolDataUnit;
using qvtest::hexText;

namespace {

std::string contents(const tProtocolDataUnit& unit) {
    return hexText(unit.getBuffer(), static_cast<std::size_t>(unit.getLength()));
}

class tProtocolDataUnitTest : public ::testing::Test {
  protected:
    tStatus status;
    tProtocolDataUnit unit{status};
};

// Bit fields fill an octet from its high bit; a whole-octet field starts on the next octet.
TEST_F(tProtocolDataUnitTest, BitFieldsPackFromTheHighBit) {
    unit.writeNibble(0xA, status);
    unit.writeNibble(0x5, status);
    unit.writeBoolean(true, status);
    unit.writeUInteger16(0x1234, status);
    for (int i = 0; i < 7; ++i) {
        unit.writeBoolean(false, status);
    }
    unit.writeBoolean(true, status);
    EXPECT_EQ(contents(unit), "A5 80 12 34 01");
    EXPECT_EQ(unit.getLength(), 5U);
}

TEST_F(tProtocolDataUnitTest, BigEndianNumbersOfEveryWidth) {
    unit.writeUInteger32(0x01020304, status);
    unit.writeInteger64(-2, status);
    unit.writeInteger16(-2, status);
    unit.writeInteger8(-128, status);
    EXPECT_EQ(contents(unit), "01 02 03 04 FF FF FF FF FF FF FF FE FF FE 80");
    std::uint32_t u32 = 0;
    std::int64_t i64 = 0;
    std::int16_t i16 = 0;
    std::int8_t i8 = 0;
    unit.readUInteger32(u32, status);
    unit.readInteger64(i64, status);
    unit.readInteger16(i16, status);
    unit.readInteger8(i8, status);
    EXPECT_EQ(u32, 0x01020304U);
    EXPECT_EQ(i64, -2);
    EXPECT_EQ(i16, -2);
    EXPECT_EQ(i8, -128);
    EXPECT_TRUE(status.succeeded());
}

TEST_F(tProtocolDataUnitTest, UInteger48KeepsLow48Bits) {
    unit.writeUInteger48((1ULL << 48) | 1ULL, status);
    EXPECT_EQ(contents(unit), "00 00 00 00 00 01");
    std::uint64_t value = 77;
    unit.readUInteger48(value, status);
    EXPECT_EQ(value, 1U);
}

TEST_F(tProtocolDataUnitTest, FieldStraddlingAnOctetBoundary) {
    for (int i = 0; i < 6; ++i) {
        unit.writeBoolean(false, status);
    }
    unit.writeNibble(0xF, status);
    EXPECT_EQ(contents(unit), "03 C0");
    bool flag = true;
    for (int i = 0; i < 6; ++i) {
        unit.readBoolean(flag, status);
    }
    std::uint8_t nibble = 0;
    unit.readNibble(nibble, status);
    EXPECT_EQ(nibble, 0xF);
    EXPECT_TRUE(status.succeeded());
}

TEST_F(tProtocolDataUnitTest, GrowsByDoublingAndKeepsContents) {
    std::vector<std::uint8_t> octets(300);
    for (std::size_t i = 0; i < octets.size(); ++i) {
        octets[i] = static_cast<std::uint8_t>(i);
    }
    unit.writeOctets(octets.data(), octets.size(), status);
    EXPECT_EQ(unit.getCapacity(), 512U);
    std::vector<std::uint8_t> back(300);
    unit.readOctets(back.data(), back.size(), status);
    EXPECT_EQ(back, octets);
}

TEST_F(tProtocolDataUnitTest, ShortReadRecordsNoDataBeforeConsumingAnything) {
    unit.writeOctet(0x42, status);
    std::uint16_t wide = 0xBEEF;
    unit.readUInteger16(wide, status);
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_STREQ(status.component, "qvptp3u");
    EXPECT_STREQ(status.file, "tProtocolDataUnit.cpp");
    EXPECT_EQ(wide, 0xBEEF);

    tStatus fresh;
    std::uint8_t octet = 0;
    unit.readOctet(octet, fresh);
    EXPECT_TRUE(fresh.succeeded());
    EXPECT_EQ(octet, 0x42);
}

TEST_F(tProtocolDataUnitTest, ReadsOfAnEmptyOrResetUnitFail) {
    bool flag = false;
    unit.readBoolean(flag, status);
    EXPECT_EQ(status.code, kStatusNoData);

    tStatus second;
    unit.writeUInteger32(1, second);
    unit.reset();
    EXPECT_EQ(unit.getLength(), 0U);
    std::uint8_t octet = 0;
    unit.readOctet(octet, second);
    EXPECT_EQ(second.code, kStatusNoData);
}

TEST_F(tProtocolDataUnitTest, OctetArrayPastTheDataIsRefusedWhole) {
    unit.writeOctet(1, status);
    unit.writeOctet(2, status);
    std::uint8_t three[3] = {9, 9, 9};
    unit.readOctets(three, 3, status);
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_EQ(three[0], 9);
}

TEST_F(tProtocolDataUnitTest, PartialOctetIsNotReadableAsWholeOctet) {
    unit.writeNibble(0xA, status);
    std::uint8_t octet = 0;
    unit.readOctet(octet, status);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST_F(tProtocolDataUnitTest, NothingChangesOnceTheStatusHoldsAnError) {
    unit.writeOctet(0x11, status);
    tStatus failed;
    failed.set(kStatusSocketError, "x", "y", 1);
    unit.writeUInteger32(0xFFFFFFFF, failed);
    unit.writeBoolean(true, failed);
    EXPECT_EQ(contents(unit), "11");

    std::uint8_t octet = 0x55;
    unit.readOctet(octet, failed);
    EXPECT_EQ(octet, 0x55);
    EXPECT_EQ(failed.code, kStatusSocketError);
}

TEST(tProtocolDataUnitMemoryTest, FailedConstructionRefusesWritesEvenWithACleanStatus) {
    tStatus status;
    std::unique_ptr<tProtocolDataUnit> unit;
    {
        qvtest::ScopedAllocationFailure failure(2);  // the unit first, then its buffer
        unit = std::make_unique<tProtocolDataUnit>(status);
        ASSERT_TRUE(failure.triggered());
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    EXPECT_EQ(unit->getCapacity(), 0U);

    tStatus clean;
    unit->writeOctet(1, clean);
    EXPECT_EQ(clean.code, kStatusNoMemory);
    tStatus again;
    unit->writeBoolean(true, again);
    EXPECT_EQ(again.code, kStatusNoMemory);
    EXPECT_EQ(unit->getLength(), 0U);
}

TEST(tProtocolDataUnitMemoryTest, FailedGrowthRecordsNoMemoryAndKeepsTheData) {
    tStatus status;
    tProtocolDataUnit unit(status);
    std::vector<std::uint8_t> octets(256, 0xAB);
    unit.writeOctets(octets.data(), octets.size(), status);
    {
        qvtest::ScopedAllocationFailure failure(1);
        unit.writeOctet(1, status);
        ASSERT_TRUE(failure.triggered());
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    EXPECT_EQ(unit.getLength(), 256U);
    EXPECT_EQ(unit.getBuffer()[255], 0xAB);

    tStatus clean;
    unit.writeOctet(1, clean);
    EXPECT_EQ(clean.code, kStatusNoMemory);
}

}  // namespace
