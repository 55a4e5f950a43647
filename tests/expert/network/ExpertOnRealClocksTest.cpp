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
#include <thread>
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
using tValues = std::map<std::string, std::string>;

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

// pmc's text turned into the text of our value.
using tExpected = std::function<std::string(const tValues&, const std::string&)>;

std::string number(const tValues& v, const std::string& name) {
    const auto found = v.find(name);
    return found == v.end() ? "(pmc: none)" : std::to_string(std::stol(found->second, nullptr, 0));
}
std::string real(const tValues& v, const std::string& name) {
    return number(v, name) + ".0";
}
std::string asIs(const tValues& v, const std::string& name) {
    const auto found = v.find(name);
    return found == v.end() ? "(pmc: none)" : found->second;
}
// 020000.fffe.000001-1 -> 02-00-00-FF-FE-00-00-01:1; colons -> dashes for octet lists.
std::string identity(const tValues& v, const std::string& name) {
    std::string hex;
    std::string port;
    const std::string text = asIs(v, name);
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '-') {
            port = ":" + text.substr(i + 1);
            break;
        }
        if (std::isxdigit(static_cast<unsigned char>(text[i]))) {
            hex.push_back(static_cast<char>(std::toupper(text[i])));
        }
    }
    std::string result;
    for (std::size_t i = 0; i + 1 < hex.size(); i += 2) {
        result += (i == 0 ? "" : "-") + hex.substr(i, 2);
    }
    return result + port;
}
std::string octets(const tValues& v, const std::string& name, char separator) {
    std::string text = asIs(v, name);
    for (char& c : text) {
        c = c == ':' ? separator : static_cast<char>(std::toupper(c));
    }
    return text;
}
std::string state(const tValues& v, const std::string& name) {
    static const char* const kStates[] = {"INITIALIZING", "FAULTY",       "DISABLED",
                                          "LISTENING",    "PRE_MASTER",   "MASTER",
                                          "PASSIVE",      "UNCALIBRATED", "SLAVE"};
    for (int i = 0; i < 9; ++i) {
        if (asIs(v, name) == kStates[i]) {
            return std::to_string(i + 1);
        }
    }
    return "(pmc: " + asIs(v, name) + ")";
}

struct Comparison {
    kxSysAttributeTagID tag;
    const char* managementId;
    const char* name;
    tExpected expected;
};

const Comparison kComparisons[] = {
    {kxQvDomainNumber, "DEFAULT_DATA_SET", "domainNumber", number},
    {kxQvPriority1, "DEFAULT_DATA_SET", "priority1", number},
    {kxQvPriority2, "DEFAULT_DATA_SET", "priority2", number},
    {kxQvSlaveOnly, "DEFAULT_DATA_SET", "slaveOnly", number},
    {kxQvTwoStepFlag, "DEFAULT_DATA_SET", "twoStepFlag", number},
    {kxQvClockClass, "DEFAULT_DATA_SET", "clockClass", number},
    {kxQvClockAccuracy, "DEFAULT_DATA_SET", "clockAccuracy", number},
    {kxQvPortState, "PORT_DATA_SET", "portState", state},
    {kxQvAnnounceReceiptTimeout, "PORT_DATA_SET", "announceReceiptTimeout", real},
    {kxQvLogAnnounceInterval, "PORT_DATA_SET", "logAnnounceInterval", number},
    {kxQvLogSyncInterval, "PORT_DATA_SET", "logSyncInterval", number},
    {kxQvLogMinPdelayReqInterval, "PORT_DATA_SET", "logMinPdelayReqInterval", number},
    {kxQvDelayMechanism, "PORT_DATA_SET", "delayMechanism", number},
    {kxQvStepsRemoved, "CURRENT_DATA_SET", "stepsRemoved", number},
    {kxQvOffsetFromMaster, "CURRENT_DATA_SET", "offsetFromMaster", asIs},
    {kxQvMeanPathDelay, "CURRENT_DATA_SET", "meanPathDelay", asIs},
    {kxQvTimeSource, "TIME_PROPERTIES_DATA_SET", "timeSource", number},
    {kxQvPtpTimescale, "TIME_PROPERTIES_DATA_SET", "ptpTimescale", number},
    {kxQvTimeTraceable, "TIME_PROPERTIES_DATA_SET", "timeTraceable", number},
    {kxQvFrequencyTraceable, "TIME_PROPERTIES_DATA_SET", "frequencyTraceable", number},
    {kxQvParentPortIdentity, "PARENT_DATA_SET", "parentPortIdentity", identity},
    {kxQvGrandmasterIdentity, "PARENT_DATA_SET", "grandmasterIdentity", identity},
    {kxQvGrandmasterPriority1, "PARENT_DATA_SET", "grandmasterPriority1", number},
    {kxQvGrandmasterPriority2, "PARENT_DATA_SET", "grandmasterPriority2", number},
    {kxQvGrandmasterClockClass, "PARENT_DATA_SET", "gm.ClockClass", number},
    {kxQvGrandmasterClockAccuracy, "PARENT_DATA_SET", "gm.ClockAccuracy", number},
    {kxSysHardwareAddress, "CLOCK_DESCRIPTION", "physicalAddress",
     [](const tValues& v, const std::string& n) { return octets(v, n, ':'); }},
    {kxQvProfileIdentity, "CLOCK_DESCRIPTION", "profileId",
     [](const tValues& v, const std::string& n) { return octets(v, n, '-'); }},
    {kxQvUserDescription, "CLOCK_DESCRIPTION", "userDescription", asIs},
    {kxSysNetworkAddress, "CLOCK_DESCRIPTION", "protocolAddress",
     [](const tValues& v, const std::string& n) {
         const std::string text = asIs(v, n);
         return text.substr(text.find(' ') + 1);
     }},
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
        Held<IkxSysPropertyBag> bag;
        const auto started = std::chrono::steady_clock::now();
        const HRESULT result = hosted.read(clock, readableTags(), bag);
        std::printf("%s: every readable tag: 0x%08X in %lld ms\n", clock.impl.c_str(),
                    static_cast<unsigned>(result),
                    static_cast<long long>(std::chrono::duration_cast<std::chrono::milliseconds>(
                                               std::chrono::steady_clock::now() - started)
                                               .count()));
        // ptp4l refuses TIME and UTC_PROPERTIES: the read fails with the rest in the bag.
        if (clock.impl == "ptp4l") {
            EXPECT_EQ(result, E_FAIL);
            Held<IkxSysPropertyBag> refused;
            EXPECT_EQ(hosted.read(clock, {kxQvTime}, refused), E_FAIL);
            EXPECT_EQ(hosted.read(clock, {kxQvLeap59}, refused), E_FAIL);
        }
        for (const Comparison& c : kComparisons) {
            SCOPED_TRACE(c.name);
            EXPECT_EQ(textOf(*bag.p, c.tag),
                      c.expected(pmcValues(network, clock, c.managementId), c.name));
        }
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
