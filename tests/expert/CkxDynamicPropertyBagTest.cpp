#include "expert/CkxDynamicPropertyBag.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "tests/support/FailingAllocation.h"

using Bag = IkxSysPropertyBag2;
using Tag = kxSysAttributeTagID;
using Tags = std::vector<Tag>;
using BagPtr = CQVComPtr<Bag>;

namespace {

BagPtr newBag() {
    Bag* created = nullptr;
    EXPECT_EQ(CQVComObject<CkxDynamicPropertyBag>::CreateReferenced(&created), S_OK);
    return BagPtr::Adopt(created);
}

Tags changedTags(Bag& bag) {
    CQVComPtr<IkxSysEnumPropertyTag> tags;
    Tags found(1);
    EXPECT_EQ(bag.EnumerateChangedTags(tags.Receive()), S_OK);
    while (tags->Next(1, &found.back(), nullptr) == S_OK) {
        found.emplace_back();
    }
    found.pop_back();
    return found;
}

constexpr Tag kTag = 0xE005000;
constexpr GUID kGuid = {1, 2, 3, {4, 5, 6, 7, 8, 9, 10, 11}};
constexpr kxSysAttrTimestampUTC kStamp = {1, 2};

// clang-format off
using Access = HRESULT (*)(Bag&, Tag);
const std::pair<Access, Access> kTypes[] = {  // setter, getter; in type order 1 to 7
    {[](Bag& b, Tag t) { return b.SetBool(t, 7); }, [](Bag& b, Tag t) { BOOL v; return b.GetBool(t, &v); }},
    {[](Bag& b, Tag t) { return b.SetLong(t, -2); }, [](Bag& b, Tag t) { LONG v; return b.GetLong(t, &v); }},
    {[](Bag& b, Tag t) { return b.SetULong(t, 3); }, [](Bag& b, Tag t) { ULONG v; return b.GetULong(t, &v); }},
    {[](Bag& b, Tag t) { return b.SetDouble(t, 0.5); }, [](Bag& b, Tag t) { double v; return b.GetDouble(t, &v); }},
    {[](Bag& b, Tag t) { return b.SetGUID(t, &kGuid); }, [](Bag& b, Tag t) { GUID v; return b.GetGUID(t, &v); }},
    {[](Bag& b, Tag t) { return b.SetString(t, OLESTR("c")); },
     [](Bag& b, Tag t) { BSTR v = nullptr; const HRESULT r = b.GetString(t, &v); SysFreeString(v); return r; }},
    {[](Bag& b, Tag t) { return b.SetTimestamp(t, &kStamp); },
     [](Bag& b, Tag t) { kxSysAttrTimestampUTC v; return b.GetTimestamp(t, &v); }},
};
// clang-format on

}  // namespace

// A tag keeps its first type; a clone holds every value as changed and outlives its source.
TEST(CkxDynamicPropertyBagTest, TagsKeepTheirTypeAndClonesCopyThem) {
    BagPtr bag = newBag();
    for (std::size_t stored = 0; stored < std::size(kTypes); ++stored) {
        const Tag tag = kTag + static_cast<Tag>(stored);
        EXPECT_EQ(kTypes[stored].second(*bag, tag), CORBEL_E_TAG_NOT_FOUND);
        ASSERT_EQ(kTypes[stored].first(*bag, tag), S_OK);
        for (std::size_t other = 0; other < std::size(kTypes); ++other) {
            const HRESULT expected = other == stored ? S_OK : CORBEL_E_TYPE_MISMATCH;
            EXPECT_EQ(kTypes[other].second(*bag, tag), expected) << stored << " read as " << other;
            EXPECT_EQ(kTypes[other].first(*bag, tag), expected) << stored << " set as " << other;
        }
    }
    ASSERT_EQ(bag->ClearChangedTags(), S_OK);
    EXPECT_EQ(kTypes[1].first(*bag, kTag), CORBEL_E_TYPE_MISMATCH);  // kTag holds a bool
    EXPECT_EQ(bag->ClearChangedTags(), S_FALSE);  // and the refused setter changed nothing
    BagPtr copy;
    ASSERT_EQ(bag->Clone(copy.Receive()), S_OK);
    bag.reset();
    EXPECT_EQ(changedTags(*copy).size(), std::size(kTypes));
    for (std::size_t stored = 0; stored < std::size(kTypes); ++stored) {
        EXPECT_EQ(kTypes[stored].second(*copy, kTag + static_cast<Tag>(stored)), S_OK);
    }
}

