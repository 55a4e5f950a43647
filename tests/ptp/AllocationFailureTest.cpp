#include <gtest/gtest.h>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/tMessageSuffix.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/FailingAllocation.h"

// Memory that runs out at any allocation gives -52000 and never a half-built object.

using namespace nQVPTP000;

namespace {

// Fails the first, second, ... allocation of `attempt` until it runs without failing: every
// failed attempt gives nothing and -52000; the last gives what `check` accepts.
template <typename Attempt, typename Check>
void failEachAllocation(Attempt attempt, Check check) {
    for (unsigned nth = 1;; ++nth) {
        tStatus status;
        qvtest::ScopedAllocationFailure failure(nth);
        const auto made = attempt(status);
        if (!failure.triggered()) {
            const qvtest::AllocationFailurePause checking;
            ASSERT_TRUE(status.succeeded());
            return check(*made);
        }
        EXPECT_EQ(made, nullptr) << nth;
        EXPECT_EQ(status.code, kStatusNoMemory) << nth;
    }
}

TEST(AllocationFailureTest, NoMessageIsHalfBuilt) {
    const std::string datagram =
        "0D 02 00 3C 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 | 00 1B 21 FF FE 01 02 03 |"
        "00 01 | 01 02 | 04 | 7F | FF FF FF FF FF FF FF FF FF FF | 00 00 00 00 |"
        "00 01 00 02 00 00 | 00 01 00 02 00 00";  // two NULL_MANAGEMENT TLVs
    failEachAllocation(
        [&](tStatus& status) {
            const auto octets = [&] {
                qvtest::AllocationFailurePause pause;  // the octets as they arrive
                return std::make_unique<qvtest::Datagram>(datagram);
            }();
            return tPTPMessageFactory::createMessage(octets->unit(), status);
        },
        [](const tPTPMessage& m) { EXPECT_EQ(m.getSuffix()->getCount(), 2U); });
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
    failEachAllocation(
        [&](tStatus& cloneStatus) { return tlv.clone(cloneStatus); },
        [&](const tTLV& copy) { EXPECT_EQ(qvtest::encode(copy), qvtest::encode(tlv)); });
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

// A unit that could not grow keeps its data and refuses every later write.
TEST(AllocationFailureTest, UnitKeepsItsDataAndRefusesWrites) {
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
