// The expert as a host sees it: libqv1588.so loaded with dlopen, driven through the public
// header only, against ptp4l and ptpd on the private test network.
#include <gtest/gtest.h>

#include <dirent.h>

#include <algorithm>
#include <cctype>
#include <chrono>
#include <cstdio>
#include <functional>
#include <sstream>
#include <string>
#include <string_view>
#include <thread>
#include <tuple>
#include <vector>

#include "qv1588/corbel.h"
#include "tests/expert/clocks/BagText.h"
#include "tests/expert/network/LoadedExpert.h"
#include "tests/support/NetworkNamespaceEntry.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using namespace qvtest;
using namespace std::chrono_literals;

// Holds one reference and releases it.
template <class I>
struct Held {
    I* p = nullptr;
    ~Held() { reset(); }
    void reset() {
        if (p != nullptr) {
            p->Release();
            p = nullptr;
        }
    }
    I** out() {
        reset();
        return &p;
    }
    I* operator->() const { return p; }
};

// The expert made by the library, initialised in the client namespace.
struct HostedExpert {
    explicit HostedExpert(const TestNetwork& network) : entry(network.clientNamespace()) {
        if (entry.entered() && library.create() != nullptr &&
            library.create()(expert.out()) == S_OK) {
            initialized = expert->Initialize();
        }
    }
    ~HostedExpert() {
        if (expert.p != nullptr) {
            expert->Shutdown();
        }
    }
    std::vector<std::u16string> names() {
        std::vector<std::u16string> result;
        Held<IkxSysEnumStringList> list;
        if (expert->GetItemNames(list.out()) == S_OK) {
            BSTR name = nullptr;
            while (list->Next(1, &name, nullptr) == S_OK) {
                result.emplace_back(name);
                SysFreeString(name);
            }
        }
        return result;
    }
    HRESULT read(const TestClock& clock, const std::vector<kxSysAttributeTagID>& tags,
                 Held<IkxSysPropertyBag>& bag) {
        return expert->GetItemProperties(itemNameOf(clock).c_str(), static_cast<ULONG>(tags.size()),
                                         tags.data(), nullptr, bag.out());
    }
    // Validates and applies the changes that `change` makes in a bag of the expert's own.
    HRESULT write(const TestClock& clock, const std::function<void(IkxSysPropertyBag&)>& change) {
        Held<IkxSysPropertyBag> bag;
        EXPECT_EQ(expert->GetItem(itemNameOf(clock).c_str(), bag.out()), S_OK);
        Held<IkxSysPropertyBag2> changes;
        bag->QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(changes.out()));
        changes->ClearChangedTags();
        change(*bag.p);
        Held<IkxSysEnumPropertyTag> accepted;
        BSTR message = nullptr;
        EXPECT_EQ(expert->ValidateChanges(nullptr, bag.p, accepted.out(), &message), S_OK);
        SysFreeString(message);
        ULONG unused = 0;
        return expert->ApplyChanges(itemNameOf(clock).c_str(), bag.p, &unused);
    }

    NetworkNamespaceEntry entry;
    LoadedExpert library;
    Held<IkxSysExpert2> expert;
    HRESULT initialized = E_FAIL;
};

#define QV_ASSERT_HOSTED(hosted)                                                 \
    ASSERT_TRUE((hosted).entry.entered()) << (hosted).entry.failure();           \
    ASSERT_NE((hosted).library.create(), nullptr) << (hosted).library.failure(); \
    ASSERT_EQ((hosted).initialized, S_OK)

