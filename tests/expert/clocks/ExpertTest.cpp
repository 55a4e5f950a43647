// The expert against one simulated clock: items and refreshes, reads, validation, writes.
#include <gtest/gtest.h>

#include <algorithm>
#include <functional>

#include "platform/OleText.h"
#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"
#include "tests/support/FailingAllocation.h"
#include "tests/support/Hex.h"

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
    // Any spelling that finds a clock gives it the name of its port identity.
    for (const OLECHAR* spelling :
         {OLESTR("02-11-22-ff-fe-33-44-55:1"), OLESTR("2-11-22-FF-FE-33-44-55:01")}) {
        ASSERT_EQ(expert->GetItem(spelling, bag.Receive()), S_OK);
        EXPECT_EQ(textOf(*bag.get(), kxSysItemName), "02-11-22-FF-FE-33-44-55:1");
        EXPECT_EQ(textOf(*bag.get(), kxQvClockPortName), "02-11-22-FF-FE-33-44-55:1");
    }
    EXPECT_EQ(newRequests(), tIds());
    // A port number is 16 bits: these do not wrap to port 1, and name no port to ask.
    for (const OLECHAR* name :
         {OLESTR("02-11-22-FF-FE-33-44-55:65537"), OLESTR("02-11-22-FF-FE-33-44-55:-65535"),
          OLESTR("02-11-22-FF-FE-33-44-55")}) {
        EXPECT_EQ(expert->GetItem(name, bag.Receive()), CORBEL_E_ITEM_NOT_FOUND);
    }
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

