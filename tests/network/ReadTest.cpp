#include <gtest/gtest.h>

#include <chrono>
#include <ctime>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "ptp/tClockIdentity.h"
#include "tests/network/ManagementClient.h"
#include "tests/support/NetworkTestGuard.h"
#include "tests/support/TestNetwork.h"

namespace {

using nQVPTPMGMT000::tPTPClockProxy;
using qvtest::describe;
using qvtest::ManagementClient;
using qvtest::pmcGet;
using qvtest::pmcNumber;
using qvtest::TestClock;
using qvtest::TestNetwork;
using qvtest::timeOf;
using tValues = std::map<std::string, std::string>;

// What pmc printed for one name, as a number; fails the test when pmc printed no such name.
long number(const tValues& values, const std::string& name) {
    const auto found = values.find(name);
    if (found == values.end()) {
        ADD_FAILURE() << "pmc printed no " << name;
        return -1;
    }
    return pmcNumber(found->second);
}

std::string identityText(const nQVPTP000::tClockIdentity& identity) {
    std::array<std::uint8_t, 8> octets{};
    for (std::size_t i = 0; i < octets.size(); ++i) {
        octets[i] = identity[i];
    }
    return qvtest::pmcClockIdentity(octets);
}

std::string portText(const nQVPTP000::tPortIdentity& port) {
    return identityText(port.getClockIdentity()) + "-" + std::to_string(port.getPortNumber());
}

// pmc's names of the port states.
long portStateNumber(const std::string& name) {
    static const std::map<std::string, long> kStates = {
        {"INITIALIZING", 1}, {"FAULTY", 2},       {"DISABLED", 3},
        {"LISTENING", 4},    {"PRE_MASTER", 5},   {"MASTER", 6},
        {"PASSIVE", 7},      {"UNCALIBRATED", 8}, {"SLAVE", 9}};
    const auto found = kStates.find(name);
    return found == kStates.end() ? -1 : found->second;
}

// A clock of the network, its proxy and the client, with the checks that every GET needs.
class Reading {
  public:
    Reading(const TestNetwork& network, const TestClock& clock, tPTPClockProxy& proxy)
        : network_(network), clock_(clock), proxy_(proxy) {}

    tValues pmc(const std::string& id) const {
        tValues values = pmcGet(network_, clock_, id);
        EXPECT_FALSE(values.empty()) << "pmc got no answer to GET " << id;
        return values;
    }

    // A single value: our GET and pmc's agree.
    template <typename Get>
    void expectValue(const std::string& id, const std::string& name, Get get) const {
        SCOPED_TRACE(id);
        tStatus status;
        const long ours = static_cast<long>(get(status));
        EXPECT_TRUE(status.succeeded()) << describe(status);
        EXPECT_EQ(ours, number(pmc(id), name));
    }

    tPTPClockProxy& proxy() const { return proxy_; }

