#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using namespace nQVPTP000;
using qvtest::ExpertFixture;
using tIds = std::vector<std::uint16_t>;
using tTags = std::vector<kxSysAttributeTagID>;
using tChange = std::function<void(IkxSysPropertyBag2&)>;

tChange u32(kxSysAttributeTagID tag, ULONG value) {
    return [=](IkxSysPropertyBag2& b) { b.SetULong(tag, value); };
}
tChange i32(kxSysAttributeTagID tag, LONG value) {
    return [=](IkxSysPropertyBag2& b) { b.SetLong(tag, value); };
}
tChange real(double value) {
    return [=](IkxSysPropertyBag2& b) { b.SetDouble(kxQvAnnounceReceiptTimeout, value); };
}
tChange text(std::size_t length) {
    return [=](IkxSysPropertyBag2& b) {
        b.SetString(kxQvUserDescription, std::u16string(length, u'x').c_str());
    };
}
tChange seconds(std::int64_t value, std::uint64_t fraction = 0) {
    return [=](IkxSysPropertyBag2& b) {
        const kxSysAttrTimestampUTC time{fraction, value};
        b.SetTimestamp(kxQvTime, &time);
    };
}

const char16_t* const kPriority = u"Priority values must be integers within the range 0-255.  ";

TEST_F(ExpertFixture, ValidationAcceptsOrExplainsInChangedTagOrder) {
    struct Case {
        std::vector<tChange> changes;
        HRESULT result;
        std::u16string message;
        tTags accepted;
    };
    const Case cases[] = {
        {{u32(kxQvPriority1, 300), u32(kxQvDomainNumber, 5)},
         CORBEL_E_INVALID_VALUE,
         std::u16string(u"Domain must be an integer within the range 0 (PTP default domain) to "
                        u"3.  ") +
             kPriority,
         {}},
        {{u32(kxQvPriority1, 255), u32(kxQvPriority2, 0)},
         S_OK,
         u"",
         {kxQvPriority1, kxQvPriority2}},
        {{i32(kxQvPriority1, 1)}, CORBEL_E_INVALID_VALUE, kPriority, {}},
        {{u32(kxQvStepsRemoved, 1)}, S_FALSE, u"", {}},
        {{real(2.0)}, S_OK, u"", {kxQvAnnounceReceiptTimeout}},
        {{real(255.0)}, S_OK, u"", {kxQvAnnounceReceiptTimeout}},
        {{real(1.0)},
         CORBEL_E_INVALID_VALUE,
         u"Announce Receipt Timeout must be an integer within the range 2-255.  ",
         {}},
        {{real(2.5)},
         CORBEL_E_INVALID_VALUE,
         u"Announce Receipt Timeout must be an integer within the range 2-255.  ",
         {}},
        {{real(256.0)},
         CORBEL_E_INVALID_VALUE,
         u"Announce Receipt Timeout must be an integer within the range 2-255.  ",
         {}},
        {{i32(kxQvLogSyncInterval, -127), i32(kxQvLogAnnounceInterval, 127)},
         S_OK,
         u"",
         {kxQvLogAnnounceInterval, kxQvLogSyncInterval}},
        {{i32(kxQvLogSyncInterval, -128), i32(kxQvLogMinPdelayReqInterval, 128),
          i32(kxQvLogAnnounceInterval, 200)},
         CORBEL_E_INVALID_VALUE,
         u"Announce Interval must be an integer within the range -127-127.  "
         u"Sync Interval must be an integer within the range -127-127.  "
         u"MinPDelReqIntvl values must be integers within the range -127-127.  ",
         {}},
        {{text(128)}, S_OK, u"", {kxQvUserDescription}},
        {{text(129)},
         CORBEL_E_INVALID_VALUE,
         u"User Description must be a string <= 128 chars.  ",
         {}},
        {{seconds(2082844800)}, S_OK, u"", {kxQvTime}},
        {{seconds(2082844799)},
         CORBEL_E_INVALID_VALUE,
         u"Time values must have a year >= 1970.  ",
         {}},
        {{u32(kxQvSlaveOnly, 1), i32(kxQvPortEnabled, 1)},
         CORBEL_E_INVALID_VALUE,
         u"Slave Only must be a boolean.  ClkSyncEnabled must be a boolean.  ",
         {}},
    };
    for (const Case& c : cases) {
        auto bag = newBag();
        for (const tChange& change : c.changes) {
            change(*bag.get());
        }
        CQVComPtr<IkxSysEnumPropertyTag> accepted;
        BSTR message = reinterpret_cast<BSTR>(1);
        EXPECT_EQ(expert->ValidateChanges(nullptr, bag.get(), accepted.Receive(), &message),
                  c.result);
        EXPECT_EQ(std::u16string(message != nullptr ? message : u""), c.message);
        SysFreeString(message);
        tTags tags(c.accepted.size() + 1);
        ULONG fetched = 0;
        if (accepted) {
            accepted->Next(static_cast<ULONG>(tags.size()), tags.data(), &fetched);
        }
        tags.resize(fetched);
        EXPECT_EQ(tags, c.accepted);
    }
    EXPECT_EQ(newRequests(), tIds());
}

TEST_F(ExpertFixture, ApplyWritesInChangedTagOrderAndStopsAtTheFirstFailure) {
    auto bag = newBag();
    bag->SetBool(kxQvPortEnabled, 0);
    u32(kxQvPriority2, 20)(*bag.get());
    u32(kxQvPriority1, 10)(*bag.get());
    u32(kxQvStepsRemoved, 1)(*bag.get());
    seconds(2082844800 + 1000, 1ULL << 63)(*bag.get());
    text(3)(*bag.get());
    ULONG out = 9;
    ASSERT_EQ(expert->ApplyChanges(kPort1, bag.get(), &out), S_OK);
    EXPECT_EQ(out, 0U);
    EXPECT_EQ(newRequests(), (tIds{kUserDescription, kPriority1, kPriority2, kTime, kDisablePort}));
    EXPECT_EQ(managed().defaultDataSet.priority1, 10);
    EXPECT_EQ(managed().time, tTimestamp(1000, 0));
    EXPECT_FALSE(managed().port(1).enabled);

    auto enable = newBag();
    enable->SetBool(kxQvPortEnabled, 1);
    EXPECT_EQ(expert->ApplyChanges(kPort1, enable.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds{kEnablePort});

    managed().failures.setters = true;
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), E_FAIL);
    EXPECT_EQ(newRequests(), tIds{kUserDescription});
    EXPECT_EQ(expert->ApplyChanges(u"02-11-22-FF-FE-33-44-55:9", bag.get(), nullptr), E_FAIL);
    auto readOnly = newBag();
    u32(kxQvStepsRemoved, 1)(*readOnly.get());
    EXPECT_EQ(expert->ApplyChanges(u"no clock", readOnly.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds());
}

}  // namespace
