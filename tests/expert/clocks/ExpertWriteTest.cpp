#include <gtest/gtest.h>

#include <functional>

#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using namespace nQVPTP000;
using qvtest::ExpertFixture;
using qvtest::tTags;
using tIds = std::vector<std::uint16_t>;
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

const std::u16string kTimeout =
    u"Announce Receipt Timeout must be an integer within the range 2-255.  ";

TEST_F(ExpertFixture, ValidationAcceptsOrExplainsInChangedTagOrderAndSendsNothing) {
    const struct {
        std::vector<tChange> changes;
        HRESULT result;
        std::u16string message;
        tTags accepted = {};
    } cases[] = {
        {{text(128), u32(kxQvDomainNumber, 3), u32(kxQvPriority1, 255), u32(kxQvPriority2, 0),
          real(2.0), i32(kxQvLogAnnounceInterval, 127), i32(kxQvLogSyncInterval, -127),
          seconds(2082844800), [](IkxSysPropertyBag2& b) { b.SetBool(kxQvPortEnabled, 0); }},
         S_OK,
         u"",
         {kxQvUserDescription, kxQvDomainNumber, kxQvPriority1, kxQvPriority2,
          kxQvAnnounceReceiptTimeout, kxQvLogAnnounceInterval, kxQvLogSyncInterval, kxQvTime,
          kxQvPortEnabled}},
        {{i32(kxQvPortEnabled, 1), seconds(2082844799), i32(kxQvLogMinPdelayReqInterval, 128),
          i32(kxQvLogSyncInterval, -128), i32(kxQvLogAnnounceInterval, 200), real(2.5),
          u32(kxQvSlaveOnly, 1), i32(kxQvPriority2, 1), u32(kxQvPriority1, 256),
          u32(kxQvDomainNumber, 4), text(129), u32(kxQvStepsRemoved, 1)},
         CORBEL_E_INVALID_VALUE,
         u"User Description must be a string <= 128 chars.  Domain must be an integer within the "
         u"range 0 (PTP default domain) to 3.  Priority values must be integers within the range "
         u"0-255.  Priority values must be integers within the range 0-255.  Slave Only must be a "
         u"boolean.  " +
             kTimeout +
             u"Announce Interval must be an integer within the range -127-127.  Sync Interval must "
             u"be "
             u"an integer within the range -127-127.  MinPDelReqIntvl values must be integers "
             u"within "
             u"the range -127-127.  Time values must have a year >= 1970.  ClkSyncEnabled must be "
             u"a "
             u"boolean.  "},
        {{real(255.0)}, S_OK, u"", {kxQvAnnounceReceiptTimeout}},
        {{real(1.0)}, CORBEL_E_INVALID_VALUE, kTimeout},
        {{real(256.0)}, CORBEL_E_INVALID_VALUE, kTimeout},
        {{u32(kxQvStepsRemoved, 1)}, S_FALSE, u""},
    };
    for (const auto& c : cases) {
        auto bag = newBag();
        for (const tChange& change : c.changes) {
            change(*bag.get());
        }
        CQVComPtr<IkxSysEnumPropertyTag> accepted;
        BSTR message = nullptr;
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
    for (const tChange& change :
         {u32(kxQvPriority2, 20), u32(kxQvPriority1, 10), u32(kxQvStepsRemoved, 1),
          seconds(2082845800, 1ULL << 63), text(3)}) {
        change(*bag.get());
    }
    bag->SetBool(kxQvPortEnabled, 0);
    ULONG out = 9;
    ASSERT_EQ(expert->ApplyChanges(kPort1, bag.get(), &out), S_OK);
    EXPECT_EQ(out, 0U);
    EXPECT_EQ(newRequests(), (tIds{kUserDescription, kPriority1, kPriority2, kTime, kDisablePort}));
    EXPECT_EQ(managed.defaultDataSet.priority1, 10);
    EXPECT_EQ(managed.time, tTimestamp(1000, 0));  // whole seconds only
    EXPECT_FALSE(managed.port(1).enabled);
    bag->SetBool(kxQvPortEnabled, 1);
    bag->ClearChangedTags();
    bag->SetBool(kxQvPortEnabled, 1);
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds{kEnablePort});

    u32(kxQvPriority1, 11)(*bag.get());
    u32(kxQvPriority2, 21)(*bag.get());
    managed.failures.setters = true;
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), E_FAIL);
    EXPECT_EQ(newRequests(), tIds{kPriority1});
    EXPECT_EQ(expert->ApplyChanges(u"02-11-22-FF-FE-33-44-55:9", bag.get(), nullptr), E_FAIL);
    bag->ClearChangedTags();
    u32(kxQvStepsRemoved, 1)(*bag.get());
    EXPECT_EQ(expert->ApplyChanges(u"no clock", bag.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds());
}

}  // namespace
