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

std::string show(const std::string& text) {
    return text;
}

std::string show(const nQVPTP000::tPTPText& text) {
    return std::string(reinterpret_cast<const char*>(text.getTextField()), text.getLengthField());
}

std::string show(const nQVPTP000::tClockIdentity& identity) {
    std::array<std::uint8_t, 8> octets{};
    for (std::size_t i = 0; i < octets.size(); ++i) {
        octets[i] = identity[i];
    }
    return qvtest::pmcClockIdentity(octets);
}

std::string show(std::span<const std::uint8_t> octets) {
    std::string text;
    char part[4];
    for (std::uint8_t octet : octets) {
        std::snprintf(part, sizeof part, "%02x:", octet);
        text += part;
    }
    return text.empty() ? text : text.substr(0, text.size() - 1);
}

template <typename Number>
requires std::is_arithmetic_v<Number> std::string show(Number value) {
    return to_string(static_cast<long>(value));
}

// A text reader's result as a string.
template <typename Reader>
std::string textOf(P& p, Reader reader, tStatus& s) {
    char text[128] = {};
    (p.*reader)(text, sizeof text, s);
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
    QV_ROW("DEFAULT_DATA_SET", "clockIdentity", p.getDefaultDataSet(s).getClockIdentity()),
    QV_ROW("CURRENT_DATA_SET", "stepsRemoved", p.getCurrentDataSet(s).getStepsRemoved()),
    QV_ROW("PARENT_DATA_SET", "grandmasterIdentity",
           p.getParentDataSet(s).getGrandmasterIdentity()),
    QV_ROW("TIME_PROPERTIES_DATA_SET", "currentUtcOffset",
           p.getTimePropertiesDataSet(s).getCurrentUtcOffset()),
    QV_ROW("TRACEABILITY_PROPERTIES", "timeTraceable",
           p.getTraceabilityProperties(s).getTimeTraceable()),
    QV_ROW("USER_DESCRIPTION", "userDescription", textOf(p, &P::getUserDescription, s)),
    QV_ROW("CLOCK_DESCRIPTION", "clockType", clockType(p.refreshClockDescription(s))),
    QV_ROW("CLOCK_DESCRIPTION", "physicalAddress",
           p.refreshClockDescription(s).getPhysicalAddress()),
    QV_ROW("CLOCK_DESCRIPTION", "productDescription",
           p.refreshClockDescription(s).getProductDescription()),
    QV_ROW("CLOCK_DESCRIPTION", "revisionData", p.refreshClockDescription(s).getRevisionData()),
    // The refreshed description is now the cached one.
    QV_ROW("CLOCK_DESCRIPTION", "revisionData", textOf(p, &P::getRevisionData, s)),
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
void expectEveryRowAgrees(const std::string& clockSpec,
                          const std::function<void(P&, const qvtest::TestNetwork&)>& more) {
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
    more(*proxies[0], network);
}

// What pmc now reads for one value of the network's clock.
std::string pmc(const qvtest::TestNetwork& network, const std::string& id, const std::string& name,
                int domain = -1) {
    const auto values = qvtest::pmcGet(network, network.clocks()[0], id, domain);
    const auto found = values.find(name);
    return found == values.end() ? "(no answer)" : found->second;
}

TEST(RealClocks, Ptp4lAnswersEveryGetAsPmcDoesAndRefusesSet) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    expectEveryRowAgrees("ptp4l:domain=1:prio1=91:prio2=92:desc=reader",
                         [](P& p, const qvtest::TestNetwork& network) {
                             tStatus status;
                             // ptp4l answers TIME, UTC_PROPERTIES and every SET with an error
                             // status.
                             tStatus time;
                             p.getTime(time);
                             EXPECT_EQ(time.code, kStatusNoData);
                             tStatus utc;
                             p.getUTCProperties(utc);
                             EXPECT_EQ(utc.code, kStatusNoData);
                             tStatus priority;
                             p.setPriority1(33, priority);
                             EXPECT_EQ(priority.code, kStatusNoData);
                             EXPECT_EQ(pmc(network, "PRIORITY1", "priority1"), "91");
                             tStatus domain;
                             p.setDomain(3, domain);
                             EXPECT_EQ(domain.code, kStatusNoData);
                             EXPECT_EQ(p.getDomainNumber(),
                                       1);  // a refused SET leaves the proxy in the old domain
                             EXPECT_EQ(p.getPriority1(status), 91);
                             EXPECT_TRUE(status.succeeded()) << describe(status);
                         });
}

