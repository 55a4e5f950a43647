#include <gtest/gtest.h>

#include <ctime>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <type_traits>
#include <vector>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using P = nQVPTPMGMT000::tPTPClockProxy;
using qvtest::describe;
using std::to_string;

std::string identityText(const nQVPTP000::tClockIdentity& identity) {
    std::array<std::uint8_t, 8> octets{};
    for (std::size_t i = 0; i < octets.size(); ++i) {
        octets[i] = identity[i];
    }
    return qvtest::pmcClockIdentity(octets);
}

std::string portText(const nQVPTP000::tPortIdentity& port) {
    return identityText(port.getClockIdentity()) + "-" + to_string(port.getPortNumber());
}

std::string octetText(std::span<const std::uint8_t> octets) {
    std::string text;
    char part[4];
    for (std::uint8_t octet : octets) {
        std::snprintf(part, sizeof part, "%02x:", octet);
        text += part;
    }
    return text.empty() ? text : text.substr(0, text.size() - 1);
}

std::string addressText(const nQVPTP000::tPortAddress& address) {
    const std::uint8_t* a = address.getAddressField();
    return address.getAddressLength() != 4
               ? "(length " + to_string(address.getAddressLength()) + ")"
               : to_string(address.getNetworkProtocol()) + " " + to_string(a[0]) + "." +
                     to_string(a[1]) + "." + to_string(a[2]) + "." + to_string(a[3]);
}

std::string show(const std::string& text) {
    return text;
}
std::string show(const nQVPTP000::tPTPText& text) {
    return std::string(reinterpret_cast<const char*>(text.getTextField()), text.getLengthField());
}
std::string show(const nQVPTP000::tClockIdentity& identity) {
    return identityText(identity);
}
std::string show(const nQVPTP000::tPortIdentity& port) {
    return portText(port);
}
std::string show(std::span<const std::uint8_t> octets) {
    return octetText(octets);
}
std::string show(const nQVPTP000::tPortAddress& address) {
    return addressText(address);
}
template <typename Number>
requires std::is_arithmetic_v<Number> std::string show(Number value) {
    return to_string(static_cast<long>(value));
}

std::string userDescription(P& p, tStatus& s) {
    char text[128] = {};
    p.getUserDescription(text, sizeof text, s);
    return text;
}
std::string cachedRevision(P& p, tStatus& s) {
    char text[128] = {};
    p.getRevisionData(text, sizeof text, s);
    return text;
}
long clockType(const nQVPTP000::tClockDescriptionTLV& d) {
    return (d.getOrdinaryClock() ? 0x8000 : 0) | (d.getBoundaryClock() ? 0x4000 : 0) |
           (d.getP2PTransparentClock() ? 0x2000 : 0) | (d.getE2ETransparentClock() ? 0x1000 : 0) |
           (d.getManagementNode() ? 0x0800 : 0);
}

// One value that pmc prints: the management id pmc asks for, the name of pmc's line, and
// our reading of it as text (numbers in decimal; pmc's hexadecimal ones are compared as
// numbers).
struct Row {
    const char* id;
    const char* name;
    std::string (*ours)(P&, tStatus&);
};

#define QV_ROW(id, name, read)                                \
    Row {                                                     \
        id, name, [](P& p, tStatus& s) { return show(read); } \
    }

// The values the client reads itself, and from every data set and description the
// fields that tell one clock or one decoding from another: the corpus tests compare every
// field of these answers as the real clocks send them.
const Row kRows[] = {
    QV_ROW("PRIORITY1", "priority1", p.getPriority1(s)),
    QV_ROW("PRIORITY2", "priority2", p.getPriority2(s)),
    QV_ROW("DOMAIN", "domainNumber", p.getDomain(s)),
    QV_ROW("SLAVE_ONLY", "slaveOnly", p.getSlaveOnly(s)),
    QV_ROW("LOG_ANNOUNCE_INTERVAL", "logAnnounceInterval", p.getLogAnnounceInterval(s)),
    QV_ROW("ANNOUNCE_RECEIPT_TIMEOUT", "announceReceiptTimeout", p.getAnnounceReceiptTimeout(s)),
    QV_ROW("LOG_SYNC_INTERVAL", "logSyncInterval", p.getLogSyncInterval(s)),
    QV_ROW("VERSION_NUMBER", "versionNumber", p.getVersionNumber(s)),
    QV_ROW("CLOCK_ACCURACY", "clockAccuracy", p.getClockAccuracy(s)),
    QV_ROW("DELAY_MECHANISM", "delayMechanism", p.getDelayMechanism(s)),
    QV_ROW("LOG_MIN_PDELAY_REQ_INTERVAL", "logMinPdelayReqInterval",
           p.getLogMinPdelayReqInterval(s)),
    QV_ROW("DEFAULT_DATA_SET", "clockClass", p.getDefaultDataSet(s).getClockQuality().clockClass),
    QV_ROW("DEFAULT_DATA_SET", "priority2", p.getDefaultDataSet(s).getPriority2()),
    QV_ROW("DEFAULT_DATA_SET", "clockIdentity", p.getDefaultDataSet(s).getClockIdentity()),
    QV_ROW("CURRENT_DATA_SET", "stepsRemoved", p.getCurrentDataSet(s).getStepsRemoved()),
    QV_ROW("PARENT_DATA_SET", "grandmasterPriority1",
           p.getParentDataSet(s).getGrandmasterPriority1()),
    QV_ROW("PARENT_DATA_SET", "grandmasterIdentity",
           p.getParentDataSet(s).getGrandmasterIdentity()),
    QV_ROW("TIME_PROPERTIES_DATA_SET", "currentUtcOffset",
           p.getTimePropertiesDataSet(s).getCurrentUtcOffset()),
    QV_ROW("TIME_PROPERTIES_DATA_SET", "timeSource", p.getTimePropertiesDataSet(s).getTimeSource()),
    QV_ROW("PORT_DATA_SET", "portIdentity", p.getPortDataSet(s).getPortIdentity()),
    QV_ROW("PORT_DATA_SET", "logSyncInterval", p.getPortDataSet(s).getLogSyncInterval()),
    QV_ROW("TRACEABILITY_PROPERTIES", "timeTraceable",
           p.getTraceabilityProperties(s).getTimeTraceable()),
    QV_ROW("TRACEABILITY_PROPERTIES", "frequencyTraceable",
           p.getTraceabilityProperties(s).getFrequencyTraceable()),
    QV_ROW("USER_DESCRIPTION", "userDescription", userDescription(p, s)),
    QV_ROW("CLOCK_DESCRIPTION", "clockType", clockType(p.refreshClockDescription(s))),
    QV_ROW("CLOCK_DESCRIPTION", "physicalAddress",
           p.refreshClockDescription(s).getPhysicalAddress()),
    QV_ROW("CLOCK_DESCRIPTION", "protocolAddress",
           p.refreshClockDescription(s).getProtocolAddress()),
    QV_ROW("CLOCK_DESCRIPTION", "productDescription",
           p.refreshClockDescription(s).getProductDescription()),
    QV_ROW("CLOCK_DESCRIPTION", "revisionData", p.refreshClockDescription(s).getRevisionData()),
    QV_ROW("CLOCK_DESCRIPTION", "profileId", p.refreshClockDescription(s).getProfileIdentity()),
    // The refreshed description is now the cached one.
    QV_ROW("CLOCK_DESCRIPTION", "revisionData", cachedRevision(p, s)),
};

