#include "expert/CkxDynamicPropertyBag.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "platform/BStr.h"
#include "tests/support/FailingAllocation.h"

using qvtest::ScopedAllocationFailure;
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

// Every tag that the enumerator still has, one Next at a time.
Tags remainingTags(IkxSysEnumPropertyTag* tags) {
    Tags found;
    Tag tag = 0;
    while (tags->Next(1, &tag, nullptr) == S_OK) {
        found.push_back(tag);
    }
    return found;
}

constexpr Tag kTag = 0xE005000;
constexpr GUID kGuid = {1, 2, 3, {4, 5, 6, 7, 8, 9, 10, 11}};
// 2024-02-29 12:34:56.5 UTC.
constexpr kxSysAttrTimestampUTC kStamp = {1ULL << 63, 1709210096 + std::int64_t{2082844800}};

bool operator==(const kxSysAttrTimestampUTC& left, const kxSysAttrTimestampUTC& right) {
    return left.seconds == right.seconds && left.fraction == right.fraction;
}

// A getter's result, or E_FAIL when it succeeded with another value than expected.
template <class V>
HRESULT got(HRESULT result, const V& value, const V& expected) {
    return result == S_OK && !(value == expected) ? E_FAIL : result;
}

HRESULT gotText(Bag& bag, Tag tag) {
    BSTR text = nullptr;
    const HRESULT result = bag.GetString(tag, &text);
    const std::u16string copy = text == nullptr ? u"" : text;
    qv::dsc::BStr::release(text);
    return got(result, copy, std::u16string(u"clock"));
}

struct TypeCase {
    ULONG type;
    HRESULT (*set)(Bag&, Tag);
    HRESULT (*get)(Bag&, Tag);
};

// clang-format off
const TypeCase kTypes[] = {
    {1, [](Bag& b, Tag t) { return b.SetBool(t, 7); },
        [](Bag& b, Tag t) { BOOL v = 0; return got(b.GetBool(t, &v), v, 1); }},
    {2, [](Bag& b, Tag t) { return b.SetLong(t, -2); },
        [](Bag& b, Tag t) { LONG v = 0; return got(b.GetLong(t, &v), v, -2); }},
    {3, [](Bag& b, Tag t) { return b.SetULong(t, 3); },
        [](Bag& b, Tag t) { ULONG v = 0; return got(b.GetULong(t, &v), v, 3U); }},
    {4, [](Bag& b, Tag t) { return b.SetDouble(t, 0.25); },
        [](Bag& b, Tag t) { double v = 0; return got(b.GetDouble(t, &v), v, 0.25); }},
    {5, [](Bag& b, Tag t) { return b.SetGUID(t, &kGuid); },
        [](Bag& b, Tag t) { GUID v{}; return got(b.GetGUID(t, &v), v, kGuid); }},
    {6, [](Bag& b, Tag t) { return b.SetString(t, u"clock"); }, &gotText},
    {7, [](Bag& b, Tag t) { return b.SetTimestamp(t, &kStamp); },
        [](Bag& b, Tag t) { kxSysAttrTimestampUTC v{}; return got(b.GetTimestamp(t, &v), v, kStamp); }},
};
// clang-format on

}  // namespace

TEST(CkxDynamicPropertyBagTest, TagKeepsItsFirstTypeAndNoAccessorConverts) {
    for (const TypeCase& stored : kTypes) {
        BagPtr bag = newBag();
        EXPECT_EQ(stored.get(*bag, kTag), CORBEL_E_TAG_NOT_FOUND);
        ASSERT_EQ(stored.set(*bag, kTag), S_OK);
        for (const TypeCase& other : kTypes) {
            const HRESULT expected = other.type == stored.type ? S_OK : CORBEL_E_TYPE_MISMATCH;
            EXPECT_EQ(other.get(*bag, kTag), expected) << stored.type << " read as " << other.type;
            EXPECT_EQ(other.set(*bag, kTag), expected) << stored.type << " set as " << other.type;
        }
        EXPECT_EQ(stored.get(*bag, kTag), S_OK);
    }
}

