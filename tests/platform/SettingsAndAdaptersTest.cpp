#include <gtest/gtest.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <string>

#include "platform/EnvironmentVariable.h"
#include "platform/EthernetAdapters.h"
#include "platform/FindClocksTimeout.h"
#include "platform/SettingsStore.h"

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
    void store(const std::string& text) {
        const std::filesystem::path folder = root_ + "/Software/Quarvel/Corbel/qv-1588";
        std::filesystem::create_directories(folder);
        std::ofstream(folder / "findClocksTimeout") << text;
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

TEST(EthernetAdaptersTest, ClockIdentityIsEui64OfTheAddress) {
    const EthernetAdapters::tMacAddress mac = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
    const EthernetAdapters::tClockIdentity expected = {0x02, 0x11, 0x22, 0xFF,
                                                       0xFE, 0x33, 0x44, 0x55};
    EXPECT_EQ(EthernetAdapters::clockIdentityOf(mac), expected);
}
