// The expert as a host sees it: libqv1588.so loaded with dlopen, driven through the public
// header only, against ptp4l and ptpd on the private test network.
#include <dirent.h>
#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <map>
#include <string>
#include <thread>
#include <tuple>
#include <vector>

#include "qv1588/qv1588.h"
#include "tests/expert/network/LoadedExpert.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace qvtest;
using namespace std::chrono_literals;
using tValues = std::map<std::string, std::string>;

// One form for pmc's text and ours: the last word, 0x numbers as decimal, no ".0" ending,
// lower case, no separators between octets or fields.
std::string canonical(const std::string& text) {
    std::string word = text.substr(text.find_last_of(' ') + 1);
    if (word.rfind("0x", 0) == 0) {
        return std::to_string(std::stoul(word, nullptr, 16));
    }
    if (word.ends_with(".0")) {
        word.resize(word.size() - 2);
    }
    std::string result;
    for (std::size_t i = 0; i < word.size(); ++i) {
        if (std::string(".:-").find(word[i]) == std::string::npos || (i == 0 && word[i] == '-')) {
            result.push_back(static_cast<char>(std::tolower(static_cast<unsigned char>(word[i]))));
        }
    }
    return result;
}

// Our tag and the management id and name under which pmc prints the same member: members of
// every group that both clocks serve, in every conversion; none that changes while a lone
// clock settles.
const std::tuple<kxSysAttributeTagID, const char*, const char*> kComparisons[] = {
    {kxQvDomainNumber, "DEFAULT_DATA_SET", "domainNumber"},
    {kxQvPriority1, "DEFAULT_DATA_SET", "priority1"},
    {kxQvClockAccuracy, "DEFAULT_DATA_SET", "clockAccuracy"},
    {kxQvAnnounceReceiptTimeout, "PORT_DATA_SET", "announceReceiptTimeout"},
    {kxQvLogSyncInterval, "PORT_DATA_SET", "logSyncInterval"},
    {kxQvTimeSource, "TIME_PROPERTIES_DATA_SET", "timeSource"},
    {kxQvParentPortIdentity, "PARENT_DATA_SET", "parentPortIdentity"},
    {kxSysHardwareAddress, "CLOCK_DESCRIPTION", "physicalAddress"},
    {kxSysNetworkAddress, "CLOCK_DESCRIPTION", "protocolAddress"},
    {kxQvUserDescription, "CLOCK_DESCRIPTION", "userDescription"},
};

std::size_t entriesOf(const char* folder) {
    std::size_t count = 0;
    DIR* dir = ::opendir(folder);
    while (dir != nullptr && ::readdir(dir) != nullptr) {
        ++count;
    }
    ::closedir(dir);
    return count;
}