// One form for pmc's text and ours: the last word, pmc's port-state names and 0x numbers
// as decimal, no ".0" ending, lower case, no separators between octets or fields.
std::string canonical(const std::string& text) {
    static const std::vector<std::string> kStates = {"INITIALIZING", "FAULTY",       "DISABLED",
                                                     "LISTENING",    "PRE_MASTER",   "MASTER",
                                                     "PASSIVE",      "UNCALIBRATED", "SLAVE"};
    std::string word = text.substr(text.find_last_of(' ') + 1);
    const auto state = std::find(kStates.begin(), kStates.end(), word);
    if (state != kStates.end()) {
        return std::to_string(state - kStates.begin() + 1);
    }
    if (word.rfind("0x", 0) == 0) {
        return std::to_string(std::stoul(word, nullptr, 16));
    }
    if (word.size() > 2 && word.compare(word.size() - 2, 2, ".0") == 0) {
        word.resize(word.size() - 2);
    }
    std::string result;
    for (std::size_t i = 0; i < word.size(); ++i) {
        if (std::string_view(".:-").find(word[i]) == std::string_view::npos ||
            (i == 0 && word[i] == '-')) {
            result.push_back(static_cast<char>(std::tolower(static_cast<unsigned char>(word[i]))));
        }
    }
    return result;
}

// Our tag and the management id and name under which pmc prints the same member.
const std::tuple<kxSysAttributeTagID, const char*, const char*> kComparisons[] = {
    {kxQvDomainNumber, "DEFAULT_DATA_SET", "domainNumber"},
    {kxQvPriority1, "DEFAULT_DATA_SET", "priority1"},
    {kxQvPriority2, "DEFAULT_DATA_SET", "priority2"},
    {kxQvSlaveOnly, "DEFAULT_DATA_SET", "slaveOnly"},
    {kxQvTwoStepFlag, "DEFAULT_DATA_SET", "twoStepFlag"},
    {kxQvClockClass, "DEFAULT_DATA_SET", "clockClass"},
    {kxQvClockAccuracy, "DEFAULT_DATA_SET", "clockAccuracy"},
    {kxQvPortState, "PORT_DATA_SET", "portState"},
    {kxQvAnnounceReceiptTimeout, "PORT_DATA_SET", "announceReceiptTimeout"},
    {kxQvLogAnnounceInterval, "PORT_DATA_SET", "logAnnounceInterval"},
    {kxQvLogSyncInterval, "PORT_DATA_SET", "logSyncInterval"},
    {kxQvLogMinPdelayReqInterval, "PORT_DATA_SET", "logMinPdelayReqInterval"},
    {kxQvDelayMechanism, "PORT_DATA_SET", "delayMechanism"},
    {kxQvStepsRemoved, "CURRENT_DATA_SET", "stepsRemoved"},
    {kxQvOffsetFromMaster, "CURRENT_DATA_SET", "offsetFromMaster"},
    {kxQvMeanPathDelay, "CURRENT_DATA_SET", "meanPathDelay"},
    {kxQvTimeSource, "TIME_PROPERTIES_DATA_SET", "timeSource"},
    {kxQvPtpTimescale, "TIME_PROPERTIES_DATA_SET", "ptpTimescale"},
    {kxQvTimeTraceable, "TIME_PROPERTIES_DATA_SET", "timeTraceable"},
    {kxQvFrequencyTraceable, "TIME_PROPERTIES_DATA_SET", "frequencyTraceable"},
    {kxQvParentPortIdentity, "PARENT_DATA_SET", "parentPortIdentity"},
    {kxQvGrandmasterIdentity, "PARENT_DATA_SET", "grandmasterIdentity"},
    {kxQvGrandmasterPriority1, "PARENT_DATA_SET", "grandmasterPriority1"},
    {kxQvGrandmasterPriority2, "PARENT_DATA_SET", "grandmasterPriority2"},
    {kxQvGrandmasterClockClass, "PARENT_DATA_SET", "gm.ClockClass"},
    {kxQvGrandmasterClockAccuracy, "PARENT_DATA_SET", "gm.ClockAccuracy"},
    {kxSysHardwareAddress, "CLOCK_DESCRIPTION", "physicalAddress"},
    {kxSysNetworkAddress, "CLOCK_DESCRIPTION", "protocolAddress"},
    {kxQvProfileIdentity, "CLOCK_DESCRIPTION", "profileId"},
    {kxQvUserDescription, "CLOCK_DESCRIPTION", "userDescription"},
};

