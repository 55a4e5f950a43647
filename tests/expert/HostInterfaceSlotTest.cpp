#include <gtest/gtest.h>

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <numeric>
#include <vector>

#include "qv1588/corbel.h"

namespace {

// The slot of a virtual operation, from its member pointer: under the Itanium C++ ABI such a
// pointer holds one plus the operation's offset in the table of operations.
template <class Method>
std::size_t slotOf(Method method) {
    std::uintptr_t raw[2];
    static_assert(sizeof(method) == sizeof(raw));
    std::memcpy(raw, &method, sizeof raw);
    return (raw[0] - 1) / sizeof(void*);
}

// The operations sit in consecutive slots from `first` on.
template <class... Methods>
void expectSlotsFrom(std::size_t first, Methods... methods) {
    std::vector<std::size_t> expected(sizeof...(methods));
    std::iota(expected.begin(), expected.end(), first);
    EXPECT_EQ(std::vector<std::size_t>{slotOf(methods)...}, expected);
}

}  // namespace

// Hosts call by position: these are the positions they rely on.
TEST(HostInterfaceSlotTest, EveryOperationSitsInItsSlot) {
    using U = IUnknown;
    using B = IkxSysPropertyBag2;
    using E = IkxSysExpert2;
    using S = IkxSysEnumStringList;
    using T = IkxSysEnumPropertyTag;
    // The cast picks the virtual one: Windows' IUnknown adds a template QueryInterface.
    expectSlotsFrom(0, static_cast<HRESULT (KXSYS_CALL U::*)(REFIID, void**)>(&U::QueryInterface),
                    &U::AddRef, &U::Release);
    expectSlotsFrom(3, &B::EnumerateTags, &B::HasTag, &B::GetTagType, &B::RemoveTag,
                    &B::RemoveAllTags, &B::SetBool, &B::SetLong, &B::SetULong, &B::SetDouble,
                    &B::SetGUID, &B::SetString, &B::SetDateTime, &B::GetBool, &B::GetLong,
                    &B::GetULong, &B::GetDouble, &B::GetGUID, &B::GetString, &B::GetDateTime,
                    &B::Clone, &B::ClearChangedTags, &B::EnumerateChangedTags, &B::GetTimestamp,
                    &B::SetTimestamp);
    expectSlotsFrom(3, &E::GetExpertGUID, &E::GetDisplayName, &E::GetVersionString,
                    &E::GetShortName, &E::Initialize, &E::Shutdown, &E::EnumerateItems,
                    &E::GetItemNames, &E::GetItem, &E::GetItemProperties, &E::ReservedOperation1,
                    &E::ReservedOperation2, &E::ValidateChanges, &E::ApplyChanges);
    expectSlotsFrom(3, &S::Next, &S::Skip, &S::Reset, &S::Clone);
    expectSlotsFrom(3, &T::Next, &T::Skip, &T::Reset, &T::Clone);
    expectSlotsFrom(5, &IkxSysItemCollector::AddItem);
}
