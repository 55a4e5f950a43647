// The expert on a machine with two networks: ptp4l clocks behind br0, the default multicast
// interface, and ptpd behind br1. The setting "interfaces" (here QV_INTERFACES) decides
// where discovery searches; a clock is then written through the interface it answered on.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <string>
#include <vector>

#include "qv1588/qv1588.h"
#include "tests/expert/network/LoadedExpert.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace qvtest;

std::vector<std::u16string> namesFound(IkxSysExpert2& expert) {
    std::vector<std::u16string> found;
    IkxSysEnumStringList* names = nullptr;
    if (expert.GetItemNames(&names) == S_OK) {
        for (BSTR name = nullptr; names->Next(1, &name, nullptr) == S_OK; SysFreeString(name)) {
            found.emplace_back(name);
        }
        names->Release();
    }
    return found;
}

// Sets priority1 through a bag that GetItem gave: an unknown name is asked for by name.
HRESULT setPriority1(IkxSysExpert2& expert, const std::u16string& item, ULONG value) {
    IkxSysPropertyBag* bag = nullptr;
    IkxSysPropertyBag2* changes = nullptr;
    if (expert.GetItem(item.c_str(), &bag) != S_OK) {
        return CORBEL_E_ITEM_NOT_FOUND;
    }
    bag->QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(&changes));
    changes->ClearChangedTags();
    changes->SetULong(kxQvPriority1, value);
    const HRESULT result = expert.ApplyChanges(item.c_str(), bag, nullptr);
    changes->Release();
    bag->Release();
    return result;
}

TEST(ExpertOnTwoNetworks, SearchesTheChosenInterfacesAndWritesThroughTheClocksOwn) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc", "tcpdump", "tshark");
    TestNetwork network({"ptp4l:domain=0", "ptp4l:domain=1", "ptpd:domain=2:net=1"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    NetworkNamespaceEntry entry(network.clientNamespace());
    ASSERT_TRUE(entry.entered()) << entry.failure();
    LoadedExpert library;
    ASSERT_NE(library.create(), nullptr) << library.failure();
    const TestClock& ptpd = network.clocks()[2];

    const struct {
        const char* setting;  // null: no setting at all
        std::vector<std::string> bridges;
    } cases[] = {{nullptr, {"br0"}}, {"all", {"br0", "br1"}}, {"br1", {"br1"}}, {"br0", {"br0"}}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.setting != nullptr ? c.setting : "no setting");
        c.setting != nullptr ? ::setenv("QV_INTERFACES", c.setting, 1)
                             : ::unsetenv("QV_INTERFACES");
        IkxSysExpert2* expert = nullptr;
        ASSERT_EQ(library.create()(&expert), S_OK);
        ASSERT_EQ(expert->Initialize(), S_OK);
        if (c.bridges.size() == 2) {
            // Found by name before any discovery; the SET leaves through br1 alone.
            HRESULT set = E_FAIL;
            EXPECT_EQ(
                requestsSentDuring(network, {"br0", "br1"},
                                   [&] { set = setPriority1(*expert, itemNameOf(ptpd), 77); }),
                (std::vector<std::string>{"", "8197\n"}));  // PRIORITY1 (0x2005)
            EXPECT_EQ(set, S_OK);
            EXPECT_EQ(pmcValues(network, ptpd, "PRIORITY1")["priority1"], "77");
        }
        std::vector<std::u16string> expected;
        for (const TestClock& clock : network.clocks()) {
            if (std::find(c.bridges.begin(), c.bridges.end(), clock.bridge) != c.bridges.end()) {
                expected.push_back(itemNameOf(clock));
            }
        }
        EXPECT_EQ(namesFound(*expert), expected);
        EXPECT_EQ(expert->Shutdown(), S_OK);
        expert->Release();
    }
    ::unsetenv("QV_INTERFACES");
}

}  // namespace