// An unknown name is asked for by name alone, and its answer ends the wait: the datagram due
// at the end of a 65535 ms wait is still on its way. Ports asked for stay known (the third
// lookup sends nothing); silence ends in "not found".
TEST_F(ExpertFixture, AnUnknownNameIsAskedForByNameAndItsAnswerEndsTheWait) {
    SimulatedNetwork own;  // the fixture's expert reads `network`
    own.attach(clock);
    auto patient = newExpert(own, 65535);
    own.inject({0}, std::chrono::milliseconds(65535));
    CQVComPtr<IkxSysPropertyBag> bag;
    for (const OLECHAR* name :
         {OLESTR("02-11-22-FF-FE-33-44-55:2"), kPort1, OLESTR("2-11-22-FF-FE-33-44-55:2")}) {
        EXPECT_EQ(patient->GetItem(name, bag.Receive()), S_OK);
    }
    EXPECT_EQ(own.queuedCount(), 1U);
    const auto sent = own.sentDatagrams();
    ASSERT_EQ(sent.size(), 2 * kDiscovery.size());
    EXPECT_EQ(decodeManagement(sent[3])->getTargetPortIdentity(), tPortIdentity(identity(0x55), 2));
    patient->Shutdown();
    EXPECT_EQ(expert->GetItem(OLESTR("02-11-22-FF-FE-33-44-57:1"), bag.Receive()),
              CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(newRequests(), kDiscovery);
}

// Misuse gives a clear code, and a failure says why to the calling thread until its next
// operation.
TEST_F(ExpertFixture, MisuseIsRefusedAndAFailureSaysWhy) {
    CQVComObject<CPtpSysExpert>* fresh = nullptr;
    ASSERT_EQ(CQVComObject<CPtpSysExpert>::CreateInstance(&fresh), S_OK);
    const tExpert idle(fresh);
    CQVComPtr<IkxSysEnumStringList> names;
    EXPECT_EQ(idle->GetItemNames(names.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(expert->Initialize(), QV_E_ALREADY_INITIALIZED);
    CQVComPtr<IkxSysPropertyBag> bag;
    EXPECT_EQ(expert->GetItemProperties(kPort1, 2, nullptr, nullptr, bag.Receive()), E_POINTER);
    CQVComPtr<IkxSysEnumPropertyTag> accepted;
    EXPECT_EQ(expert->ValidateChanges(kPort1, nullptr, accepted.Receive(), nullptr), E_POINTER);

    clock.setFault(SimulatedClock::Fault::errorStatus);
    EXPECT_EQ(read({kxQvPriority1}, bag), E_FAIL);
    EXPECT_EQ(lastFailure(),
              "reading the clock's attributes: refused by the clock: GENERAL_ERROR (simulated "
              "failure)");
    EXPECT_EQ(lastCause(), (tCause{kxQvFailureKind::refusedByClock, 0xFFFE, 0}));
    EXPECT_EQ(expert->ValidateChanges(kPort1, newBag().get(), accepted.Receive(), nullptr),
              S_FALSE);
    EXPECT_EQ(lastCause(), (tCause{kxQvFailureKind::none, 0, 0}));

    // A discovery that cannot send is no empty network: it says so.
    network.failNextSend();
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_FALSE);
    EXPECT_EQ(lastFailure().rfind("discovery: sendto failed: ", 0), 0U) << lastFailure();
    EXPECT_EQ(lastCause(), (tCause{kxQvFailureKind::network, 0, 0}));
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
        ASSERT_TRUE(bag);
        EXPECT_EQ(tagCount(*bag.get()), c.tagsInBag);
        EXPECT_EQ(newRequests().size(), c.tagsInBag == 0 ? 0U : 1U);
    }
}

// Memory that runs out anywhere in a read gives E_OUTOFMEMORY, and only the group it hit
// goes missing from the bag.
TEST_F(ExpertFixture, MemoryRunningOutInOneGroupLeavesTheOtherGroupsRead) {
    bool timeLost = false;
    bool defaultLost = false;
    const tTags tags = {kxQvTime, kxQvPriority1};
    for (unsigned nth = 1; nth < 2000; ++nth) {
        CQVComPtr<IkxSysPropertyBag> bag;
        HRESULT result = S_OK;
        {
            ScopedAllocationFailure failure(nth);
            result = read(tags, bag);
            if (!failure.triggered()) {
                EXPECT_EQ(result, S_OK);
                EXPECT_TRUE(timeLost && defaultLost);
                return;
            }
        }
        ASSERT_EQ(result, E_OUTOFMEMORY) << "allocation " << nth;
        if (bag) {
            const bool time = bag->HasTag(kxQvTime) == S_OK;
            const bool priorities = bag->HasTag(kxQvPriority2) == S_OK;
            timeLost = timeLost || (!time && priorities);
            defaultLost = defaultLost || (time && !priorities);
        }
    }
    ADD_FAILURE() << "the read kept allocating";
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
        {[&] { port.physicalAddress = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55}; }, kxSysHardwareAddress,
         "02:11:22:33:44:55"},
        {[&] { port.logSyncInterval = -1; }, kxQvLogSyncInterval, "-1"},
        // Texts are UTF-8 whatever the locale; octets that are not become U+FFFD.
        {[&] { managed.userDescription = tPTPText("Z\xC3\xBC \xE6\x9D\xB1 \xFF", status); },
         kxQvUserDescription, "Z\\u00FC \\u6771 \\uFFFD"},
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
        ASSERT_TRUE(bag);
        EXPECT_EQ(textOf(*bag.get(), c.tag), c.expected) << std::hex << c.tag;
    }
}

tChange u32(kxSysAttributeTagID tag, ULONG value) {
    return [=](IkxSysPropertyBag2& b) { b.SetULong(tag, value); };
}
tChange i32(kxSysAttributeTagID tag, LONG value) {
    return [=](IkxSysPropertyBag2& b) { b.SetLong(tag, value); };
}
tChange flag(kxSysAttributeTagID tag, BOOL value) {
    return [=](IkxSysPropertyBag2& b) { b.SetBool(tag, value); };
}
tChange real(double value) {
    return [=](IkxSysPropertyBag2& b) { b.SetDouble(kxQvAnnounceReceiptTimeout, value); };
}
tChange text(std::u16string value) {
    return [=](IkxSysPropertyBag2& b) {
        b.SetString(kxQvUserDescription, OleText::toBoundary(value).c_str());
    };
}
tChange seconds(std::int64_t value, std::uint64_t fraction = 0) {
    return [=](IkxSysPropertyBag2& b) {
        const kxSysAttrTimestampUTC time{fraction, value};
        b.SetTimestamp(kxQvTime, &time);
    };
}