TEST(ExpertOnRealClocks, FindsExactlyTheClocksAndReadsWhatPmcReads) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc");
    TestNetwork network(
        {"ptp4l:domain=0:desc=alpha", "ptp4l:domain=1:prio1=100:desc=beta", "ptpd:domain=2"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    HostedExpert hosted(network);
    QV_ASSERT_HOSTED(hosted);

    std::vector<std::u16string> expected;
    for (const TestClock& clock : network.clocks()) {
        expected.push_back(itemNameOf(clock));
    }
    EXPECT_EQ(hosted.names(), expected);

    for (const TestClock& clock : network.clocks()) {
        SCOPED_TRACE(clock.impl + " in domain " + std::to_string(clock.domain));
        // A port may change state between pmc's read and ours: up to three rounds.
        std::string differences = "not read";
        for (int round = 0; round < 3 && !differences.empty(); ++round) {
            std::map<std::string, std::map<std::string, std::string>> pmc;
            for (const auto& [tag, managementId, name] : kComparisons) {
                if (pmc.count(managementId) == 0) {
                    pmc[managementId] = pmcValues(network, clock, managementId);
                }
            }
            Held<IkxSysPropertyBag> bag;
            // ptp4l refuses TIME and UTC_PROPERTIES: the read fails, the rest in the bag.
            EXPECT_EQ(hosted.read(clock, readableTags(), bag),
                      clock.impl == "ptp4l" ? E_FAIL : S_OK);
            differences.clear();
            for (const auto& [tag, managementId, name] : kComparisons) {
                const std::string ours = canonical(textOf(*bag.p, tag));
                const std::string theirs = canonical(pmc[managementId][name]);
                differences +=
                    ours == theirs ? "" : std::string(name) + ": " + ours + " vs " + theirs + "; ";
            }
        }
        EXPECT_EQ(differences, "");
        Held<IkxSysPropertyBag> refused;
        const HRESULT refusal = clock.impl == "ptp4l" ? E_FAIL : S_OK;
        EXPECT_EQ(hosted.read(clock, {kxQvTime}, refused), refusal);
        EXPECT_EQ(hosted.read(clock, {kxQvLeap59}, refused), refusal);
        Held<IkxQvLastFailure> why;
        hosted.expert->QueryInterface(IID_IkxQvLastFailure, reinterpret_cast<void**>(why.out()));
        BSTR description = nullptr;
        EXPECT_EQ(why->GetLastFailure(&description, nullptr), refusal == S_OK ? S_FALSE : S_OK);
        std::string reason;
        for (const OLECHAR* unit = description; unit != nullptr && *unit != 0; ++unit) {
            reason.push_back(static_cast<char>(*unit));
        }
        // A refusal, not a time-out: the read failed as soon as ptp4l answered.
        EXPECT_EQ(reason, refusal == S_OK ? ""
                                          : "reading the clock's attributes: refused by the "
                                            "clock: NOT_SUPPORTED (status -52012)");
        SysFreeString(description);
    }
}

// Every SET and COMMAND that went to br0 while `action` ran, as tshark names them.
std::vector<std::string> requestsSentDuring(const TestNetwork& network,
                                            const std::function<void()>& action) {
    const std::string file = "/tmp/qv-expert-" + network.prefix() + ".pcap";
    std::thread capture(
        [&] { network.runInClient("timeout 3 tcpdump -U -i br0 -w " + file + " udp port 320"); });
    for (int i = 0; i < 100 && runCommand("test -s " + file).exitStatus != 0; ++i) {
        std::this_thread::sleep_for(20ms);
    }
    action();
    capture.join();
    const CommandResult decoded =
        runCommand("tshark -r " + file +
                   " -Y 'ptp.v2.mm.action == 1 || ptp.v2.mm.action == 3' -T fields -e "
                   "ptp.v2.mm.managementId 2>/dev/null; rm -f " +
                   file);
    std::vector<std::string> ids;
    std::istringstream lines(decoded.output);
    for (std::string line; std::getline(lines, line);) {
        ids.push_back(line);
    }
    return ids;
}

TEST(ExpertOnRealClocks, WritesReachPtpdAndStopAtPtp4lsFirstRefusal) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "ptpd", "pmc", "tcpdump", "tshark");
    TestNetwork network({"ptpd:domain=0", "ptp4l:domain=1:prio1=99"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    HostedExpert hosted(network);
    QV_ASSERT_HOSTED(hosted);
    ASSERT_EQ(hosted.names().size(), 2U);
    const TestClock& ptpd = network.clocks()[0];
    const TestClock& ptp4l = network.clocks()[1];

    EXPECT_EQ(hosted.write(ptpd,
                           [](IkxSysPropertyBag& b) {
                               b.SetULong(kxQvPriority1, 77);
                               b.SetULong(kxQvPriority2, 78);
                               b.SetString(kxQvUserDescription, u"renamed;by;qv");
                               b.SetLong(kxQvLogAnnounceInterval, 2);
                           }),
              S_OK);
    EXPECT_EQ(pmcValues(network, ptpd, "PRIORITY1")["priority1"], "77");
    EXPECT_EQ(pmcValues(network, ptpd, "PRIORITY2")["priority2"], "78");
    EXPECT_EQ(pmcValues(network, ptpd, "USER_DESCRIPTION")["userDescription"], "renamed;by;qv");
    EXPECT_EQ(pmcValues(network, ptpd, "LOG_ANNOUNCE_INTERVAL")["logAnnounceInterval"], "2");

    EXPECT_EQ(hosted.write(ptpd, [](IkxSysPropertyBag& b) { b.SetBool(kxQvPortEnabled, 0); }),
              S_OK);
    EXPECT_EQ(pmcValues(network, ptpd, "PORT_DATA_SET")["portState"], "DISABLED");
    EXPECT_EQ(hosted.write(ptpd, [](IkxSysPropertyBag& b) { b.SetBool(kxQvPortEnabled, 1); }),
              S_OK);
    // ptpd restarts its engine on ENABLE_PORT and is silent for a moment.
    std::string portState;
    for (int i = 0; i < 50 && (portState.empty() || portState == "DISABLED"); ++i) {
        std::this_thread::sleep_for(100ms);
        portState = pmcValues(network, ptpd, "PORT_DATA_SET")["portState"];
    }
    EXPECT_NE(portState, "DISABLED");

    HRESULT refused = S_OK;
    const auto sent = requestsSentDuring(network, [&] {
        refused = hosted.write(ptp4l, [](IkxSysPropertyBag& b) {
            b.SetULong(kxQvPriority1, 33);
            b.SetULong(kxQvPriority2, 34);
        });
    });
    EXPECT_EQ(refused, E_FAIL);
    EXPECT_EQ(sent, std::vector<std::string>{"8197"});  // PRIORITY1 (0x2005) only
    EXPECT_EQ(pmcValues(network, ptp4l, "PRIORITY1")["priority1"], "99");
}

std::size_t entriesOf(const char* folder) {
    std::size_t count = 0;
    if (DIR* dir = ::opendir(folder)) {
        while (::readdir(dir) != nullptr) {
            ++count;
        }
        ::closedir(dir);
    }
    return count;
}

TEST(ExpertOnRealClocks, AThousandLivesLeaveNoDescriptorOrThreadBehind) {
    QV_REQUIRE_TEST_NETWORK();
    TestNetwork network({"none"});
    ASSERT_TRUE(network.isUp()) << network.failure();
    NetworkNamespaceEntry entry(network.clientNamespace());
    ASSERT_TRUE(entry.entered()) << entry.failure();
    LoadedExpert library;
    ASSERT_NE(library.create(), nullptr) << library.failure();
    const std::size_t descriptors = entriesOf("/proc/self/fd");
    const std::size_t threads = entriesOf("/proc/self/task");
    for (int i = 0; i < 1000; ++i) {
        Held<IkxSysExpert2> expert;
        ASSERT_EQ(library.create()(expert.out()), S_OK);
        ASSERT_EQ(expert->Initialize(), S_OK);
        ASSERT_EQ(expert->Shutdown(), S_OK);
    }
    EXPECT_EQ(entriesOf("/proc/self/fd"), descriptors);
    EXPECT_EQ(entriesOf("/proc/self/task"), threads);
}

}  // namespace
