#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "expert/clocks/CPtpValueFormat.h"
#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using qvtest::ExpertFixture;
using tIds = std::vector<std::uint16_t>;
constexpr std::uint16_t kDescription = nQVPTP000::kClockDescription;

std::vector<std::u16string> namesOf(IkxSysEnumStringList& names) {
    std::vector<std::u16string> result;
    BSTR name = nullptr;
    while (names.Next(1, &name, nullptr) == S_OK) {
        result.emplace_back(name);
        SysFreeString(name);
    }
    return result;
}

struct Collector final : IkxSysItemCollector {
    HRESULT KXSYS_CALL QueryInterface(const IID&, void**) override { return E_NOINTERFACE; }
    ULONG KXSYS_CALL AddRef() override { return 2; }
    ULONG KXSYS_CALL Release() override { return 1; }
    HRESULT KXSYS_CALL ReservedCollector1() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL ReservedCollector2() override { return E_NOTIMPL; }
    HRESULT KXSYS_CALL AddItem(IkxSysPropertyBag* item) override {
        BSTR name = nullptr;
        item->GetString(kxQvClockPortName, &name);
        names.emplace_back(name);
        SysFreeString(name);
        return S_OK;
    }
    std::vector<std::u16string> names;
};

TEST_F(ExpertFixture, DiscoveryNamesEveryPortAndEveryListingRefreshes) {
    CQVComPtr<IkxSysEnumStringList> names;
    ASSERT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    const std::vector<std::u16string> expected = {kPort1, u"02-11-22-FF-FE-33-44-55:2"};
    EXPECT_EQ(namesOf(*names.get()), expected);
    Collector collector;
    EXPECT_EQ(expert->EnumerateItems(&collector), S_OK);
    EXPECT_EQ(collector.names, expected);
    EXPECT_EQ(newRequests(), tIds(8, kDescription));  // four domains, twice

    // A clock that stops answering stays an item; one that never answered is no item.
    clock.setFault(qvtest::SimulatedClock::Fault::silent);
    EXPECT_EQ(expert->GetItemNames(names.Receive()), S_OK);
    EXPECT_EQ(namesOf(*names.get()), expected);
    qvtest::SimulatedNetwork empty;
    auto lonely = newExpert(empty);
    EXPECT_EQ(lonely->GetItemNames(names.Receive()), S_FALSE);
    EXPECT_EQ(lonely->EnumerateItems(&collector), S_FALSE);
    EXPECT_EQ(collector.names.size(), 2U);
    lonely->Shutdown();
}

TEST_F(ExpertFixture, GetItemRefreshesOnceForAnUnknownNameAndPropertyReadsNever) {
    CQVComPtr<IkxSysPropertyBag> bag;
    ASSERT_EQ(expert->GetItem(u"02-11-22-ff-fe-33-44-55:1", bag.Receive()), S_OK);
    BSTR address = nullptr;
    EXPECT_EQ(bag->GetString(kxSysNetworkAddress, &address), S_OK);
    EXPECT_EQ(std::u16string(address), u"xxx.xxx.xxx.xxx");
    SysFreeString(address);
    EXPECT_EQ(newRequests(), tIds());

    qvtest::SimulatedClock later(identity(0x56));
    network.attach(later);
    const kxSysAttributeTagID tag = kxQvPriority1;
    EXPECT_EQ(
        expert->GetItemProperties(u"02-11-22-FF-FE-33-44-56:1", 1, &tag, nullptr, bag.Receive()),
        CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(newRequests(), tIds());
    EXPECT_EQ(expert->GetItem(u"02-11-22-FF-FE-33-44-56:1", bag.Receive()), S_OK);
    EXPECT_EQ(newRequests(), tIds(4, kDescription));
    EXPECT_EQ(expert->GetItem(u"02-11-22-FF-FE-33-44-55:3", bag.Receive()),
              CORBEL_E_ITEM_NOT_FOUND);
    EXPECT_EQ(bag.get(), nullptr);
    EXPECT_EQ(newRequests(), tIds(4, kDescription));
}

TEST_F(ExpertFixture, LifecycleErrorsAreCodesNotCrashes) {
    qvtest::SimulatedNetwork other;
    auto fresh = newExpert(other, false);
    CQVComPtr<IkxSysEnumStringList> names;
    CQVComPtr<IkxSysPropertyBag> bag;
    const kxSysAttributeTagID tag = kxQvPriority1;
    ULONG applied = 7;
    EXPECT_EQ(fresh->GetItemNames(names.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(fresh->GetItem(kPort1, bag.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(fresh->GetItemProperties(kPort1, 1, &tag, nullptr, bag.Receive()), E_NOT_VALID_STATE);
    EXPECT_EQ(fresh->ApplyChanges(kPort1, newBag().get(), &applied), E_NOT_VALID_STATE);
    EXPECT_EQ(applied, 0U);
    EXPECT_EQ(fresh->Shutdown(), S_OK);
    EXPECT_EQ(expert->Initialize(), QV_E_ALREADY_INITIALIZED);
    EXPECT_EQ(expert->UseTransport(other), QV_E_ALREADY_INITIALIZED);
    EXPECT_EQ(expert->GetItemProperties(kPort1, 1, nullptr, nullptr, bag.Receive()), E_POINTER);

    GUID identifier{};
    BSTR version = nullptr;
    EXPECT_EQ(expert->GetExpertGUID(&identifier), S_OK);
    EXPECT_EQ(identifier, CLSID_QvPtpSysExpert);
    EXPECT_EQ(expert->GetVersionString(&version), S_OK);
    EXPECT_EQ(std::u16string(version), u"1.0.2");
    SysFreeString(version);
    void* same = nullptr;
    EXPECT_EQ(expert->QueryInterface(IID_IkxSysExpert, &same), S_OK);
    EXPECT_EQ(same, static_cast<IkxSysExpert*>(expert.get()));
    expert->Release();
    EXPECT_EQ(expert->ReservedOperation1(nullptr), E_NOTIMPL);
}

TEST(ItemName, ParsesAsTheHostWritesIt) {
    struct Case {
        const char16_t* name;
        bool found;
        std::uint8_t portHigh;
        std::uint8_t portLow;
    };
    const Case cases[] = {
        {u"02-11-22-FF-FE-33-44-55:1", true, 0x00, 0x01},
        {u"02-11-22-ff-fe-33-44-55:1", true, 0x00, 0x01},
        {u"02-11-22-FF-FE-33-44-55:258 and more", true, 0x01, 0x02},
        {u"02-11-22-FF-FE-33-44:1", false, 0, 0},
        {u"02-11-22-FF-FE-33-44-100:1", false, 0, 0},
        {u"02-11-22-FF-FE-33-44-55", false, 0, 0},
        {u"02-11-22-FF-FE-33-44-\u00E9:1", false, 0, 0},
    };
    for (const Case& c : cases) {
        const auto key = CPtpValueFormat::clockKeyOf(c.name);
        ASSERT_EQ(key.has_value(), c.found);
        if (c.found) {
            EXPECT_EQ((*key)[7], 0x55);
            EXPECT_EQ((*key)[8], c.portHigh);
            EXPECT_EQ((*key)[9], c.portLow);
        }
    }
}

}  // namespace