constexpr std::int64_t k1970 = 2082844800;               // 1970-01-01T00:00:00Z, since 1904
constexpr std::int64_t kLastPtpSecond = 0xFFFFFFFFFFFF;  // 48 bits of PTP seconds
// 128 octets of UTF-8: 42 characters of three octets, one of two.
const std::u16string k128Octets = std::u16string(42, u'\u6771') + u"\u00FC";
const char16_t kLoneSurrogate[] = {u'a', 0xD800, 0};
const std::u16string kTimeout =
    u"Announce Receipt Timeout must be an integer within the range 2-255.  ";
const std::u16string kPriority = u"Priority values must be integers within the range 0-255.  ";
const std::u16string kText = u"User Description must be a string <= 128 chars.  ";
const std::u16string kTime = u"Time values must have a year >= 1970.  ";

TEST_F(ExpertFixture, ValidationAcceptsOrExplainsInChangedTagOrderAndSendsNothing) {
    const struct {
        std::vector<tChange> changes;
        HRESULT result;
        std::u16string message;
        tTags accepted = {};
    } cases[] = {
        {{text(k128Octets), u32(kxQvDomainNumber, 3), u32(kxQvPriority1, 255),
          u32(kxQvPriority2, 0), real(2.0), i32(kxQvLogAnnounceInterval, 127),
          i32(kxQvLogSyncInterval, -127), seconds(k1970)},
         S_OK,
         u"",
         {kxQvUserDescription, kxQvDomainNumber, kxQvPriority1, kxQvPriority2,
          kxQvAnnounceReceiptTimeout, kxQvLogAnnounceInterval, kxQvLogSyncInterval, kxQvTime}},
        {{real(255.0), i32(kxQvLogMinPdelayReqInterval, -127), seconds(k1970 + kLastPtpSecond),
          u32(kxQvPriority2, 1)},
         S_OK,
         u"",
         {kxQvPriority2, kxQvAnnounceReceiptTimeout, kxQvLogMinPdelayReqInterval, kxQvTime}},
        {{i32(kxQvPortEnabled, 1), seconds(k1970 - 1), i32(kxQvLogMinPdelayReqInterval, 128),
          i32(kxQvLogSyncInterval, -128), i32(kxQvLogAnnounceInterval, 200), real(2.5),
          u32(kxQvSlaveOnly, 1), i32(kxQvPriority2, 1), u32(kxQvPriority1, 256),
          u32(kxQvDomainNumber, 4), text(k128Octets + u"x"), u32(kxQvStepsRemoved, 1)},
         CORBEL_E_INVALID_VALUE,
         kText + u"Domain must be an integer within the range 0 (PTP default domain) to 3.  " +
             kPriority + kPriority + u"Slave Only must be a boolean.  " + kTimeout +
             u"Announce Interval must be an integer within the range -127-127.  Sync Interval "
             u"must be an integer within the range -127-127.  MinPDelReqIntvl values must be "
             u"integers within the range -127-127.  " +
             kTime + u"ClkSyncEnabled must be a boolean.  "},
        {{real(256.0), text(kLoneSurrogate), seconds(k1970 + kLastPtpSecond + 1)},
         CORBEL_E_INVALID_VALUE,
         kText + kTimeout + kTime},
        {{real(1.0), seconds(-3944678400)}, CORBEL_E_INVALID_VALUE, kTimeout + kTime},  // 1779
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

// Each settable tag's request as it goes on the wire: the action (SET 1, COMMAND 3) and the
// management TLV (type 0x0001, lengthField, managementId, dataField) of IEEE 1588.
TEST_F(ExpertFixture, EachSettableTagSendsItsRequestAsTheStandardLaysItOut) {
    const struct {
        tChange change;
        std::uint8_t action;
        const char* tlv;
    } cases[] = {
        {text(u"Z\u00FC"), 1, "0001 0006 0002 035AC3BC"},  // PTPText: length, UTF-8
        {u32(kxQvDomainNumber, 3), 1, "0001 0004 2007 0300"},
        {u32(kxQvPriority1, 10), 1, "0001 0004 2005 0A00"},
        {u32(kxQvPriority2, 255), 1, "0001 0004 2006 FF00"},
        {flag(kxQvSlaveOnly, 1), 1, "0001 0004 2008 0100"},
        {real(255.0), 1, "0001 0004 200A FF00"},
        {i32(kxQvLogAnnounceInterval, -1), 1, "0001 0004 2009 FF00"},
        {i32(kxQvLogSyncInterval, -127), 1, "0001 0004 200B 8100"},
        {i32(kxQvLogMinPdelayReqInterval, 127), 1, "0001 0004 6001 7F00"},
        // Whole seconds only: the fraction of a second is dropped.
        {seconds(k1970 + 0x010203040506, 1ULL << 63), 1, "0001 000C 200F 010203040506 00000000"},
        {flag(kxQvPortEnabled, 0), 3, "0001 0002 200E"},
        {flag(kxQvPortEnabled, 1), 3, "0001 0002 200D"},
    };
    for (const auto& c : cases) {
        auto bag = newBag();
        c.change(*bag.get());
        ASSERT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), S_OK);
        const auto sent = network.sentDatagrams().back();
        ASSERT_GE(sent.size(), 48U);
        EXPECT_EQ(sent[46] & 0x0F, c.action);
        EXPECT_EQ(hexText(std::vector<std::uint8_t>(sent.begin() + 48, sent.end())),
                  hexText(hexOctets(c.tlv)));
    }
}

