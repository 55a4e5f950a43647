#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "platform/DiscoveryInterfaces.h"
#include "platform/EthernetAdapters.h"
#include "platform/FindClocksTimeout.h"
#include "platform/SettingsStore.h"

using qv::dsc::osdep::DiscoveryInterfaces;
using qv::dsc::osdep::EthernetAdapters;
using qv::dsc::osdep::FindClocksTimeout;
using qv::dsc::osdep::SettingsStore;

namespace {

class SettingsTest : public ::testing::Test {
  protected:
    void SetUp() override {
        char pattern[] = "/tmp/qv-settings-XXXXXX";
        ASSERT_NE(mkdtemp(pattern), nullptr);
        root_ = pattern;
        setenv(SettingsStore::kRootVariable, root_.c_str(), 1);
    }
    void TearDown() override {
        unsetenv(SettingsStore::kRootVariable);
        std::filesystem::remove_all(root_);
    }
    void store(const std::string& text, const char* value = "findClocksTimeout") {
        const std::filesystem::path folder = root_ + "/Software/Quarvel/Corbel/qv-1588";
        std::filesystem::create_directories(folder);
        std::ofstream(folder / value) << text;
    }

    std::string root_;
};

}  // namespace

TEST_F(SettingsTest, StoredNumberIsUsedWithItsLow16Bits) {
    store("2500\n");
    EXPECT_EQ(FindClocksTimeout::read(), 2500);
    store("70000");  // 0x11170
    EXPECT_EQ(FindClocksTimeout::read(), 0x1170);
    store(" 0x1F4 ");
    EXPECT_EQ(FindClocksTimeout::read(), 500);
}

TEST_F(SettingsTest, TextThatIsNoNumberGivesTheDefault) {
    for (const char* text : {"", "abc", "12ms", "-5", "4294967296", "0x"}) {
        store(text);
        EXPECT_EQ(FindClocksTimeout::read(), 1000) << text;
    }
    const SettingsStore key(FindClocksTimeout::kKeyPath);
    EXPECT_FALSE(key.readNumber("../qv-1588/findClocksTimeout").has_value());
}

TEST_F(SettingsTest, InterfacesComeFromTheVariableBeforeTheStoredValue) {
    store("br1\n", DiscoveryInterfaces::kValueName);
    for (const auto& [variable, expected] :
         {std::pair<const char*, const char*>{nullptr, "br1\n"}, {"", "br1\n"}, {"all", "all"}}) {
        variable != nullptr ? setenv(DiscoveryInterfaces::kVariable, variable, 1)
                            : unsetenv(DiscoveryInterfaces::kVariable);
        EXPECT_EQ(DiscoveryInterfaces::read(), expected);
    }
    unsetenv(DiscoveryInterfaces::kVariable);
}

TEST(DiscoveryInterfacesTest, NamesOrIndexesChooseInTheSystemsOrderAndAnUnknownOneChoosesNone) {
    const std::vector<qv::dsc::osdep::MulticastInterface> available = {
        {"eth0", 2, 1}, {"eth1", 3, 2}, {"wlan0", 5, 3}};
    const struct {
        const char* setting;
        std::vector<std::uint32_t> chosen;
        std::string unknown;
    } cases[] = {{"", {}, ""},
                 {" ,\t", {}, ""},
                 {"all", {2, 3, 5}, ""},
                 {"eth1", {3}, ""},
                 {"wlan0,eth0", {2, 5}, ""},
                 {"5 eth0 5", {2, 5}, ""},
                 {"eth0 eth9", {}, "eth9"},
                 {"4", {}, "4"},
                 {"99999999999", {}, "99999999999"}};
    for (const auto& c : cases) {
        std::string unknown;
        std::vector<std::uint32_t> chosen;
        for (const auto& interface : DiscoveryInterfaces::choose(c.setting, available, unknown)) {
            chosen.push_back(interface.index);
        }
        EXPECT_EQ(chosen, c.chosen) << c.setting;
        EXPECT_EQ(unknown, c.unknown) << c.setting;
    }
    for (const auto& interface : qv::dsc::osdep::MulticastInterfaces::list()) {
        EXPECT_NE(interface.name, "lo");  // never loopback
    }
}

TEST(EthernetAdaptersTest, ClockIdentityIsEui64OfTheAddress) {
    const EthernetAdapters::tMacAddress mac = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
    const EthernetAdapters::tClockIdentity expected = {0x02, 0x11, 0x22, 0xFF,
                                                       0xFE, 0x33, 0x44, 0x55};
    EXPECT_EQ(EthernetAdapters::clockIdentityOf(mac), expected);
}
