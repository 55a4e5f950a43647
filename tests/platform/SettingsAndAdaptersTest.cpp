#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "platform/DiscoveryInterfaces.h"
#include "platform/EnvironmentVariable.h"
#include "platform/EthernetAdapters.h"
#include "platform/FindClocksTimeout.h"
#include "platform/SettingsStore.h"

using qv::dsc::osdep::DiscoveryInterfaces;
using qv::dsc::osdep::EnvironmentVariable;
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
        unsetenv(FindClocksTimeout::kOverrideVariable);
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

// The stored number, or this process's override when it holds a number; low 16 bits.
TEST_F(SettingsTest, StoredNumberOrTheProcessOverrideGivesTheWait) {
    const struct {
        const char* stored;
        const char* variable;
        std::uint16_t wait;
    } cases[] = {
        {"2500\n", nullptr, 2500},     {"70000", nullptr, 0x1170},
        {" 0x1F4 ", nullptr, 500},     {"", nullptr, 1000},
        {"abc", nullptr, 1000},        {"12ms", nullptr, 1000},
        {"-5", nullptr, 1000},         {"4294967296", nullptr, 1000},
        {"0x", nullptr, 1000},         {"2500", "300", 300},
        {"2500", " 0x11170 ", 0x1170}, {"2500", "0", 0},
        {"2500", "abc", 2500},         {"abc", "", 1000},
    };
    for (const auto& c : cases) {
        store(c.stored);
        EnvironmentVariable::set(FindClocksTimeout::kOverrideVariable, c.variable);
        EXPECT_EQ(FindClocksTimeout::read(), c.wait)
            << c.stored << " / " << (c.variable ? c.variable : "-");
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
