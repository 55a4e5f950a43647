#include <gtest/gtest.h>

#include <string>
#include <typeinfo>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/tManagementIdTable.h"
#include "tests/ptp/CodecTestSupport.h"
#include "tests/support/FailingAllocation.h"

using namespace nQVPTP000;
using qvtest::Datagram;
using qvtest::encode;
using qvtest::traceText;

namespace {

// Every id that IEEE 1588-2008 gives a class in this codec, in the table's order.
constexpr std::uint16_t kIds[] = {0x0000, 0x0001, 0x0002, 0x0003, 0x0004, 0x0005, 0x0006, 0x0007,
                                  0x2000, 0x2001, 0x2002, 0x2003, 0x2004, 0x2005, 0x2006, 0x2007,
                                  0x2008, 0x2009, 0x200A, 0x200B, 0x200C, 0x200D, 0x200E, 0x200F,
                                  0x2010, 0x2011, 0x2012, 0x2013, 0x6000, 0x6001};

TEST(ManagementIdTableTest, OneRowPerIdWithItsDefaultObject) {
    ASSERT_EQ(managementIdTable().size(), std::size(kIds));
    for (std::uint16_t id : kIds) {
        const tManagementIdEntry* row = findManagementId(id);
        ASSERT_NE(row, nullptr) << id;
        const auto tlv = row->create();
        EXPECT_EQ(tlv->getManagementId(), id) << row->name;
        EXPECT_EQ(tlv->getTlvType(), tTLV::kManagement) << row->name;
        // lengthField agrees with what the object writes.
        EXPECT_EQ(std::size_t{tlv->getSize()} * 3 - 1, encode(*tlv).size()) << row->name;
    }
}

TEST(ManagementIdTableTest, CloneGivesAnEqualObjectOfTheSameClass) {
    for (const tManagementIdEntry& row : managementIdTable()) {
        const auto tlv = row.create();
        tStatus status;
        const auto copy = tlv->clone(status);
        ASSERT_NE(copy, nullptr) << row.name;
        const tTLV& original = *tlv;
        const tTLV& cloned = *copy;
        EXPECT_EQ(typeid(cloned), typeid(original)) << row.name;
        EXPECT_EQ(encode(cloned), encode(original)) << row.name;
        EXPECT_EQ(traceText(cloned), traceText(original)) << row.name;

        tStatus failed;
        failed.set(kStatusNoData, "x", "y", 1);
        EXPECT_EQ(tlv->clone(failed), nullptr) << row.name;
    }
}

TEST(ManagementIdTableTest, CloneKeepsAReceivedClockDescription) {
    Datagram datagram(
        "00 01 00 20 00 01 | 40 00 | 03 61 62 63 | 00 06 | 02 00 00 00 00 01 |"
        "00 01 00 04 A9 FE 01 01 | 01 02 03 | 00 | 00 | 00 | 01 7A |"
        "00 1B 19 00 01 00");
    tClockDescriptionTLV tlv;
    tStatus status;
    tlv.deserialize(datagram.unit(), status);
    ASSERT_TRUE(status.succeeded());
    const auto copy = tlv.clone(status);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(encode(*copy), encode(tlv));

    // A copy that cannot get memory for a text or the address is no copy at all: never one
    // that quietly lost them.
    for (unsigned nth = 1;; ++nth) {
        tStatus cloneStatus;
        qvtest::ScopedAllocationFailure failure(nth);
        const auto partial = tlv.clone(cloneStatus);
        if (!failure.triggered()) {
            ASSERT_NE(partial, nullptr);
            break;
        }
        EXPECT_EQ(partial, nullptr) << "allocation " << nth;
        EXPECT_EQ(cloneStatus.code, kStatusNoMemory) << "allocation " << nth;
    }
}

// A status that already holds an error turns decoding into a no-op: nothing changes.
TEST(ManagementIdTableTest, DecodingUnderAnErrorLeavesMembersUntouched) {
    const std::string noise =
        "00 01 00 40 | 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A"
        "5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A 5A";
    for (const tManagementIdEntry& row : managementIdTable()) {
        const auto tlv = row.create();
        const std::string before = encode(*tlv);
        Datagram datagram(noise);
        tStatus failed;
        failed.set(kStatusNoData, "x", "y", 1);
        tlv->deserialize(datagram.unit(), failed);
        EXPECT_EQ(encode(*tlv), before) << row.name;
        EXPECT_EQ(failed.code, kStatusNoData);
    }
}

}  // namespace