TEST(ExpertOnRealClocks, FindsReadsWritesAndLeavesNothingBehind) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc", "tcpdump", "tshark");
    TestNetwork network({"ptpd:domain=0", "ptp4l:domain=1:prio1=99:desc=beta", "ptp4l:domain=2"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    NetworkNamespaceEntry entry(network.clientNamespace());
    ASSERT_TRUE(entry.entered()) << entry.failure();
    LoadedExpert library;
    const createCorbelExpertFunction create = library.create();
    ASSERT_NE(create, nullptr) << library.failure();

    // A thousand lives leave no descriptor or thread behind (and no byte, under LSan).
    const std::size_t descriptors = entriesOf("/proc/self/fd");
    const std::size_t threads = entriesOf("/proc/self/task");
    for (int i = 0; i < 1000; ++i) {
        IkxSysExpert2* expert = nullptr;
        ASSERT_EQ(create(&expert), S_OK);
        ASSERT_EQ(expert->Initialize(), S_OK);
        ASSERT_EQ(expert->Shutdown(), S_OK);
        expert->Release();
    }
    EXPECT_EQ(entriesOf("/proc/self/fd"), descriptors);
    // A joined thread leaves the task list a moment after join returns: wait for it.
    for (int i = 0; i < 500 && entriesOf("/proc/self/task") != threads; ++i) {
        std::this_thread::sleep_for(10ms);
    }
    EXPECT_EQ(entriesOf("/proc/self/task"), threads);

    IkxSysExpert2* expert = nullptr;
    ASSERT_EQ(create(&expert), S_OK);
    ASSERT_EQ(expert->Initialize(), S_OK);
    std::vector<std::u16string> expected;
    for (const TestClock& clock : network.clocks()) {
        expected.push_back(itemNameOf(clock));
    }
    EXPECT_EQ(itemNames(*expert), expected);

    // ptp4l refuses TIME and UTC_PROPERTIES: the read fails, the rest is in the bag.
    const std::vector<kxSysAttributeTagID> readable = readableTags();
    for (const TestClock& clock : network.clocks()) {
        SCOPED_TRACE(clock.impl + " in domain " + std::to_string(clock.domain));
        IkxSysPropertyBag* bag = nullptr;
        EXPECT_EQ(expert->GetItemProperties(itemNameOf(clock).c_str(),
                                            static_cast<ULONG>(readable.size()), readable.data(),
                                            nullptr, &bag),
                  clock.impl == "ptp4l" ? E_FAIL : S_OK);
        std::map<std::string, tValues> theirs;
        for (const auto& [tag, id, name] : kComparisons) {
            theirs.try_emplace(id, pmcValues(network, clock, id));
            EXPECT_EQ(canonical(textOf(*bag, tag)), canonical(theirs[id][name])) << name;
        }
        bag->Release();
    }
    auto write = [&](const TestClock& clock, const tChange& change) {
        return writeChanges(*expert, itemNameOf(clock), change);
    };
    const TestClock& ptpd = network.clocks()[0];
    EXPECT_EQ(write(ptpd,
                    [](IkxSysPropertyBag2& b) {
                        b.SetULong(kxQvPriority1, 77);
                        b.SetULong(kxQvPriority2, 78);
                        b.SetString(kxQvUserDescription, u"Z\u00FCrich \u2013 \u6771\u4EAC");
                        b.SetLong(kxQvLogAnnounceInterval, 2);
                    }),
              S_OK);
    EXPECT_EQ(pmcValues(network, ptpd, "PRIORITY1")["priority1"], "77");
    EXPECT_EQ(pmcValues(network, ptpd, "PRIORITY2")["priority2"], "78");
    // PTP texts are UTF-8, whatever the locale (this process sets none).
    EXPECT_EQ(pmcValues(network, ptpd, "USER_DESCRIPTION")["userDescription"],
              "Z\xC3\xBCrich \xE2\x80\x93 \xE6\x9D\xB1\xE4\xBA\xAC");
    IkxSysPropertyBag* readBack = nullptr;
    const kxSysAttributeTagID description = kxQvUserDescription;
    EXPECT_EQ(
        expert->GetItemProperties(itemNameOf(ptpd).c_str(), 1, &description, nullptr, &readBack),
        S_OK);
    EXPECT_EQ(textOf(*readBack, kxQvUserDescription), "Z\\u00FCrich \\u2013 \\u6771\\u4EAC");
    readBack->Release();
    EXPECT_EQ(pmcValues(network, ptpd, "LOG_ANNOUNCE_INTERVAL")["logAnnounceInterval"], "2");
    EXPECT_EQ(write(ptpd, [](IkxSysPropertyBag2& b) { b.SetBool(kxQvPortEnabled, 0); }), S_OK);
    EXPECT_EQ(pmcValues(network, ptpd, "PORT_DATA_SET")["portState"], "DISABLED");
    EXPECT_EQ(write(ptpd, [](IkxSysPropertyBag2& b) { b.SetBool(kxQvPortEnabled, 1); }), S_OK);

    const TestClock& ptp4l = network.clocks()[1];
    HRESULT refused = S_OK;
    EXPECT_EQ(requestsSentDuring(network, {"br0"},
                                 [&] {
                                     refused = write(ptp4l, [](IkxSysPropertyBag2& b) {
                                         b.SetULong(kxQvPriority1, 33);
                                         b.SetULong(kxQvPriority2, 34);
                                     });
                                 }),
              std::vector<std::string>{"8197\n"});  // PRIORITY1 (0x2005) only
    EXPECT_EQ(refused, E_FAIL);
    EXPECT_EQ(pmcValues(network, ptp4l, "PRIORITY1")["priority1"], "99");
    EXPECT_EQ(expert->Shutdown(), S_OK);
    expert->Release();
}

}  // namespace
