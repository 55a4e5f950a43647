#include <gtest/gtest.h>

#include <chrono>
#include <functional>
#include <map>
#include <string>
#include <thread>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;
using qvtest::describe;
using qvtest::ManagementClient;
using qvtest::pmcGet;
using qvtest::TestNetwork;
using qvtest::timeOf;
using namespace std::chrono_literals;

// A network of one clock, the client and the proxy of that clock.
struct OneClock {
    explicit OneClock(const std::string& clockSpec) : network({clockSpec}) {
        if (!network.isUp()) {
            return;
        }
        client = std::make_unique<ManagementClient>(network.clientNamespace());
        tStatus status;
        if (client->isOpen()) {
            const auto proxies = client->findClocks(500, status);
            proxy = proxies.size() == 1 ? proxies[0] : nullptr;
        }
    }
    // What pmc now reads for one value of the clock.
    std::string pmc(const std::string& id, const std::string& name, int domain = -1) const {
        const auto values = pmcGet(network, network.clocks()[0], id, domain);
        const auto found = values.find(name);
        return found == values.end() ? "(no answer)" : found->second;
    }

    TestNetwork network;
    std::unique_ptr<ManagementClient> client;
    tPTPClockProxy* proxy = nullptr;
};

#define QV_ASSERT_ONE_CLOCK(clock)                                      \
    ASSERT_TRUE((clock).network.isUp()) << (clock).network.failure();   \
    ASSERT_TRUE((clock).client->isOpen()) << (clock).client->failure(); \
    ASSERT_NE((clock).proxy, nullptr) << "discovery did not find the clock exactly once"

// The SET succeeds and pmc then reads `expected`.
void expectSet(const OneClock& clock, const std::string& id, const std::string& name,
               const std::function<void(tStatus&)>& set, const std::string& expected) {
    SCOPED_TRACE(id);
    tStatus status;
    set(status);
    EXPECT_TRUE(status.succeeded()) << describe(status);
    EXPECT_EQ(clock.pmc(id, name), expected);
}

TEST(Writing, PtpdTakesEverySettableValue) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    OneClock clock("ptpd:domain=1:prio1=120:prio2=121");
    QV_ASSERT_ONE_CLOCK(clock);
    tPTPClockProxy& p = *clock.proxy;

    expectSet(
        clock, "PRIORITY1", "priority1", [&](tStatus& s) { p.setPriority1(77, s); }, "77");
    expectSet(
        clock, "PRIORITY2", "priority2", [&](tStatus& s) { p.setPriority2(78, s); }, "78");
    expectSet(
        clock, "LOG_ANNOUNCE_INTERVAL", "logAnnounceInterval",
        [&](tStatus& s) { p.setLogAnnounceInterval(2, s); }, "2");
    expectSet(
        clock, "LOG_SYNC_INTERVAL", "logSyncInterval",
        [&](tStatus& s) { p.setLogSyncInterval(-1, s); }, "-1");
    expectSet(
        clock, "ANNOUNCE_RECEIPT_TIMEOUT", "announceReceiptTimeout",
        [&](tStatus& s) { p.setAnnounceReceiptTimeout(5, s); }, "5");
    expectSet(
        clock, "LOG_MIN_PDELAY_REQ_INTERVAL", "logMinPdelayReqInterval",
        [&](tStatus& s) { p.setLogMinPdelayReqInterval(3, s); }, "3");
    // ptpd reports "PTPDv2" as long as no one has set a description, and takes a new one.
    expectSet(
        clock, "USER_DESCRIPTION", "userDescription",
        [&](tStatus& s) { p.setUserDescription("renamed;by;qv", s); }, "renamed;by;qv");
    // pmc 3.1.1 prints SLAVE_ONLY from bit 1 of the value octet, where ptp4l puts the flag;
    // ptpd puts it in bit 0, so pmc's SLAVE_ONLY line says 0 for ptpd. Its default data set
    // shows the flag as ptpd holds it.
    expectSet(
        clock, "DEFAULT_DATA_SET", "slaveOnly", [&](tStatus& s) { p.setSlaveOnly(true, s); }, "1");
    tStatus slaveOnly;
    EXPECT_TRUE(p.getSlaveOnly(slaveOnly));
    EXPECT_TRUE(slaveOnly.succeeded()) << describe(slaveOnly);

    // A new domain: the clock then answers there only, and the proxy follows it.
    tStatus status;
    p.setDomain(3, status);
    ASSERT_TRUE(status.succeeded()) << describe(status);
    EXPECT_EQ(p.getDomainNumber(), 3);
    EXPECT_EQ(clock.pmc("DOMAIN", "domainNumber", 3), "3");
    EXPECT_EQ(clock.pmc("DOMAIN", "domainNumber", 1), "(no answer)");
    EXPECT_EQ(p.getPriority1(status), 77);
    EXPECT_TRUE(status.succeeded()) << describe(status);
}

TEST(Writing, PtpdAcknowledgesDisableAndEnablePort) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    OneClock clock("ptpd:domain=2");
    QV_ASSERT_ONE_CLOCK(clock);
    tPTPClockProxy& p = *clock.proxy;

    tStatus status;
    p.disablePort(status);
    EXPECT_TRUE(status.succeeded()) << describe(status);
    EXPECT_EQ(clock.pmc("PORT_DATA_SET", "portState"), "DISABLED");
    EXPECT_EQ(p.getPortDataSet(status).getPortState(), 3);  // DISABLED

    p.enablePort(status);
    EXPECT_TRUE(status.succeeded()) << describe(status);
    // ptpd restarts its protocol engine on ENABLE_PORT and does not answer for a moment.
    std::string state = "(no answer)";
    for (int i = 0; i < 50 && (state == "(no answer)" || state == "DISABLED"); ++i) {
        std::this_thread::sleep_for(100ms);
        state = clock.pmc("PORT_DATA_SET", "portState");
    }
    EXPECT_NE(state, "DISABLED");
    EXPECT_NE(state, "(no answer)");
}

TEST(Writing, Ptp4lRefusesSetAndTheExchangeFailsOnItsAnswer) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    OneClock clock("ptp4l:domain=0:prio1=99");
    QV_ASSERT_ONE_CLOCK(clock);
    tPTPClockProxy& p = *clock.proxy;

    tStatus priority;
    const auto took = timeOf([&](tStatus& s) { p.setPriority1(33, s); }, priority);
    EXPECT_EQ(priority.code, kStatusNoData);
    EXPECT_LT(took, 1000ms);
    EXPECT_EQ(clock.pmc("PRIORITY1", "priority1"), "99");

    tStatus domain;
    const auto domainTook = timeOf([&](tStatus& s) { p.setDomain(3, s); }, domain);
    EXPECT_EQ(domain.code, kStatusNoData);
    EXPECT_LT(domainTook, 1000ms);
    EXPECT_EQ(p.getDomainNumber(), 0);  // a refused SET leaves the proxy in the old domain
    tStatus read;
    EXPECT_EQ(p.getPriority1(read), 99);
    EXPECT_TRUE(read.succeeded()) << describe(read);
}

}  // namespace
