#include <gtest/gtest.h>

#include <algorithm>
#include <functional>
#include <thread>

#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using namespace nQVPTP000;
using qvtest::ExpertFixture;
using qvtest::InMemoryManagedClock;
using qvtest::tTags;
using tIds = std::vector<std::uint16_t>;

std::size_t tagCount(IkxSysPropertyBag& bag) {
    std::size_t count = 0;
    for (const kxQvAttribute& row : kxQvAttributes) {
        count += bag.HasTag(row.tag) == S_OK ? 1U : 0U;
    }
    return count;
}

TEST_F(ExpertFixture, OneRequestPerSourceInSourceOrderAndTheResultSaysWhatWasServed) {
    tTags all = qvtest::readableTags();
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
    // A refused request fails the read; every source asked for is still asked.
    managed.failures.getters = true;
    EXPECT_EQ(read({kxQvPriority1, kxQvUserDescription}, bag), E_FAIL);
    EXPECT_NE(bag.get(), nullptr);
    EXPECT_EQ(newRequests().size(), 2U);

    // Why, for this thread only.
    CQVComPtr<IkxQvLastFailure> why;
    ASSERT_EQ(expert->QueryInterface(IID_IkxQvLastFailure, reinterpret_cast<void**>(why.Receive())),
              S_OK);
    BSTR description = nullptr;
    BSTR trace = nullptr;
    EXPECT_EQ(why->GetLastFailure(&description, &trace), S_OK);
    EXPECT_EQ(std::u16string(description),
              u"reading the clock's attributes: refused by the clock: GENERAL_ERROR (Failure "
              u"getting value) (status -52012)");
    EXPECT_EQ(std::u16string(trace).substr(0, 12), u"[qvptpmgmt--");  // as the record keeps it
    SysFreeString(description);
    SysFreeString(trace);
    std::thread([&] { EXPECT_EQ(why->GetLastFailure(&description, nullptr), S_FALSE); }).join();
    EXPECT_EQ(read({kxQvPriority1}, bag), E_FAIL);
    managed.failures.getters = false;
    EXPECT_EQ(read({kxQvPriority1}, bag), S_OK);
    EXPECT_EQ(why->GetLastFailure(&description, &trace), S_FALSE);
}

TEST_F(ExpertFixture, ClockValuesAreConvertedAtTheirEdges) {
    tStatus status;
    const std::uint8_t mac[6] = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
    const std::uint8_t ip[4] = {192, 168, 1, 20};
    const std::uint8_t zeros[4] = {};
    auto& parent = managed.parentDataSet;
    auto& port = managed.port(1);
    const struct {
        std::function<void()> set;
        kxSysAttributeTagID tag;
        const char* expected;
    } cases[] = {
        {[&] { managed.time = tTimestamp(0, 999999999); }, kxQvTime, "2082844800+0"},
        {[&] { managed.time = tTimestamp(2212122496, 5); }, kxQvTime, "4294967296+0"},
        {[&] { managed.currentDataSet.offsetFromMaster.setScaledNanoseconds(-98304); },
         kxQvOffsetFromMaster, "-1.0"},
        {[&] { managed.currentDataSet.meanPathDelay.setScaledNanoseconds(98304); },
         kxQvMeanPathDelay, "1.0"},
        {[&] { port.logSyncInterval = -1; }, kxQvLogSyncInterval, "-1"},
        {[&] { port.portState = 3; }, kxQvPortEnabled, "0"},
        {[&] { port.portState = 9; }, kxQvPortEnabled, "1"},
        {[&] { port.announceReceiptTimeout = 255; }, kxQvAnnounceReceiptTimeout, "255.0"},
        {[&] { managed.timeProperties.currentUtcOffset = -5; }, kxQvCurrentUtcOffset, "4294967291"},
        {[&] { port.physicalAddress.assign(mac, mac + 6); }, kxSysHardwareAddress,
         "02:11:22:33:44:55"},
        {[&] { port.protocolAddress = tPortAddress(1, 4, ip, status); }, kxSysNetworkAddress,
         "192.168.1.20"},
        {[&] { port.protocolAddress = tPortAddress(1, 4, zeros, status); }, kxSysNetworkAddress,
         "xxx.xxx.xxx.xxx"},
        {[&] { managed.userDescription = tPTPText("caf\xE9 \xFF", status); }, kxQvUserDescription,
         "caf? ?"},
        {[&] {
             port.manufacturerIdentity = {0x02, 0xA5, 0x3C};
         },
         kxSysOwnManufacturer, "1"},
        {[&] { parent.observedParentOffsetScaledLogVariance = 3; }, kxQvParentOffsetVariance,
         "0.0"},
        {[&] { parent.parentStats = true; }, kxQvParentOffsetVariance, "8.0"},
        {[&] { parent.observedParentClockPhaseChangeRate = -7; }, kxQvParentPhaseChangeRate,
         "-7.0"},
        {[&] { parent.observedParentOffsetScaledLogVariance = 0xFFFF; }, kxQvParentOffsetVariance,
         "inf"},
        {[] {}, kxQvParentReserved, "0.0"},
        {[&] { parent.parentPortIdentity = tPortIdentity(identity(0x55), 258); },
         kxQvParentPortIdentity, "02-11-22-FF-FE-33-44-55:258"},
    };
    for (const auto& c : cases) {
        c.set();
        CQVComPtr<IkxSysPropertyBag> bag;
        read({c.tag, kxQvUserDescription}, bag);
        EXPECT_EQ(qvtest::textOf(*bag.get(), c.tag), c.expected) << std::hex << c.tag;
    }
}

}  // namespace
