#include <gtest/gtest.h>

#include <chrono>
#include <string>
#include <thread>

#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using P = nQVPTPMGMT000::tPTPClockProxy;
using qvtest::describe;

// A network of one clock, the client and the proxy of that clock.
struct OneClock {
    explicit OneClock(const std::string& clockSpec) : network({clockSpec}) {
        if (!network.isUp()) {
            return;
        }
        client = std::make_unique<qvtest::ManagementClient>(network.clientNamespace());
        tStatus status;
        if (client->isOpen()) {
            const auto proxies = client->findClocks(500, status);
            proxy = proxies.size() == 1 ? proxies[0] : nullptr;
        }
    }
    // What pmc now reads for one value of the clock.
    std::string pmc(const std::string& id, const std::string& name, int domain = -1) const {
        const auto values = qvtest::pmcGet(network, network.clocks()[0], id, domain);
        const auto found = values.find(name);
        return found == values.end() ? "(no answer)" : found->second;
    }

    qvtest::TestNetwork network;
    std::unique_ptr<qvtest::ManagementClient> client;
    P* proxy = nullptr;
};

#define QV_ASSERT_ONE_CLOCK(clock)                                      \
    ASSERT_TRUE((clock).network.isUp()) << (clock).network.failure();   \
    ASSERT_TRUE((clock).client->isOpen()) << (clock).client->failure(); \
    ASSERT_NE((clock).proxy, nullptr) << "discovery did not find the clock exactly once"

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
    // ptpd reports "PTPDv2" as long as no one has set a description, and takes a new one.
    {"USER_DESCRIPTION", "userDescription",
     [](P& p, tStatus& s) { p.setUserDescription("renamed;by;qv", s); }, "renamed;by;qv"},
    // pmc 3.1.1 prints SLAVE_ONLY from bit 1 of the value octet, where ptp4l puts the flag;
    // ptpd puts it in bit 0, so pmc's SLAVE_ONLY line says 0 for ptpd. Its default data set
    // shows the flag as ptpd holds it.
    {"DEFAULT_DATA_SET", "slaveOnly", [](P& p, tStatus& s) { p.setSlaveOnly(true, s); }, "1"},
};

TEST(Writing, PtpdTakesEverySettableValueAndCommand) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    OneClock clock("ptpd:domain=1:prio1=120:prio2=121");
    QV_ASSERT_ONE_CLOCK(clock);
    P& p = *clock.proxy;
    // DISABLE_PORT and ENABLE_PORT are acknowledged and take effect; ptpd's
    // restart on ENABLE_PORT resets what was set, so they come first.
    tStatus command;
    p.disablePort(command);
    EXPECT_TRUE(command.succeeded()) << describe(command);
    EXPECT_EQ(clock.pmc("PORT_DATA_SET", "portState"), "DISABLED");
    EXPECT_EQ(p.getPortDataSet(command).getPortState(), 3);  // DISABLED
    p.enablePort(command);
    EXPECT_TRUE(command.succeeded()) << describe(command);
    // ptpd restarts its protocol engine on ENABLE_PORT and does not answer for a moment.
    std::string state = "(no answer)";
    for (int i = 0; i < 50 && (state == "(no answer)" || state == "DISABLED"); ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
        state = clock.pmc("PORT_DATA_SET", "portState");
    }
    EXPECT_NE(state, "DISABLED");
    EXPECT_NE(state, "(no answer)");

    for (const Write& write : kWrites) {
        SCOPED_TRACE(write.id);
        tStatus status;
        write.set(p, status);
        EXPECT_TRUE(status.succeeded()) << describe(status);
        EXPECT_EQ(clock.pmc(write.id, write.name), write.expected);
    }
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

TEST(Writing, Ptp4lRefusesSetAndTheExchangeFails) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    OneClock clock("ptp4l:domain=0:prio1=99");
    QV_ASSERT_ONE_CLOCK(clock);
    P& p = *clock.proxy;

    tStatus priority;
    p.setPriority1(33, priority);
    EXPECT_EQ(priority.code, kStatusNoData);
    EXPECT_EQ(clock.pmc("PRIORITY1", "priority1"), "99");
    tStatus domain;
    p.setDomain(3, domain);
    EXPECT_EQ(domain.code, kStatusNoData);
    EXPECT_EQ(p.getDomainNumber(), 0);  // a refused SET leaves the proxy in the old domain
    tStatus read;
    EXPECT_EQ(p.getPriority1(read), 99);
    EXPECT_TRUE(read.succeeded()) << describe(read);
}

}  // namespace
