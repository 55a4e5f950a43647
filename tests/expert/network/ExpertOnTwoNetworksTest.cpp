// The expert on a machine with two networks: ptp4l clocks behind br0, the default multicast
// interface, and ptpd behind br1. The setting "interfaces" (here QV_INTERFACES) decides
// where discovery searches; a clock is then written through the interface it answered on.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <string>
#include <vector>

#include "qv1588/qv1588.h"
#include "tests/expert/network/LoadedExpert.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace qvtest;

TEST(ExpertOnTwoNetworks, SearchesTheChosenInterfacesAndWritesThroughTheClocksOwn) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc", "tcpdump", "tshark");
    TestNetwork network({"ptp4l:domain=0", "ptp4l:domain=1", "ptpd:domain=2:net=1"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    NetworkNamespaceEntry entry(network.clientNamespace());
    ASSERT_TRUE(entry.entered()) << entry.failure();
    LoadedExpert library;
    ASSERT_NE(library.create(), nullptr) << library.failure();
    const auto& clocks = network.clocks();
    const std::vector<std::u16string> behind0 = {itemNameOf(clocks[0]), itemNameOf(clocks[1])};
    const std::vector<std::u16string> all = {behind0[0], behind0[1], itemNameOf(clocks[2])};

    const struct {
        const char* setting;  // null: no setting at all
        std::vector<std::u16string> found;
    } cases[] = {{nullptr, behind0}, {"all", all}, {"br1", {all[2]}}, {"br0", behind0}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.setting != nullptr ? c.setting : "no setting");
        c.setting != nullptr ? setenv("QV_INTERFACES", c.setting, 1) : unsetenv("QV_INTERFACES");
        IkxSysExpert2* expert = nullptr;
        ASSERT_EQ(library.create()(&expert), S_OK);
        ASSERT_EQ(expert->Initialize(), S_OK);
        if (c.found.size() == 3) {
            // Found by name before any discovery, ptpd is written through br1 alone.
            const auto sent = requestsSentDuring(network, {"br0", "br1"}, [&] {
                EXPECT_EQ(writeChanges(*expert, all[2],
                                       [](auto& bag) { bag.SetULong(kxQvPriority1, 77); }),
                          S_OK);
            });
            EXPECT_EQ(sent, (std::vector<std::string>{"", "8197\n"}));  // PRIORITY1 (0x2005)
            EXPECT_EQ(pmcValues(network, clocks[2], "PRIORITY1")["priority1"], "77");
        }
        EXPECT_EQ(itemNames(*expert), c.found);
        EXPECT_EQ(expert->Shutdown(), S_OK);
        expert->Release();
    }
    unsetenv("QV_INTERFACES");
}

}  // namespace