TEST_F(ExpertFixture, ApplyWritesInChangedTagOrderAndStopsAtTheFirstFailure) {
    auto bag = newBag();
    for (const tChange& change :
         {u32(kxQvPriority2, 20), u32(kxQvPriority1, 10), u32(kxQvStepsRemoved, 1), text(u"abc"),
          flag(kxQvPortEnabled, 0)}) {
        change(*bag.get());
    }
    ULONG out = 9;
    ASSERT_EQ(expert->ApplyChanges(kPort1, bag.get(), &out), S_OK);
    EXPECT_EQ(out, 0U);
    EXPECT_EQ(newRequests(), (tIds{kUserDescription, kPriority1, kPriority2, kDisablePort}));
    EXPECT_EQ(managed.defaultDataSet.priority1, 10);
    EXPECT_FALSE(managed.port(1).enabled);

    // A host that skips validation: the first invalid value stops the write, unsent.
    bag->ClearChangedTags();
    for (const tChange& change : {text(u"x"), u32(kxQvPriority1, 300), u32(kxQvPriority2, 21)}) {
        change(*bag.get());
    }
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), CORBEL_E_INVALID_VALUE);
    EXPECT_EQ(newRequests(), tIds{kUserDescription});
    EXPECT_EQ(lastCause(), (tCause{kxQvFailureKind::invalidValue, 0, kxQvPriority1}));
    EXPECT_EQ(lastFailure(),
              "not written, the value of priority1 is not valid: Priority values must be "
              "integers within the range 0-255.");

    bag->ClearChangedTags();
    u32(kxQvPriority1, 11)(*bag.get());
    u32(kxQvPriority2, 21)(*bag.get());
    managed.failures.setters = true;
    EXPECT_EQ(expert->ApplyChanges(kPort1, bag.get(), nullptr), E_FAIL);
    EXPECT_EQ(newRequests(), tIds{kPriority1});
    EXPECT_EQ(std::get<2>(lastCause()), kxQvPriority1);
    EXPECT_EQ(expert->ApplyChanges(OLESTR("02-11-22-FF-FE-33-44-55:9"), bag.get(), nullptr),
              E_FAIL);
    bag->ClearChangedTags();
    u32(kxQvStepsRemoved, 1)(*bag.get());
    EXPECT_EQ(expert->ApplyChanges(OLESTR("no clock"), bag.get(), nullptr), S_OK);
    EXPECT_EQ(newRequests(), tIds());
}

}  // namespace
