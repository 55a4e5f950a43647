#include "expert/CkxDynamicPropertyBag.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string>

#include "platform/BStr.h"
#include "tests/expert/HostObjectsTestSupport.h"
#include "tests/support/FailingAllocation.h"

using namespace qvtest;
using Bag = IkxSysPropertyBag2;
using Tag = kxSysAttributeTagID;

namespace {

constexpr Tag kTag = 0xE005000;
constexpr GUID kGuid = {
    0x7B913AC1, 0x977C, 0x404B, {0x93, 0x13, 0x17, 0x78, 0xC1, 0xDC, 0xA6, 0xBA}};
// 2024-02-29 12:34:56.5 UTC.
constexpr kxSysAttrTimestampUTC kStamp = {0x8000000000000000u,
                                          1709210096 + std::int64_t{2082844800}};

// A getter's result, or E_FAIL when it succeeded with another value than its setter stored.
HRESULT expectValue(HRESULT result, bool same) {
    return result == S_OK && !same ? E_FAIL : result;
}

struct TypeCase {
    ULONG type;
    HRESULT (*set)(Bag&, Tag);
    HRESULT (*get)(Bag&, Tag);
};

const TypeCase kTypes[] = {
    {1, [](Bag& b, Tag t) { return b.SetBool(t, 7); },
     [](Bag& b, Tag t) {
         BOOL v = 0;
         const HRESULT r = b.GetBool(t, &v);
         return expectValue(r, v == 1);
     }},
    {2, [](Bag& b, Tag t) { return b.SetLong(t, -2); },
     [](Bag& b, Tag t) {
         LONG v = 0;
         const HRESULT r = b.GetLong(t, &v);
         return expectValue(r, v == -2);
     }},
    {3, [](Bag& b, Tag t) { return b.SetULong(t, 3); },
     [](Bag& b, Tag t) {
         ULONG v = 0;
         const HRESULT r = b.GetULong(t, &v);
         return expectValue(r, v == 3);
     }},
    {4, [](Bag& b, Tag t) { return b.SetDouble(t, 0.25); },
     [](Bag& b, Tag t) {
         double v = 0;
         const HRESULT r = b.GetDouble(t, &v);
         return expectValue(r, v == 0.25);
     }},
    {5, [](Bag& b, Tag t) { return b.SetGUID(t, &kGuid); },
     [](Bag& b, Tag t) {
         GUID v{};
         const HRESULT r = b.GetGUID(t, &v);
         return expectValue(r, v == kGuid);
     }},
    {6, [](Bag& b, Tag t) { return b.SetString(t, u"clock"); },
     [](Bag& b, Tag t) {
         BSTR v = nullptr;
         const HRESULT r = b.GetString(t, &v);
         const bool same = v != nullptr && std::u16string(v) == u"clock";
         qv::dsc::BStr::release(v);
         return expectValue(r, same);
     }},
    {7, [](Bag& b, Tag t) { return b.SetTimestamp(t, &kStamp); },
     [](Bag& b, Tag t) {
         kxSysAttrTimestampUTC v{};
         const HRESULT r = b.GetTimestamp(t, &v);
         return expectValue(r, v.seconds == kStamp.seconds && v.fraction == kStamp.fraction);
     }},
};

}  // namespace

TEST(CkxDynamicPropertyBagTest, TagKeepsItsFirstTypeAndNoAccessorConverts) {
    for (const TypeCase& stored : kTypes) {
        BagPtr bag = newBag();
        ASSERT_EQ(stored.set(*bag, kTag), S_OK);
        for (const TypeCase& other : kTypes) {
            const HRESULT expected = other.type == stored.type ? S_OK : CORBEL_E_TYPE_MISMATCH;
            EXPECT_EQ(other.get(*bag, kTag), expected) << stored.type << " read as " << other.type;
            EXPECT_EQ(other.set(*bag, kTag), expected) << stored.type << " set as " << other.type;
        }
        ULONG type = 0;
        EXPECT_EQ(bag->GetTagType(kTag, &type), S_OK);
        EXPECT_EQ(type, stored.type);
        EXPECT_EQ(stored.get(*bag, kTag), S_OK);
    }
}

