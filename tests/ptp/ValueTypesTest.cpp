#include <gtest/gtest.h>

#include <cstdint>
#include <limits>

#include "ptp/tClockIdentity.h"
#include "ptp/tClockQuality.h"
#include "ptp/tPTPText.h"
#include "ptp/tPortAddress.h"
#include "ptp/tPortIdentity.h"
#include "ptp/tTimeInterval.h"
#include "ptp/tTimestamp.h"
#include "tests/ptp/PduTestSupport.h"
#include "tests/support/FailingAllocation.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::traceText;

namespace {

const std::uint8_t kIdentity[8] = {0x01, 0x23, 0x45, 0x67, 0x89, 0xAB, 0xCD, 0xEF};

TEST(tClockIdentityTest, WireFormAndDump) {
    const tClockIdentity identity(kIdentity);
    EXPECT_EQ(encode(identity), qvtest::hex("01 23 45 67 89 AB CD EF"));
    EXPECT_EQ(traceText(identity), "0123456789abcdef");
    EXPECT_EQ(encode(allOnesClockIdentity()), qvtest::hex("FF FF FF FF FF FF FF FF"));
    EXPECT_EQ(encode(tClockIdentity()), qvtest::hex("00 00 00 00 00 00 00 00"));
}

TEST(tPortIdentityTest, EqualityNeedsBothParts) {
    const tPortIdentity one(tClockIdentity(kIdentity), 1);
    EXPECT_EQ(one, tPortIdentity(tClockIdentity(kIdentity), 1));
    EXPECT_FALSE(one == tPortIdentity(tClockIdentity(kIdentity), 2));
    EXPECT_FALSE(one == tPortIdentity(allOnesClockIdentity(), 1));
}

TEST(tPortIdentityTest, WireFormDumpAndRoundTrip) {
    const tPortIdentity port(tClockIdentity(kIdentity), 0x0102);
    EXPECT_EQ(encode(port), qvtest::hex("01 23 45 67 89 AB CD EF | 01 02"));
    EXPECT_EQ(traceText(port), "clockIdentity: 0123456789abcdef portNumber: 258\n");
    EXPECT_EQ(encode(allOnesPortIdentity()), qvtest::hex("FF FF FF FF FF FF FF FF | FF FF"));

    Datagram datagram("01 23 45 67 89 AB CD EF 01 02");
    tStatus status;
    tPortIdentity back;
    back.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(back, port);
}

TEST(tPortIdentityTest, SettersRespectAnEarlierError) {
    tPortIdentity port;
    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    port.setPortNumber(5, failed);
    port.setClockIdentity(allOnesClockIdentity(), failed);
    EXPECT_EQ(port, tPortIdentity());
}

TEST(tClockQualityTest, DefaultWireFormAndDump) {
    const tClockQuality quality;
    EXPECT_EQ(encode(quality), qvtest::hex("BB FE FF FF"));
    EXPECT_EQ(traceText(quality),
              "clockClass: 187 clockAccuracy: 0xfe offsetScaledLogVariance: 0xffff");
}

TEST(tClockQualityTest, AccuracyOctetWidensIntoItsField) {
    Datagram datagram("06 21 4E 5D");
    tStatus status;
    tClockQuality quality;
    quality.deserialize(datagram.unit(), status);
    EXPECT_EQ(quality.clockClass, 6);
    EXPECT_EQ(quality.clockAccuracy, 0x21U);
    EXPECT_EQ(quality.offsetScaledLogVariance, 0x4E5D);
}

TEST(tTimestampTest, WireFormDumpAndRoundTrip) {
    EXPECT_EQ(encode(tTimestamp(1, 2)), qvtest::hex("00 00 00 00 00 01 | 00 00 00 02"));
    EXPECT_EQ(traceText(tTimestamp(1700000000, 5)), "secondsField: 1700000000 nanosecondsField: 5");

    Datagram datagram("00 01 00 00 00 00 | 3B 9A C9 FF");
    tStatus status;
    tTimestamp back;
    back.deserialize(datagram.unit(), status);
    std::uint64_t seconds = 0;
    std::uint32_t nanoseconds = 0;
    back.getValue(seconds, nanoseconds);
    EXPECT_EQ(seconds, 1ULL << 32);
    EXPECT_EQ(nanoseconds, 999999999U);
}

TEST(tTimeIntervalTest, ScalesAndSaturates) {
    EXPECT_EQ(encode(tTimeInterval(1)), qvtest::hex("00 00 00 00 00 01 00 00"));
    EXPECT_EQ(tTimeInterval(std::int64_t{1} << 47).getScaledNanoseconds(),
              std::numeric_limits<std::int64_t>::max());
    EXPECT_EQ(tTimeInterval((std::int64_t{1} << 47) - 1).getNanoseconds(),
              (std::int64_t{1} << 47) - 1);
    EXPECT_EQ(tTimeInterval(-(std::int64_t{1} << 47)).getNanoseconds(), -(std::int64_t{1} << 47));
    EXPECT_EQ(tTimeInterval(-(std::int64_t{1} << 47) - 1).getScaledNanoseconds(),
              std::numeric_limits<std::int64_t>::min());
    EXPECT_EQ(traceText(tTimeInterval(-1)), "scaledNanoseconds: -65536");
}

TEST(tTimeIntervalTest, ToNanosecondsRoundsTowardZero) {
    tTimeInterval interval;
    interval.setScaledNanoseconds(-1);
    EXPECT_EQ(interval.getNanoseconds(), 0);
    interval.setScaledNanoseconds(-65537);
    EXPECT_EQ(interval.getNanoseconds(), -1);
}

TEST(tPortAddressTest, Ipv4WireFormSizeAndDump) {
    const std::uint8_t ip[4] = {10, 0, 0, 1};
    tStatus status;
    const tPortAddress address(1, 4, ip, status);
    EXPECT_EQ(encode(address), qvtest::hex("00 01 | 00 04 | 0A 00 00 01"));
    EXPECT_EQ(address.getSize(), 8);
    EXPECT_EQ(traceText(address),
              "networkProtocol: 0x0001 addressLength: 4 addressField: 0a000001");
    EXPECT_EQ(encode(tPortAddress()), qvtest::hex("FF FE 00 00"));
}

TEST(tPortAddressTest, OverlongReceivedAddressIsSkippedAndBecomesUnknown) {
    const std::uint8_t ip[4] = {192, 168, 1, 2};
    tStatus status;
    tPortAddress address(1, 4, ip, status);
    // networkProtocol 3, addressLength 17, then 17 octets: more than any standard address.
    Datagram datagram("00 03 00 11 00 01 02 03 04 05 06 07 08 09 0A 0B 0C 0D 0E 0F 10");
    address.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(encode(address), qvtest::hex("FF FE 00 00"));
}

TEST(tPortAddressTest, SixteenOctetAddressRoundTrips) {
    Datagram datagram("00 02 00 10 FE 80 00 00 00 00 00 00 02 11 22 FF FE 33 44 55");
    tStatus status;
    tPortAddress address;
    address.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(encode(address),
              qvtest::hex("00 02 00 10 FE 80 00 00 00 00 00 00 02 11 22 FF FE 33 44 55"));
}

// No octets make an empty address; more than 16 are refused.
TEST(tPortAddressTest, NullAddressIsEmptyAndOverlongGivenAddressIsRefused) {
    tStatus status;
    EXPECT_EQ(tPortAddress(1, 4, nullptr, status).getAddressLength(), 0);
    EXPECT_TRUE(status.succeeded());
    const std::uint8_t octets[20] = {};
    const tPortAddress address(1, 20, octets, status);
    EXPECT_EQ(status.code, kStatusUnsupported);
    EXPECT_EQ(address.getAddressLength(), 0);
}

TEST(tPTPTextTest, WireFormAndSize) {
    tStatus status;
    const tPTPText abc("abc", status);
    EXPECT_EQ(encode(abc), qvtest::hex("03 61 62 63"));
    EXPECT_EQ(abc.getSize(), 4);
    EXPECT_EQ(traceText(abc), "abc");
    const tPTPText empty;
    EXPECT_EQ(encode(empty), qvtest::hex("00"));
    EXPECT_EQ(empty.getSize(), 1);
    EXPECT_EQ(empty.getTextField(), nullptr);
}

TEST(tPTPTextTest, TextOf256OctetsIsRefused) {
    tStatus status;
    const tPTPText tooLong(std::string(256, 'x').c_str(), status);
    EXPECT_EQ(status.code, kStatusUnsupported);
    EXPECT_EQ(tooLong.getLengthField(), 0);

    tStatus fine;
    const tPTPText longest(std::string(255, 'x').c_str(), fine);
    EXPECT_TRUE(fine.succeeded());
    EXPECT_EQ(longest.getLengthField(), 255);
}

TEST(tPTPTextTest, ShortDataKeepsThePreviousText) {
    tStatus status;
    tPTPText text("keep", status);
    Datagram datagram("05 61 62 63");
    text.deserialize(datagram.unit(), status);
    EXPECT_EQ(status.code, kStatusNoData);
    EXPECT_EQ(text.view(), "keep");
}

TEST(tPTPTextTest, DecodeReplacesAndEmptyDecodeClears) {
    tStatus status;
    tPTPText text("old", status);
    Datagram datagram("02 68 69 00");
    text.deserialize(datagram.unit(), status);
    EXPECT_EQ(text.view(), "hi");
    text.deserialize(datagram.unit(), status);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(text.getLengthField(), 0);
}

TEST(tPTPTextTest, CopiesAreDeepAndSetTextKeepsTextOnError) {
    tStatus status;
    tPTPText original("one", status);
    tPTPText copy(original);
    original.setText(reinterpret_cast<const std::uint8_t*>("two"), 3, status);
    EXPECT_EQ(copy.view(), "one");
    EXPECT_EQ(original.view(), "two");

    tStatus failed;
    failed.set(kStatusNoData, "x", "y", 1);
    original.setText(reinterpret_cast<const std::uint8_t*>("three"), 5, failed);
    EXPECT_EQ(original.view(), "two");
}

TEST(tPTPTextTest, NoMemoryForTheTextRecordsAndKeepsTheOldText) {
    tStatus status;
    tPTPText text("old", status);
    {
        qvtest::ScopedAllocationFailure failure(1);
        text.setText(reinterpret_cast<const std::uint8_t*>("longer"), 6, status);
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    EXPECT_EQ(text.view(), "old");
}

}  // namespace