// A whole text as a number (decimal, or hexadecimal with "0x"), if it is one.
std::optional<long> numberIn(const std::string& text) {
    try {
        std::size_t used = 0;
        const long value = std::stol(text, &used, text.rfind("0x", 0) == 0 ? 16 : 10);
        return used == text.size() ? std::optional<long>(value) : std::nullopt;
    } catch (const std::exception&) {
        return std::nullopt;
    }
}

// Equal as numbers when both are numbers (pmc prints some in hexadecimal), else as text.
bool sameValue(const std::string& ours, const std::string& pmc) {
    const auto number = numberIn(ours);
    return number && numberIn(pmc) ? number == numberIn(pmc) : ours == pmc;
}

// Brings up the clock, finds it, and checks every row against pmc (one pmc run per id).
void expectEveryRowAgrees(const std::string& clockSpec, const std::function<void(P&)>& more) {
    qvtest::TestNetwork network({clockSpec});
    ASSERT_TRUE(network.isUp()) << network.failure();
    qvtest::ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), 1u);
    std::map<std::string, std::map<std::string, std::string>> pmc;
    for (const Row& row : kRows) {
        SCOPED_TRACE(std::string(row.id) + " " + row.name);
        if (pmc.count(row.id) == 0) {
            pmc[row.id] = qvtest::pmcGet(network, network.clocks()[0], row.id);
        }
        const auto theirs = pmc[row.id].find(row.name);
        ASSERT_NE(theirs, pmc[row.id].end()) << "pmc printed no such line";
        tStatus own;
        const std::string ours = row.ours(*proxies[0], own);
        EXPECT_TRUE(own.succeeded()) << describe(own);
        EXPECT_TRUE(sameValue(ours, theirs->second)) << ours << " vs pmc " << theirs->second;
    }
    more(*proxies[0]);
}

TEST(Reading, EveryGetOfPtp4lAgreesWithPmc) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    expectEveryRowAgrees("ptp4l:domain=1:prio1=91:prio2=92:desc=reader", [](P& p) {
        tStatus status;
        p.getNullManagement(status);
        EXPECT_TRUE(status.succeeded()) << describe(status);
        // ptp4l answers TIME and UTC_PROPERTIES with an error status: the exchange fails.
        tStatus time;
        p.getTime(time);
        EXPECT_EQ(time.code, kStatusNoData);
        tStatus utc;
        p.getUTCProperties(utc);
        EXPECT_EQ(utc.code, kStatusNoData);
    });
}

TEST(Reading, EveryGetOfPtpdAgreesWithPmc) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    expectEveryRowAgrees("ptpd:domain=2:prio1=81:prio2=82", [](P& p) {
        // pmc cannot ask for TIME or UTC_PROPERTIES; ptpd answers both. It does not adjust
        // the machine's clock, so its time is the machine's (PTP seconds are TAI: UTC plus
        // the clock's UTC offset).
        tStatus status;
        const auto utc = p.getUTCProperties(status);
        const auto properties = p.getTimePropertiesDataSet(status);
        EXPECT_EQ(utc.getCurrentUtcOffset(), properties.getCurrentUtcOffset());
        EXPECT_EQ(utc.getCurrentUtcOffsetValid(), properties.getCurrentUtcOffsetValid());
        EXPECT_EQ(utc.getLeap61(), properties.getLeap61());
        EXPECT_EQ(utc.getLeap59(), properties.getLeap59());
        const auto time = p.getTime(status);
        EXPECT_TRUE(status.succeeded()) << describe(status);
        const auto now = static_cast<long long>(std::time(nullptr));
        const auto seconds = static_cast<long long>(time.getSeconds());
        EXPECT_LE(std::llabs(seconds - utc.getCurrentUtcOffset() - now), 2) << seconds;
        EXPECT_LT(time.getNanoseconds(), 1000000000u);
    });
}

}  // namespace
