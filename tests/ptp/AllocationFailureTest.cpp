#include <gtest/gtest.h>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tMessageSuffix.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/FailingAllocation.h"

// Memory that runs out at any allocation gives -52000 and never a half-built object.

using namespace nQVPTP000;

namespace {

TEST(AllocationFailureTest, NoMessageIsHalfBuilt) {
    const std::string datagram =
        "0D 02 00 3C 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 | 00 1B 21 FF FE 01 02 03 |"
        "00 01 | 01 02 | 04 | 7F | FF FF FF FF FF FF FF FF FF FF | 00 00 00 00 |"
        "00 01 00 02 00 00 | 00 01 00 02 00 00";  // two NULL_MANAGEMENT TLVs
    for (unsigned nth = 1;; ++nth) {
        tStatus status;
        qvtest::Datagram octets(datagram);
        std::unique_ptr<tPTPMessage> message;
        qvtest::ScopedAllocationFailure failure(nth);
        message = tPTPMessageFactory::createMessage(octets.unit(), status);
        if (!failure.triggered()) {
            ASSERT_TRUE(status.succeeded());
            EXPECT_EQ(message->getSuffix()->getCount(), 2U);
            break;
        }
        EXPECT_EQ(message, nullptr) << nth;
        EXPECT_EQ(status.code, kStatusNoMemory) << nth;
    }
}

// A copy that cannot get memory for a text or the address is no copy at all.
TEST(AllocationFailureTest, NoCopyLosesAText) {
    qvtest::Datagram datagram(
        "00 01 00 20 00 01 | 40 00 | 03 61 62 63 | 00 06 | 02 00 00 00 00 01 |"
        "00 01 00 04 A9 FE 01 01 | 01 02 03 | 00 | 00 | 00 | 01 7A | 00 1B 19 00 01 00");
    tClockDescriptionTLV tlv;
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded());
    for (unsigned nth = 1;; ++nth) {
        tStatus cloneStatus;
        std::unique_ptr<tTLV> copy;
        bool triggered = false;
        {
            qvtest::ScopedAllocationFailure failure(nth);
            copy = tlv.clone(cloneStatus);
            triggered = failure.triggered();
        }
        if (!triggered) {
            EXPECT_EQ(qvtest::encode(*copy), qvtest::encode(tlv));
            break;
        }
        EXPECT_EQ(copy, nullptr) << nth;
        EXPECT_EQ(cloneStatus.code, kStatusNoMemory) << nth;
    }
}

// A TLV lost for want of memory is reported again when the list is cleared.
TEST(AllocationFailureTest, LostTLVIsRemembered) {
    tMessageSuffix suffix;
    tStatus status;
    suffix.addTLV(std::make_unique<tNullManagementTLV>(), status);
    auto second = std::make_unique<tNullManagementTLV>();
    {
        qvtest::ScopedAllocationFailure failure(1);  // the room for two elements
        suffix.addTLV(std::move(second), status);
        ASSERT_TRUE(failure.triggered());
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    EXPECT_EQ(suffix.getCount(), 1U);
    tStatus later;
    suffix.clear(later);
    EXPECT_EQ(later.code, kStatusNoMemory);
}

// A unit without its buffer, or one that could not grow, refuses every later write.
TEST(AllocationFailureTest, UnitKeepsItsDataAndRefusesWrites) {
    tStatus status;
    std::unique_ptr<tProtocolDataUnit> unbuffered;
    {
        qvtest::ScopedAllocationFailure failure(2);  // the unit first, then its buffer
        unbuffered = std::make_unique<tProtocolDataUnit>(status);
    }
    EXPECT_EQ(status.code, kStatusNoMemory);
    tStatus clean;
    unbuffered->writeOctet(1, clean);
    EXPECT_EQ(clean.code, kStatusNoMemory);

    tStatus grown;
    tProtocolDataUnit unit(grown);
    std::vector<std::uint8_t> octets(256, 0xAB);
    unit.writeOctets(octets.data(), octets.size(), grown);
    {
        qvtest::ScopedAllocationFailure failure(1);
        unit.writeOctet(1, grown);
    }
    EXPECT_EQ(grown.code, kStatusNoMemory);
    EXPECT_EQ(unit.getLength(), 256U);
    EXPECT_EQ(unit.getBuffer()[255], 0xAB);
    tStatus again;
    unit.writeBoolean(true, again);
    EXPECT_EQ(again.code, kStatusNoMemory);
}

}  // namespace
