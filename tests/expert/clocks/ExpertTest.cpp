// The expert against one simulated clock: items and refreshes, reads, validation, writes.
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>

#include "platform/OleText.h"
#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using namespace nQVPTP000;
using namespace qvtest;
using qv::dsc::OleText;
using tIds = std::vector<std::uint16_t>;
using tChange = std::function<void(IkxSysPropertyBag2&)>;
const tIds kDiscovery(4, kClockDescription);  // one request per domain 0 to 3

TEST_F(ExpertFixture, ListingsRefreshEveryTimeAndAnItemLookupOnlyForAnUnknownName) {
    NameCollector collector;
    CQVComPtr<IkxSysEnumStringList> names;
    EXPECT_EQ(expert->EnumerateItems(&collector), S_OK);
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    EXPECT_EQ(collector.names,
              (std::vector<std::string>{"02-11-22-FF-FE-33-44-55:1", "02-11-22-FF-FE-33-44-55:2"}));
    EXPECT_EQ(newRequests().size(), 2 * kDiscovery.size());
    CQVComPtr<IkxSysPropertyBag> bag;
    EXPECT_EQ(expert->GetItem(OLESTR("02-11-22-ff-fe-33-44-55:1"), bag.Receive()), S_OK);
    EXPECT_EQ(newRequests(), tIds());
    SimulatedClock later(identity(0x56));
    network.attach(later);
    const kxSysAttributeTagID tag = kxQvPriority1;
    const OLECHAR* laterName = OLESTR("02-11-22-FF-FE-33-44-56:1");
    EXPECT_EQ(expert->GetItemProperties(laterName, 1, &tag, nullptr, bag.Receive()),
              CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(newRequests(), tIds());
    EXPECT_EQ(expert->GetItem(laterName, bag.Receive()), S_OK);
    EXPECT_EQ(newRequests(), kDiscovery);
    SimulatedNetwork empty;
    auto lonely = newExpert(empty);
    EXPECT_EQ(lonely->GetItemNames(names.Receive()), S_FALSE);
    lonely->Shutdown();
}

// Misuse gives a clear code, and a refused read says why to the calling thread.
TEST_F(ExpertFixture, MisuseIsRefusedAndAFailureSaysWhy) {
    CQVComObject<CPtpSysExpert>* fresh = nullptr;
    ASSERT_EQ(CQVComObject<CPtpSysExpert>::CreateInstance(&fresh), S_OK);
    const tExpert idle(fresh);
    CQVComPtr<IkxSysEnumStringList> names;
    EXPECT_EQ(idle->GetItemNames(names.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(expert->Initialize(), QV_E_ALREADY_INITIALIZED);
    CQVComPtr<IkxSysPropertyBag> bag;
    EXPECT_EQ(expert->GetItemProperties(kPort1, 2, nullptr, nullptr, bag.Receive()), E_POINTER);
    clock.setFault(SimulatedClock::Fault::errorStatus);
    EXPECT_EQ(read({kxQvPriority1}, bag), E_FAIL);
    CQVComPtr<IkxQvLastFailure> failure;
    ASSERT_EQ(
        expert->QueryInterface(IID_IkxQvLastFailure, reinterpret_cast<void**>(failure.Receive())),
        S_OK);
    BSTR description = nullptr;
    EXPECT_EQ(failure->GetLastFailure(&description, nullptr), S_OK);
    const std::u16string text = OleText::toLibrary(description);
    EXPECT_EQ(std::string(text.begin(), text.end()),
              "reading the clock's attributes: refused by the clock: GENERAL_ERROR (simulated "
              "failure) (status -52012)");
    SysFreeString(description);
}

std::size_t tagCount(IkxSysPropertyBag& bag) {
    std::size_t count = 0;
    for (const kxQvAttribute& row : kxQvAttributes) {
        count += bag.HasTag(row.tag) == S_OK ? 1U : 0U;
    }
    return count;
}

TEST_F(ExpertFixture, OneRequestPerSourceInSourceOrderAndTheResultSaysWhatWasServed) {
    tTags all = readableTags();
    std::reverse(all.begin(), all.end());
    CQVComPtr<IkxSysPropertyBag> bag;
    ASSERT_EQ(read(all, bag), S_OK);
    EXPECT_EQ(newRequests(),
              (tIds{kTime, kPortDataSet, kCurrentDataSet, kDefaultDataSet, kTimePropertiesDataSet,
                    kParentDataSet, kUtcProperties, kClockDescription}));
    EXPECT_EQ(tagCount(*bag.get()), all.size() + 2);  // the two unrequestable description tags

    struct Case {
        tTags tags;
        HRESULT result;
        std::size_t tagsInBag;
    };
    const Case cases[] = {
        {{kxQvPriority1, kxQvPriority1, kxQvPriority2}, S_OK, 7},
        {{kxQvPriority1, kxSysItemName}, S_FALSE, 7},
        {{kxSysItemName}, S_FALSE, 0},
        {{kxSysNetworkAddress}, CORBEL_E_TAG_NOT_FOUND, 0},
        {{0xE0FF000}, CORBEL_E_TAG_NOT_FOUND, 0},
        {{}, S_OK, 0},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(read(c.tags, bag), c.result);
        EXPECT_EQ(tagCount(*bag.get()), c.tagsInBag);
        EXPECT_EQ(newRequests().size(), c.tagsInBag == 0 ? 0U : 1U);
    }
}

TEST_F(ExpertFixture, ClockValuesAreConvertedAtTheirEdges) {
    tStatus status;
    const std::uint8_t zeros[4] = {};
    auto& parent = managed.parentDataSet;
    auto& port = managed.port(1);
    const struct {
        std::function<void()> set;
        kxSysAttributeTagID tag;
        const char* expected;
    } cases[] = {
        {[&] { managed.time = tTimestamp(0, 999999999); }, kxQvTime, "2082844800+0"},
        {[&] { managed.currentDataSet.offsetFromMaster.setScaledNanoseconds(-98304); },
         kxQvOffsetFromMaster, "-1.0"},
        {[&] { managed.timeProperties.currentUtcOffset = -5; }, kxQvCurrentUtcOffset, "4294967291"},
        {[&] { port.protocolAddress = tPortAddress(1, 4, zeros, status); }, kxSysNetworkAddress,
         "xxx.xxx.xxx.xxx"},
        {[&] { managed.userDescription = tPTPText("caf\xE9 \xFF", status); }, kxQvUserDescription,
         "caf? ?"},
        {[&] { parent.observedParentOffsetScaledLogVariance = 3; }, kxQvParentOffsetVariance,
         "0.0"},
        {[&] { parent.parentStats = true; }, kxQvParentOffsetVariance, "8.0"},
        {[&] { parent.observedParentOffsetScaledLogVariance = 0xFFFF; }, kxQvParentOffsetVariance,
         "inf"},
    };
    for (const auto& c : cases) {
        c.set();
        CQVComPtr<IkxSysPropertyBag> bag;
        read({c.tag, kxQvUserDescription}, bag);
        EXPECT_EQ(textOf(*bag.get(), c.tag), c.expected) << std::hex << c.tag;
    }
}

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
        b.SetString(kxQvUserDescription, std::basic_string<OLECHAR>(length, 'x').c_str());
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
        {{text(128), u32(kxQvDomainNumber, 3), u32(kxQvPriority1, 255), real(2.0),
          i32(kxQvLogSyncInterval, -127), seconds(2082844800)},
         S_OK,
         u"",
         {kxQvUserDescription, kxQvDomainNumber, kxQvPriority1, kxQvAnnounceReceiptTimeout,
          kxQvLogSyncInterval, kxQvTime}},
        {{i32(kxQvPortEnabled, 1), seconds(2082844799), i32(kxQvLogMinPdelayReqInterval, 128),
          i32(kxQvLogSyncInterval, -128), i32(kxQvLogAnnounceInterval, 200), real(2.5),
          u32(kxQvSlaveOnly, 1), i32(kxQvPriority2, 1), u32(kxQvPriority1, 256),
          u32(kxQvDomainNumber, 4), text(129), u32(kxQvStepsRemoved, 1)},
         CORBEL_E_INVALID_VALUE,
         u"User Description must be a string <= 128 chars.  Domain must be an integer within "
         u"the range 0 (PTP default domain) to 3.  Priority values must be integers within the "
         u"range 0-255.  Priority values must be integers within the range 0-255.  Slave Only "
         u"must be a boolean.  " +
             kTimeout +
             u"Announce Interval must be an integer within the range -127-127.  Sync Interval "
             u"must be an integer within the range -127-127.  MinPDelReqIntvl values must be "
             u"integers within the range -127-127.  Time values must have a year >= 1970.  "
             u"ClkSyncEnabled must be a boolean.  "},
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
        EXPECT_EQ(OleText::toLibrary(message), c.message);
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
    bag->ClearChangedTags();
    bag->SetBool(kxQvPortEnabled, 1);
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds{kEnablePort});

    u32(kxQvPriority1, 11)(*bag.get());
    u32(kxQvPriority2, 21)(*bag.get());
    managed.failures.setters = true;
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), E_FAIL);
    EXPECT_EQ(newRequests(), tIds{kPriority1});
    EXPECT_EQ(expert->ApplyChanges(OLESTR("02-11-22-FF-FE-33-44-55:9"), bag.get(), nullptr),
              E_FAIL);
    bag->ClearChangedTags();
    u32(kxQvStepsRemoved, 1)(*bag.get());
    EXPECT_EQ(expert->ApplyChanges(OLESTR("no clock"), bag.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds());
}

}  // namespace