TEST(CkxDynamicPropertyBagTest, MissingTagWritesOnlyBoolAndStringAndNullPointersAreRefused) {
    BagPtr bag = newBag();
    BOOL flag = 7;
    LONG number = 5;
    char16_t sentinel[] = u"x";
    BSTR text = sentinel;
    LONG fields[6] = {5, 5, 5, 5, 5, 5};
    EXPECT_EQ(bag->GetBool(kTag, &flag), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(bag->GetString(kTag, &text), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(bag->GetLong(kTag, &number), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(bag->GetDateTime(kTag, fields), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(bag->RemoveTag(kTag), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(flag, 0);
    EXPECT_EQ(text, nullptr);
    EXPECT_EQ(number, 5);
    EXPECT_EQ(fields[0], 5);

    EXPECT_EQ(bag->SetGUID(kTag, nullptr), E_POINTER);
    EXPECT_EQ(bag->SetDateTime(kTag, nullptr), E_POINTER);
    EXPECT_EQ(bag->GetULong(kTag, nullptr), E_POINTER);
    EXPECT_EQ(bag->Clone(nullptr), E_POINTER);
    EXPECT_EQ(bag->HasTag(kTag), S_FALSE);
}

TEST(CkxDynamicPropertyBagTest, ChangedTagsAscendOutliveRemovalAndClearOnlyOnRequest) {
    BagPtr bag = newBag();
    IkxSysEnumPropertyTag* none = reinterpret_cast<IkxSysEnumPropertyTag*>(bag.get());
    EXPECT_EQ(bag->EnumerateChangedTags(&none), S_FALSE);
    EXPECT_EQ(none, nullptr);
    ASSERT_EQ(bag->SetULong(0xE006000, 1), S_OK);
    ASSERT_EQ(bag->SetULong(0xE005000, 2), S_OK);
    ASSERT_EQ(bag->SetDouble(0x80000000, 1.0), S_OK);
    ASSERT_EQ(bag->RemoveTag(0xE006000), S_OK);
    EXPECT_EQ(bag->HasTag(0xE006000), S_FALSE);

    CQVComPtr<IkxSysEnumPropertyTag> changed;
    ASSERT_EQ(bag->EnumerateChangedTags(changed.Receive()), S_OK);
    EXPECT_EQ(remainingTags(changed.get()), (std::vector<Tag>{0xE005000, 0xE006000, 0x80000000}));
    // Values are kept in signed tag order.
    CQVComPtr<IkxSysEnumPropertyTag> values;
    ASSERT_EQ(bag->EnumerateTags(values.Receive()), S_OK);
    EXPECT_EQ(remainingTags(values.get()), (std::vector<Tag>{0x80000000, 0xE005000}));

    EXPECT_EQ(bag->ClearChangedTags(), S_OK);
    EXPECT_EQ(bag->ClearChangedTags(), S_FALSE);
    EXPECT_EQ(bag->RemoveAllTags(), S_OK);
    EXPECT_EQ(bag->EnumerateTags(values.Receive()), S_FALSE);
}

TEST(CkxDynamicPropertyBagTest, DateTimesConvertThroughLocalTimeFrom1970On) {
    setenv("TZ", "UTC0", 1);  // this program's tests all run in UTC
    tzset();
    struct Case {
        LONG fields[6];
        std::int64_t seconds;  // since 1904; 0 for the all-zero timestamp
    };
    const Case cases[] = {
        {{1903, 12, 31, 23, 59, 59}, 0},
        {{1904, 1, 1, 0, 0, 0}, 0},  // before the local-time epoch
        {{1970, 1, 1, 0, 0, 0}, 0},
        {{1970, 1, 1, 0, 0, 1}, 2082844801},
        {{2024, 2, 29, 12, 34, 56}, kStamp.seconds},
        {{2024, 13, 1, 0, 0, 0}, 0},
        {{2024, 2, 0, 0, 0, 0}, 0},
        {{2024, 2, 1, 24, 0, 0}, 0},
    };
    for (const Case& c : cases) {
        BagPtr bag = newBag();
        ASSERT_EQ(bag->SetDateTime(kTag, c.fields), S_OK);
        kxSysAttrTimestampUTC stored{1, 1};
        ASSERT_EQ(bag->GetTimestamp(kTag, &stored), S_OK);
        EXPECT_EQ(stored.seconds, c.seconds) << c.fields[0] << "-" << c.fields[1];
        EXPECT_EQ(stored.fraction, 0U);
        LONG back[6] = {};
        ASSERT_EQ(bag->GetDateTime(kTag, back), S_OK);
        for (int field = 0; field < 6; ++field) {
            EXPECT_EQ(back[field], c.seconds == 0 ? -1 : c.fields[field]) << field;
        }
    }
    // A stored time before 1970 still reads back where the calendar can show it.
    BagPtr bag = newBag();
    const kxSysAttrTimestampUTC early = {0, 1};
    ASSERT_EQ(bag->SetTimestamp(kTag, &early), S_OK);
    LONG back[6] = {};
    ASSERT_EQ(bag->GetDateTime(kTag, back), S_OK);
    EXPECT_EQ(std::vector<LONG>(back, back + 6), (std::vector<LONG>{1904, 1, 1, 0, 0, 1}));
}

TEST(CkxDynamicPropertyBagTest, CloneCopiesEveryValueAsChangedAndOwnsItsCopies) {
    BagPtr bag = newBag();
    for (const TypeCase& value : kTypes) {
        ASSERT_EQ(value.set(*bag, kTag + value.type), S_OK);
    }
    ASSERT_EQ(bag->ClearChangedTags(), S_OK);
    BagPtr copy;
    ASSERT_EQ(bag->Clone(copy.Receive()), S_OK);
    bag.reset();
    for (const TypeCase& value : kTypes) {
        EXPECT_EQ(value.get(*copy, kTag + value.type), S_OK) << value.type;
    }
    CQVComPtr<IkxSysEnumPropertyTag> changed;
    ASSERT_EQ(copy->EnumerateChangedTags(changed.Receive()), S_OK);
    EXPECT_EQ(remainingTags(changed.get()).size(), std::size(kTypes));
}

// Every allocation of a setter, an enumeration and a clone fails once in turn: the call
// answers E_OUTOFMEMORY and the bag is as before.
TEST(CkxDynamicPropertyBagTest, ExhaustedMemoryAnswersOutOfMemoryAndChangesNothing) {
    using Operation = HRESULT (*)(Bag&);
    const Operation operations[] = {
        [](Bag& b) { return b.SetULong(kTag + 1, 1); },
        [](Bag& b) { return b.SetString(kTag + 1, u"clock"); },
        [](Bag& b) {
            CQVComPtr<IkxSysEnumPropertyTag> e;
            return b.EnumerateTags(e.Receive());
        },
        [](Bag& b) {
            BagPtr copy;
            return b.Clone(copy.Receive());
        },
    };
    for (const Operation operation : operations) {
        for (unsigned nth = 1;; ++nth) {
            BagPtr bag = newBag();
            ASSERT_EQ(bag->SetLong(kTag, 1), S_OK);
            HRESULT result = S_OK;
            {
                ScopedAllocationFailure failure(nth);
                result = operation(*bag);
                if (!failure.triggered()) {
                    EXPECT_EQ(result, S_OK);
                    break;
                }
            }
            EXPECT_EQ(result, E_OUTOFMEMORY) << nth;
            EXPECT_EQ(bag->HasTag(kTag + 1), S_FALSE);
            CQVComPtr<IkxSysEnumPropertyTag> changed;
            ASSERT_EQ(bag->EnumerateChangedTags(changed.Receive()), S_OK);
            EXPECT_EQ(remainingTags(changed.get()), std::vector<Tag>{kTag});
        }
    }
}
