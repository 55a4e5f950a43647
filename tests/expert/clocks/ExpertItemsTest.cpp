#include <gtest/gtest.h>

#include "expert/clocks/CPtpValueFormat.h"
#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using qvtest::ExpertFixture;
using tIds = std::vector<std::uint16_t>;
using tNames = std::vector<std::string>;
const tIds kDiscovery(4, nQVPTP000::kClockDescription);  // one request per domain 0 to 3

TEST_F(ExpertFixture, ListingsRefreshEveryTimeAndAnItemLookupOnlyForAnUnknownName) {
    qvtest::NameCollector collector;
    CQVComPtr<IkxSysEnumStringList> names;
    EXPECT_EQ(expert->EnumerateItems(&collector), S_OK);
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    EXPECT_EQ(collector.names, (tNames{"02-11-22-FF-FE-33-44-55:1", "02-11-22-FF-FE-33-44-55:2"}));
    EXPECT_EQ(newRequests().size(), 2 * kDiscovery.size());

    CQVComPtr<IkxSysPropertyBag> bag;
    EXPECT_EQ(expert->GetItem(u"02-11-22-ff-fe-33-44-55:1", bag.Receive()), S_OK);
    EXPECT_EQ(qvtest::textOf(*bag.get(), kxSysNetworkAddress), "xxx.xxx.xxx.xxx");
    EXPECT_EQ(newRequests(), tIds());
    qvtest::SimulatedClock later(identity(0x56));
    network.attach(later);
    const kxSysAttributeTagID tag = kxQvPriority1;
    const char16_t* laterName = u"02-11-22-FF-FE-33-44-56:1";
    EXPECT_EQ(expert->GetItemProperties(laterName, 1, &tag, nullptr, bag.Receive()),
              CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(newRequests(), tIds());
    EXPECT_EQ(expert->GetItem(laterName, bag.Receive()), S_OK);
    EXPECT_EQ(newRequests(), kDiscovery);
    EXPECT_EQ(expert->GetItem(u"02-11-22-FF-FE-33-44-55:3", bag.Receive()),
              CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(newRequests(), kDiscovery);

    // A clock that stops answering stays an item; a network without clocks has none.
    clock.setFault(qvtest::SimulatedClock::Fault::silent);
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    qvtest::SimulatedNetwork empty;
    auto lonely = newExpert(empty);
    EXPECT_EQ(lonely->GetItemNames(names.Receive()), S_FALSE);
    EXPECT_EQ(lonely->EnumerateItems(&collector), S_FALSE);
    lonely->Shutdown();
}

TEST_F(ExpertFixture, MisuseGivesCodesNotCrashes) {
    qvtest::SimulatedNetwork other;
    auto fresh = newExpert(other, false);
    CQVComPtr<IkxSysEnumStringList> names;
    CQVComPtr<IkxSysPropertyBag> bag;
    ULONG applied = 7;
    EXPECT_EQ(fresh->GetItemNames(names.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(fresh->GetItem(kPort1, bag.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(fresh->ApplyChanges(kPort1, newBag().get(), &applied), E_NOT_VALID_STATE);
    EXPECT_EQ(applied, 0U);
    EXPECT_EQ(expert->Initialize(), QV_E_ALREADY_INITIALIZED);
    EXPECT_EQ(expert->UseTransport(other), QV_E_ALREADY_INITIALIZED);
    EXPECT_EQ(expert->GetItemProperties(kPort1, 1, nullptr, nullptr, bag.Receive()), E_POINTER);
    EXPECT_EQ(expert->GetItem(kPort1, nullptr), E_POINTER);
    GUID identifier{};
    BSTR version = nullptr;
    EXPECT_EQ(expert->GetExpertGUID(&identifier), S_OK);
    EXPECT_EQ(identifier, CLSID_QvPtpSysExpert);
    EXPECT_EQ(expert->GetVersionString(&version), S_OK);
    EXPECT_EQ(std::u16string(version), u"1.0.2");
    SysFreeString(version);
}

TEST(ItemName, ParsesAsTheHostWritesIt) {
    const std::pair<const char16_t*, int> cases[] = {
        // name, port number or -1: none
        {u"02-11-22-ff-fe-33-44-55:1", 1}, {u"02-11-22-FF-FE-33-44-55:258 more", 258},
        {u"02-11-22-FF-FE-33-44:1", -1},   {u"02-11-22-FF-FE-33-44-100:1", -1},
        {u"02-11-22-FF-FE-33-44-55", -1},  {u"02-11-22-FF-FE-33-44-\u00E9:1", -1}};
    for (const auto& [name, port] : cases) {
        const auto key = CPtpValueFormat::clockKeyOf(name);
        EXPECT_EQ(key ? ((*key)[8] << 8 | (*key)[9]) : -1, port);
    }
}

}  // namespace
