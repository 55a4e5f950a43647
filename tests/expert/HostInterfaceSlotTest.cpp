#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <numeric>
#include <vector>

#include "qv1588/corbel.h"

namespace {

// The slots of virtual operations, from their member pointers: under the Itanium C++ ABI
// such a pointer holds one plus the operation's offset in the table of operations.
template <class... Methods>
std::vector<std::size_t> slotsOf(Methods... methods) {
    auto slotOf = [](auto method) {
        std::uintptr_t raw[2];
        static_assert(sizeof(method) == sizeof(raw));
        std::memcpy(raw, &method, sizeof raw);
        return (raw[0] - 1) / sizeof(void*);
    };
    return {slotOf(methods)...};
}

std::vector<std::size_t> slotsFrom(std::size_t first, std::size_t count) {
    std::vector<std::size_t> slots(count);
    std::iota(slots.begin(), slots.end(), first);
    return slots;
}

}  // namespace

// Hosts call by position: these are the positions they rely on.
TEST(HostInterfaceSlotTest, EveryOperationSitsInItsSlot) {
    using U = IUnknown;
    using B = IkxSysPropertyBag2;
    using E = IkxSysExpert2;
    using S = IkxSysEnumStringList;
    using T = IkxSysEnumPropertyTag;
    EXPECT_EQ(slotsOf(&U::QueryInterface, &U::AddRef, &U::Release), slotsFrom(0, 3));
    EXPECT_EQ(
        slotsOf(&B::EnumerateTags, &B::HasTag, &B::GetTagType, &B::RemoveTag, &B::RemoveAllTags,
                &B::SetBool, &B::SetLong, &B::SetULong, &B::SetDouble, &B::SetGUID, &B::SetString,
                &B::SetDateTime, &B::GetBool, &B::GetLong, &B::GetULong, &B::GetDouble, &B::GetGUID,
                &B::GetString, &B::GetDateTime, &B::Clone, &B::ClearChangedTags,
                &B::EnumerateChangedTags, &B::GetTimestamp, &B::SetTimestamp),
        slotsFrom(3, 24));
    EXPECT_EQ(slotsOf(&E::GetExpertGUID, &E::GetDisplayName, &E::GetVersionString, &E::GetShortName,
                      &E::Initialize, &E::Shutdown, &E::EnumerateItems, &E::GetItemNames,
                      &E::GetItem, &E::GetItemProperties, &E::ReservedOperation1,
                      &E::ReservedOperation2, &E::ValidateChanges, &E::ApplyChanges),
              slotsFrom(3, 14));
    EXPECT_EQ(slotsOf(&S::Next, &S::Skip, &S::Reset, &S::Clone), slotsFrom(3, 4));
    EXPECT_EQ(slotsOf(&T::Next, &T::Skip, &T::Reset, &T::Clone), slotsFrom(3, 4));
    EXPECT_EQ(slotsOf(&IkxSysItemCollector::AddItem), slotsFrom(5, 1));
}