TEST(CkxDynamicPropertyBagTest, ChangedTagsAscendOutliveRemovalAndClearOnlyOnRequest) {
    BagPtr bag = newBag();
    CQVComPtr<IkxSysEnumPropertyTag> values;
    EXPECT_EQ(bag->EnumerateChangedTags(values.Receive()), S_FALSE);
    ASSERT_EQ(bag->SetULong(0xE006000, 1), S_OK);
    ASSERT_EQ(bag->SetULong(0xE005000, 2), S_OK);
    ASSERT_EQ(bag->SetDouble(0x80000000, 1.0), S_OK);
    ASSERT_EQ(bag->RemoveTag(0xE006000), S_OK);
    EXPECT_EQ(changedTags(*bag), (Tags{0xE005000, 0xE006000, 0x80000000}));
    // Values are kept in signed tag order. An enumerator goes on after the tag it delivered
    // last whatever changed meanwhile, and keeps the bag alive.
    ASSERT_EQ(bag->EnumerateTags(values.Receive()), S_OK);
    ASSERT_EQ(values->Skip(1), S_OK);
    ASSERT_EQ(bag->RemoveTag(0xE005000), S_OK);
    ASSERT_EQ(bag->SetULong(0xE007000, 7), S_OK);
    EXPECT_EQ(bag->ClearChangedTags(), S_OK);
    EXPECT_EQ(bag->ClearChangedTags(), S_FALSE);
    bag.reset();
    Tag next[2] = {};
    ULONG fetched = 0;
    EXPECT_EQ(values->Next(2, next, &fetched), S_FALSE);
    EXPECT_EQ(Tags(next, next + fetched), Tags{0xE007000});
}

TEST(CkxDynamicPropertyBagTest, DateTimesConvertThroughLocalTimeFrom1970On) {
    // This program's tests all run in UTC; the run-time library reads its own copy of TZ.
#ifdef _WIN32
    _putenv_s("TZ", "UTC0");
    _tzset();
#else
    setenv("TZ", "UTC0", 1);
    tzset();
#endif
    const std::pair<std::vector<LONG>, std::int64_t> cases[] = {
        // fields, seconds since 1904 (0 for the all-zero timestamp)
        {{1903, 12, 31, 23, 59, 59}, 0},     {{1970, 1, 1, 0, 0, 0}, 0},
        {{1970, 1, 1, 0, 0, 1}, 2082844801}, {{2024, 2, 29, 12, 34, 56}, 3792054896},
        {{2024, 13, 1, 0, 0, 0}, 0},
    };
    for (const auto& [fields, seconds] : cases) {
        BagPtr bag = newBag();
        ASSERT_EQ(bag->SetDateTime(kTag, fields.data()), S_OK);
        kxSysAttrTimestampUTC stored{1, 1};
        ASSERT_EQ(bag->GetTimestamp(kTag, &stored), S_OK);
        EXPECT_EQ(stored.seconds, seconds) << fields[0];
        std::vector<LONG> back(6);
        ASSERT_EQ(bag->GetDateTime(kTag, back.data()), S_OK);
        EXPECT_EQ(back, seconds == 0 ? std::vector<LONG>(6, -1) : fields);
    }
}

// Every allocation of a setter, an enumeration and a clone fails once in turn: the call
// answers E_OUTOFMEMORY and the bag is as before.
TEST(CkxDynamicPropertyBagTest, ExhaustedMemoryAnswersOutOfMemoryAndChangesNothing) {
    using Operation = HRESULT (*)(Bag&);
    const Operation operations[] = {
        [](Bag& b) { return b.SetString(kTag + 1, OLESTR("clock")); },
        [](Bag& b) { return b.EnumerateTags(CQVComPtr<IkxSysEnumPropertyTag>().Receive()); },
        [](Bag& b) { return b.Clone(BagPtr().Receive()); },
    };
    for (const Operation operation : operations) {
        for (unsigned nth = 1;; ++nth) {
            BagPtr bag = newBag();
            ASSERT_EQ(bag->SetLong(kTag, 1), S_OK);
            qvtest::ScopedAllocationFailure failure(nth);
            const HRESULT result = operation(*bag);
            if (!failure.triggered()) {
                EXPECT_EQ(result, S_OK);
                break;
            }
            EXPECT_EQ(result, E_OUTOFMEMORY) << nth;
            EXPECT_EQ(changedTags(*bag), Tags{kTag});
        }
    }
}