  private:
    const TestNetwork& network_;
    const TestClock& clock_;
    tPTPClockProxy& proxy_;
};

void expectSingleValues(const Reading& r) {
    tPTPClockProxy& p = r.proxy();
    r.expectValue("PRIORITY1", "priority1", [&](tStatus& s) { return p.getPriority1(s); });
    r.expectValue("PRIORITY2", "priority2", [&](tStatus& s) { return p.getPriority2(s); });
    r.expectValue("DOMAIN", "domainNumber", [&](tStatus& s) { return p.getDomain(s); });
    r.expectValue("SLAVE_ONLY", "slaveOnly", [&](tStatus& s) { return p.getSlaveOnly(s); });
    r.expectValue("LOG_ANNOUNCE_INTERVAL", "logAnnounceInterval",
                  [&](tStatus& s) { return p.getLogAnnounceInterval(s); });
    r.expectValue("ANNOUNCE_RECEIPT_TIMEOUT", "announceReceiptTimeout",
                  [&](tStatus& s) { return p.getAnnounceReceiptTimeout(s); });
    r.expectValue("LOG_SYNC_INTERVAL", "logSyncInterval",
                  [&](tStatus& s) { return p.getLogSyncInterval(s); });
    r.expectValue("VERSION_NUMBER", "versionNumber",
                  [&](tStatus& s) { return p.getVersionNumber(s); });
    r.expectValue("CLOCK_ACCURACY", "clockAccuracy",
                  [&](tStatus& s) { return p.getClockAccuracy(s); });
    r.expectValue("DELAY_MECHANISM", "delayMechanism",
                  [&](tStatus& s) { return p.getDelayMechanism(s); });
    r.expectValue("LOG_MIN_PDELAY_REQ_INTERVAL", "logMinPdelayReqInterval",
                  [&](tStatus& s) { return p.getLogMinPdelayReqInterval(s); });
}

void expectDataSets(const Reading& r) {
    tPTPClockProxy& p = r.proxy();
    tStatus status;
    {
        SCOPED_TRACE("DEFAULT_DATA_SET");
        const auto ours = p.getDefaultDataSet(status);
        const tValues pmc = r.pmc("DEFAULT_DATA_SET");
        EXPECT_EQ(ours.getTwoStepFlag(), number(pmc, "twoStepFlag"));
        EXPECT_EQ(ours.getSlaveOnly(), number(pmc, "slaveOnly"));
        EXPECT_EQ(ours.getNumberPorts(), number(pmc, "numberPorts"));
        EXPECT_EQ(ours.getPriority1(), number(pmc, "priority1"));
        EXPECT_EQ(ours.getClockQuality().clockClass, number(pmc, "clockClass"));
        EXPECT_EQ(ours.getClockQuality().clockAccuracy, number(pmc, "clockAccuracy"));
        EXPECT_EQ(ours.getClockQuality().offsetScaledLogVariance,
                  number(pmc, "offsetScaledLogVariance"));
        EXPECT_EQ(ours.getPriority2(), number(pmc, "priority2"));
        EXPECT_EQ(identityText(ours.getClockIdentity()), pmc.at("clockIdentity"));
        EXPECT_EQ(ours.getDomainNumber(), number(pmc, "domainNumber"));
    }
    {
        SCOPED_TRACE("CURRENT_DATA_SET");
        const auto ours = p.getCurrentDataSet(status);
        const tValues pmc = r.pmc("CURRENT_DATA_SET");
        EXPECT_EQ(ours.getStepsRemoved(), number(pmc, "stepsRemoved"));
        // A master measures no offset or delay; pmc prints them in nanoseconds.
        EXPECT_EQ(std::to_string(ours.getOffsetFromMaster().getNanoseconds()) + ".0",
                  pmc.at("offsetFromMaster"));
        EXPECT_EQ(std::to_string(ours.getMeanPathDelay().getNanoseconds()) + ".0",
                  pmc.at("meanPathDelay"));
    }
    {
        SCOPED_TRACE("PARENT_DATA_SET");
        const auto ours = p.getParentDataSet(status);
        const tValues pmc = r.pmc("PARENT_DATA_SET");
        EXPECT_EQ(portText(ours.getParentPortIdentity()), pmc.at("parentPortIdentity"));
        EXPECT_EQ(ours.getParentStats(), number(pmc, "parentStats"));
        EXPECT_EQ(ours.getObservedParentOffsetScaledLogVariance(),
                  number(pmc, "observedParentOffsetScaledLogVariance"));
        EXPECT_EQ(ours.getObservedParentClockPhaseChangeRate(),
                  number(pmc, "observedParentClockPhaseChangeRate"));
        EXPECT_EQ(ours.getGrandmasterPriority1(), number(pmc, "grandmasterPriority1"));
        EXPECT_EQ(ours.getGrandmasterClockQuality().clockClass, number(pmc, "gm.ClockClass"));
        EXPECT_EQ(ours.getGrandmasterClockQuality().clockAccuracy, number(pmc, "gm.ClockAccuracy"));
        EXPECT_EQ(ours.getGrandmasterClockQuality().offsetScaledLogVariance,
                  number(pmc, "gm.OffsetScaledLogVariance"));
        EXPECT_EQ(ours.getGrandmasterPriority2(), number(pmc, "grandmasterPriority2"));
        EXPECT_EQ(identityText(ours.getGrandmasterIdentity()), pmc.at("grandmasterIdentity"));
    }
    {
        SCOPED_TRACE("TIME_PROPERTIES_DATA_SET");
        const auto ours = p.getTimePropertiesDataSet(status);
        const tValues pmc = r.pmc("TIME_PROPERTIES_DATA_SET");
        EXPECT_EQ(ours.getCurrentUtcOffset(), number(pmc, "currentUtcOffset"));
        EXPECT_EQ(ours.getLeap61(), number(pmc, "leap61"));
        EXPECT_EQ(ours.getLeap59(), number(pmc, "leap59"));
        EXPECT_EQ(ours.getCurrentUtcOffsetValid(), number(pmc, "currentUtcOffsetValid"));
        EXPECT_EQ(ours.getPtpTimescale(), number(pmc, "ptpTimescale"));
        EXPECT_EQ(ours.getTimeTraceable(), number(pmc, "timeTraceable"));
        EXPECT_EQ(ours.getFrequencyTraceable(), number(pmc, "frequencyTraceable"));
        EXPECT_EQ(ours.getTimeSource(), number(pmc, "timeSource"));
    }
    {
        SCOPED_TRACE("PORT_DATA_SET");
        // The port may leave LISTENING between two reads: ours must be what pmc saw just
        // before or just after.
        const tValues before = r.pmc("PORT_DATA_SET");
        const auto ours = p.getPortDataSet(status);
        const tValues pmc = r.pmc("PORT_DATA_SET");
        const long state = ours.getPortState();
        EXPECT_TRUE(state == portStateNumber(before.at("portState")) ||
                    state == portStateNumber(pmc.at("portState")))
            << state << " " << pmc.at("portState");
        EXPECT_EQ(portText(ours.getPortIdentity()), pmc.at("portIdentity"));
        EXPECT_EQ(ours.getLogMinDelayReqInterval(), number(pmc, "logMinDelayReqInterval"));
        EXPECT_EQ(ours.getPeerMeanPathDelay().getNanoseconds(), number(pmc, "peerMeanPathDelay"));
        EXPECT_EQ(ours.getLogAnnounceInterval(), number(pmc, "logAnnounceInterval"));
        EXPECT_EQ(ours.getAnnounceReceiptTimeout(), number(pmc, "announceReceiptTimeout"));
        EXPECT_EQ(ours.getLogSyncInterval(), number(pmc, "logSyncInterval"));
        EXPECT_EQ(ours.getDelayMechanism(), number(pmc, "delayMechanism"));
        EXPECT_EQ(ours.getLogMinPdelayReqInterval(), number(pmc, "logMinPdelayReqInterval"));
        EXPECT_EQ(ours.getVersionNumber(), number(pmc, "versionNumber"));
    }
    {
        SCOPED_TRACE("TRACEABILITY_PROPERTIES");
        const auto ours = p.getTraceabilityProperties(status);
        const tValues pmc = r.pmc("TRACEABILITY_PROPERTIES");
        EXPECT_EQ(ours.getTimeTraceable(), number(pmc, "timeTraceable"));
        EXPECT_EQ(ours.getFrequencyTraceable(), number(pmc, "frequencyTraceable"));
    }
    EXPECT_TRUE(status.succeeded()) << describe(status);
}

std::string octetText(std::span<const std::uint8_t> octets) {
    std::string text;
    char part[4];
    for (std::uint8_t octet : octets) {
        std::snprintf(part, sizeof part, "%02x:", octet);
        text += part;
    }
    if (!text.empty()) {
        text.pop_back();
    }
    return text;
}

std::string textOf(const nQVPTP000::tPTPText& text) {
    return std::string(reinterpret_cast<const char*>(text.getTextField()), text.getLengthField());
}

void expectDescriptions(const Reading& r) {
    tPTPClockProxy& p = r.proxy();
    tStatus status;
    {
        SCOPED_TRACE("USER_DESCRIPTION");
        char text[128] = {};
        p.getUserDescription(text, sizeof text, status);
        EXPECT_EQ(std::string(text), r.pmc("USER_DESCRIPTION").at("userDescription"));
    }
    {
        SCOPED_TRACE("CLOCK_DESCRIPTION");
        const auto ours = p.refreshClockDescription(status);
        const tValues pmc = r.pmc("CLOCK_DESCRIPTION");
        const long clockType =
            (ours.getOrdinaryClock() ? 0x8000 : 0) | (ours.getBoundaryClock() ? 0x4000 : 0) |
            (ours.getP2PTransparentClock() ? 0x2000 : 0) |
            (ours.getE2ETransparentClock() ? 0x1000 : 0) | (ours.getManagementNode() ? 0x0800 : 0);
        EXPECT_EQ(clockType, number(pmc, "clockType"));
        EXPECT_EQ(textOf(ours.getPhysicalLayerProtocol()), pmc.at("physicalLayerProtocol"));
        EXPECT_EQ(octetText(ours.getPhysicalAddress()), pmc.at("physicalAddress"));
        const nQVPTP000::tPortAddress address = ours.getProtocolAddress();
        ASSERT_EQ(address.getAddressLength(), 4u);
        const std::uint8_t* a = address.getAddressField();
        EXPECT_EQ(std::to_string(address.getNetworkProtocol()) + " " + std::to_string(a[0]) + "." +
                      std::to_string(a[1]) + "." + std::to_string(a[2]) + "." +
                      std::to_string(a[3]),
                  pmc.at("protocolAddress"));
        EXPECT_EQ(octetText(ours.getManufacturerIdentity()), pmc.at("manufacturerId"));
        EXPECT_EQ(textOf(ours.getProductDescription()), pmc.at("productDescription"));
        EXPECT_EQ(textOf(ours.getRevisionData()), pmc.at("revisionData"));
        EXPECT_EQ(textOf(ours.getUserDescription()), pmc.at("userDescription"));
        EXPECT_EQ(octetText(ours.getProfileIdentity()), pmc.at("profileId"));
        // The refreshed answer is now the cached one.
        char cached[128] = {};
        p.getRevisionData(cached, sizeof cached, status);
        EXPECT_EQ(std::string(cached), pmc.at("revisionData"));
        EXPECT_EQ(p.getProtocolAddress().getAddressField()[3], a[3]);
    }
    EXPECT_TRUE(status.succeeded()) << describe(status);
}

// Brings up the clock, finds it and hands the reading to `check`.
void withClock(const std::string& clockSpec, const std::function<void(const Reading&)>& check) {
    TestNetwork network({clockSpec});
    ASSERT_TRUE(network.isUp()) << network.failure();
    ManagementClient client(network.clientNamespace());
    ASSERT_TRUE(client.isOpen()) << client.failure();
    tStatus status;
    const auto proxies = client.findClocks(500, status);
    ASSERT_EQ(proxies.size(), 1u);
    check(Reading(network, network.clocks()[0], *proxies[0]));
}

TEST(Reading, EveryGetOfPtp4lAgreesWithPmc) {
    QV_REQUIRE_TEST_NETWORK("ptp4l", "pmc");
    withClock("ptp4l:domain=1:prio1=91:prio2=92:desc=reader", [](const Reading& r) {
        expectSingleValues(r);
        expectDataSets(r);
        expectDescriptions(r);
        tStatus status;
        r.proxy().getNullManagement(status);
        EXPECT_TRUE(status.succeeded()) << describe(status);

        // TIME and UTC_PROPERTIES are answered with an error status: the exchange fails on
        // that answer, long before the 5 s time-out.
        tStatus time;
        const auto timeTook = timeOf([&](tStatus& s) { r.proxy().getTime(s); }, time);
        EXPECT_EQ(time.code, kStatusNoData);
        EXPECT_LT(timeTook, std::chrono::milliseconds(1000));
        tStatus utc;
        const auto utcTook = timeOf([&](tStatus& s) { r.proxy().getUTCProperties(s); }, utc);
        EXPECT_EQ(utc.code, kStatusNoData);
        EXPECT_LT(utcTook, std::chrono::milliseconds(1000));
    });
}

TEST(Reading, EveryGetOfPtpdAgreesWithPmc) {
    QV_REQUIRE_TEST_NETWORK("ptpd", "pmc");
    withClock("ptpd:domain=2:prio1=81:prio2=82", [](const Reading& r) {
        expectSingleValues(r);
        expectDataSets(r);
        expectDescriptions(r);

        // pmc cannot ask for TIME or UTC_PROPERTIES; ptpd answers both. It does not adjust
        // the machine's clock, so its time is the machine's time (PTP seconds are TAI:
        // UTC plus the clock's UTC offset).
        tStatus status;
        const auto utc = r.proxy().getUTCProperties(status);
        EXPECT_TRUE(status.succeeded()) << describe(status);
        const tValues properties = r.pmc("TIME_PROPERTIES_DATA_SET");
        EXPECT_EQ(utc.getCurrentUtcOffset(), number(properties, "currentUtcOffset"));
        EXPECT_EQ(utc.getCurrentUtcOffsetValid(), number(properties, "currentUtcOffsetValid"));
        EXPECT_EQ(utc.getLeap61(), number(properties, "leap61"));
        EXPECT_EQ(utc.getLeap59(), number(properties, "leap59"));
        const auto time = r.proxy().getTime(status);
        EXPECT_TRUE(status.succeeded()) << describe(status);
        const auto now = static_cast<long long>(std::time(nullptr));
        const auto seconds = static_cast<long long>(time.getSeconds());
        EXPECT_LE(std::llabs(seconds - utc.getCurrentUtcOffset() - now), 2) << seconds;
        EXPECT_LT(time.getNanoseconds(), 1000000000u);
    });
}

}  // namespace