// A SET and what pmc reads afterwards.
struct Write {
    const char* id;
    const char* name;
    void (*set)(P&, tStatus&);
    const char* expected;
};

const Write kWrites[] = {
    {"PRIORITY1", "priority1", [](P& p, tStatus& s) { p.setPriority1(77, s); }, "77"},
    {"PRIORITY2", "priority2", [](P& p, tStatus& s) { p.setPriority2(78, s); }, "78"},
    {"LOG_ANNOUNCE_INTERVAL", "logAnnounceInterval",
     [](P& p, tStatus& s) { p.setLogAnnounceInterval(2, s); }, "2"},
    {"LOG_SYNC_INTERVAL", "logSyncInterval", [](P& p, tStatus& s) { p.setLogSyncInterval(-1, s); },
     "-1"},
    {"ANNOUNCE_RECEIPT_TIMEOUT", "announceReceiptTimeout",
     [](P& p, tStatus& s) { p.setAnnounceReceiptTimeout(5, s); }, "5"},
    {"LOG_MIN_PDELAY_REQ_INTERVAL", "logMinPdelayReqInterval",
     [](P& p, tStatus& s) { p.setLogMinPdelayReqInterval(3, s); }, "3"},
    {"USER_DESCRIPTION", "userDescription",
     [](P& p, tStatus& s) { p.setUserDescription("renamed;by;qv", s); }, "renamed;by;qv"},
    // pmc 3.1.1 prints SLAVE_ONLY from bit 1 of the value octet, where ptp4l puts the flag;
    // ptpd puts it in bit 0, so pmc's SLAVE_ONLY line says 0 for ptpd. Its default data set
    // shows the flag as ptpd holds it.
    {"DEFAULT_DATA_SET", "slaveOnly", [](P& p, tStatus& s) { p.setSlaveOnly(true, s); }, "1"},
};

TEST(RealClocks, PtpdAnswersEveryGetAsPmcDoesAndTakesEverySet) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    expectEveryRowAgrees(
        "ptpd:domain=2:prio1=81:prio2=82", [](P& p, const qvtest::TestNetwork& network) {
            // pmc cannot ask for TIME or UTC_PROPERTIES; ptpd answers both. It does not adjust
            // the machine's clock, so its time is the machine's (PTP seconds are TAI: UTC plus
            // the clock's UTC offset).
            tStatus status;
            const auto utc = p.getUTCProperties(status);
            EXPECT_EQ(utc.getCurrentUtcOffset(),
                      p.getTimePropertiesDataSet(status).getCurrentUtcOffset());
            const auto time = p.getTime(status);
            EXPECT_TRUE(status.succeeded()) << describe(status);
            const auto now = static_cast<long long>(std::time(nullptr));
            const auto seconds = static_cast<long long>(time.getSeconds());
            EXPECT_LE(std::llabs(seconds - utc.getCurrentUtcOffset() - now), 2) << seconds;
            EXPECT_LT(time.getNanoseconds(), 1000000000u);

            for (const Write& write : kWrites) {
                tStatus set;
                write.set(p, set);
                EXPECT_TRUE(set.succeeded()) << write.id << ": " << describe(set);
                EXPECT_EQ(pmc(network, write.id, write.name), write.expected) << write.id;
            }
            EXPECT_TRUE(p.getSlaveOnly(status));
            // A new domain: the clock then answers there only, and the proxy follows it.
            p.setDomain(3, status);
            ASSERT_TRUE(status.succeeded()) << describe(status);
            EXPECT_EQ(pmc(network, "DOMAIN", "domainNumber", 3), "3");
            EXPECT_EQ(pmc(network, "DOMAIN", "domainNumber", 2), "(no answer)");
            EXPECT_EQ(p.getPriority1(status), 77);
            // A command is acknowledged and takes effect.
            p.disablePort(status);
            EXPECT_EQ(pmc(network, "PORT_DATA_SET", "portState", 3), "DISABLED");
            EXPECT_TRUE(status.succeeded()) << describe(status);
        });
}

}  // namespace
