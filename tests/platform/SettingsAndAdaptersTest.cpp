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

// Cases in pairs: a setting, then the names chosen, or "?" and the word that names none.
TEST_F(SettingsTest, InterfacesComeFromTheVariableOrTheStoreAndAreChosenByNameOrIndex) {
    store("br1\n", DiscoveryInterfaces::kValueName);
    setenv(DiscoveryInterfaces::kVariable, "", 1);
    EXPECT_EQ(DiscoveryInterfaces::read(), "br1\n");  // an empty variable counts as none
    setenv(DiscoveryInterfaces::kVariable, "all", 1);
    EXPECT_EQ(DiscoveryInterfaces::read(), "all");
    unsetenv(DiscoveryInterfaces::kVariable);
    const std::vector<qv::dsc::osdep::MulticastInterface> available = {
        {"eth0", 2, 1}, {"eth1", 3, 2}, {"wlan0", 5, 3}};
    const char* const cases[][2] = {{"", ""},
                                    {"all", "eth0 eth1 wlan0 "},
                                    {"wlan0,eth0", "eth0 wlan0 "},
                                    {"5 eth0\t5", "eth0 wlan0 "},
                                    {"eth0 eth9", "?eth9"},
                                    {"99999999999", "?99999999999"}};
    for (const auto& [setting, expected] : cases) {
        std::string unknown, chosen;
        for (const auto& interface : DiscoveryInterfaces::choose(setting, available, unknown)) {
            chosen += interface.name + " ";
        }
        EXPECT_EQ(unknown.empty() ? chosen : "?" + unknown, expected) << setting;
    }
}

TEST(EthernetAdaptersTest, ClockIdentityIsEui64OfTheAddress) {
    const EthernetAdapters::tMacAddress mac = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
    const EthernetAdapters::tClockIdentity expected = {0x02, 0x11, 0x22, 0xFF,
                                                       0xFE, 0x33, 0x44, 0x55};
    EXPECT_EQ(EthernetAdapters::clockIdentityOf(mac), expected);
}