// On failure only these two getters write their out value.
TEST(CkxDynamicPropertyBagTest, MissingTagReadsAsFalseAndNull) {
    BagPtr bag = newBag();
    BOOL flag = 7;
    char16_t sentinel[] = u"x";
    BSTR text = sentinel;
    EXPECT_EQ(bag->GetBool(kTag, &flag), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(bag->GetString(kTag, &text), CORBEL_E_TAG_NOT_FOUND);
    EXPECT_EQ(flag, 0);
    EXPECT_EQ(text, nullptr);
}

TEST(CkxDynamicPropertyBagTest, ChangedTagsAscendOutliveRemovalAndClearOnlyOnRequest) {
    BagPtr bag = newBag();
    CQVComPtr<IkxSysEnumPropertyTag> changed;
    EXPECT_EQ(bag->EnumerateChangedTags(changed.Receive()), S_FALSE);
    ASSERT_EQ(bag->SetULong(0xE006000, 1), S_OK);
    ASSERT_EQ(bag->SetULong(0xE005000, 2), S_OK);
    ASSERT_EQ(bag->SetDouble(0x80000000, 1.0), S_OK);
    ASSERT_EQ(bag->RemoveTag(0xE006000), S_OK);
    EXPECT_EQ(bag->HasTag(0xE006000), S_FALSE);
    ASSERT_EQ(bag->EnumerateChangedTags(changed.Receive()), S_OK);
    EXPECT_EQ(remainingTags(changed.get()), (Tags{0xE005000, 0xE006000, 0x80000000}));
    // Values are kept in signed tag order. An enumerator goes on after the tag it delivered
    // last whatever changed meanwhile, and keeps the bag alive.
    CQVComPtr<IkxSysEnumPropertyTag> values;
    ASSERT_EQ(bag->EnumerateTags(values.Receive()), S_OK);
    ASSERT_EQ(values->Skip(1), S_OK);
    ASSERT_EQ(bag->RemoveTag(0xE005000), S_OK);
    ASSERT_EQ(bag->SetULong(0xE007000, 7), S_OK);
    EXPECT_EQ(bag->ClearChangedTags(), S_OK);
    EXPECT_EQ(bag->ClearChangedTags(), S_FALSE);
    bag.reset();
    EXPECT_EQ(remainingTags(values.get()), Tags{0xE007000});
}

TEST(CkxDynamicPropertyBagTest, DateTimesConvertThroughLocalTimeFrom1970On) {
    setenv("TZ", "UTC0", 1);  // this program's tests all run in UTC
    tzset();
    struct Case {
        std::vector<LONG> fields;
        std::int64_t seconds;  // since 1904; 0 for the all-zero timestamp
    };
    const Case cases[] = {
        {{1903, 12, 31, 23, 59, 59}, 0},
        {{1904, 1, 1, 0, 0, 0}, 0},
        {{1970, 1, 1, 0, 0, 0}, 0},
        {{1970, 1, 1, 0, 0, 1}, 2082844801},
        {{2024, 2, 29, 12, 34, 56}, kStamp.seconds},
        {{2024, 13, 1, 0, 0, 0}, 0},
        {{2024, 2, 1, 24, 0, 0}, 0},
    };
    for (const Case& c : cases) {
        BagPtr bag = newBag();
        ASSERT_EQ(bag->SetDateTime(kTag, c.fields.data()), S_OK);
        kxSysAttrTimestampUTC stored{1, 1};
        ASSERT_EQ(bag->GetTimestamp(kTag, &stored), S_OK);
        EXPECT_EQ(stored.seconds, c.seconds) << c.fields[0];
        std::vector<LONG> back(6);
        ASSERT_EQ(bag->GetDateTime(kTag, back.data()), S_OK);
        EXPECT_EQ(back, c.seconds == 0 ? std::vector<LONG>(6, -1) : c.fields);
    }
}

TEST(CkxDynamicPropertyBagTest, CloneCopiesEveryValueAsChanged) {
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
        [](Bag& b) { return b.SetString(kTag + 1, u"clock"); },
        [](Bag& b) { return b.EnumerateTags(CQVComPtr<IkxSysEnumPropertyTag>().Receive()); },
        [](Bag& b) { return b.Clone(BagPtr().Receive()); },
    };
    for (const Operation operation : operations) {
        for (unsigned nth = 1;; ++nth) {
            BagPtr bag = newBag();
            ASSERT_EQ(bag->SetLong(kTag, 1), S_OK);
            ScopedAllocationFailure failure(nth);
            const HRESULT result = operation(*bag);
            if (!failure.triggered()) {
                EXPECT_EQ(result, S_OK);
                break;
            }
            EXPECT_EQ(result, E_OUTOFMEMORY) << nth;
            EXPECT_EQ(bag->HasTag(kTag + 1), S_FALSE);
            CQVComPtr<IkxSysEnumPropertyTag> changed;
            ASSERT_EQ(bag->EnumerateChangedTags(changed.Receive()), S_OK);
            EXPECT_EQ(remainingTags(changed.get()), Tags{kTag});
        }
    }
}

TEST(CkxDynamicPropertyBagTest, BagAnswersItsIdentifiersWithOnePointerAndOneMoreReference) {
    BagPtr bag = newBag();
    void* answered = nullptr;
    for (const IID* iid : {&IID_IUnknown, &IID_IkxSysPropertyBag, &IID_IkxSysPropertyBag2}) {
        ASSERT_EQ(bag->QueryInterface(*iid, &answered), S_OK);
        EXPECT_EQ(answered, bag.get());
        EXPECT_EQ(bag->Release(), 1U);
    }
    EXPECT_EQ(bag->QueryInterface(IID_IkxSysEnumPropertyTag, &answered), E_NOINTERFACE);
    EXPECT_EQ(answered, nullptr);
}
