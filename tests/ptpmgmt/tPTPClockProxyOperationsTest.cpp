// The remote operations of the clock proxy against a simulated clock: every GET returns the
// clock's value, every SET changes it, every COMMAND is acknowledged, and each fails with
// its documented value when the clock stays silent.
#include <gtest/gtest.h>

#include <functional>
#include <string>

#include "ptp/TLVs/tInitializeTLV.h"
#include "tests/ptpmgmt/ProxyFixture.h"

using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tTimestamp;
using nQVPTPMGMT000::tPTPClockProxy;
using namespace qvtest;
using Fault = SimulatedClock::Fault;

namespace {

constexpr auto kGet = tManagementMessagePayload::kGet;
constexpr auto kSet = tManagementMessagePayload::kSet;
constexpr auto kCommand = tManagementMessagePayload::kCommand;

class tPTPClockProxyOperationsTest : public ProxyFixture {
  protected:
    // Checks the management id and action of the last request and that it went to port 1.
    void expectLastRequest(std::uint16_t managementId, std::uint32_t action) {
        std::unique_ptr<nQVPTP000::tManagementMessage> request = lastRequest();
        ASSERT_TRUE(request);
        tStatus status;
        EXPECT_EQ(request->getPayload(status)->getManagementId(), managementId);
        EXPECT_EQ(request->getActionField(), action);
        EXPECT_EQ(request->getTargetPortIdentity(), proxy().getPortIdentity());
    }
};

// The clock's member as an int, read and written through a setter and getter pair.
struct Member {
    std::function<int(InMemoryManagedClock&)> read;
    std::function<void(InMemoryManagedClock&, int)> write;
};

template <typename T>
Member member(T InMemoryManagedClock::DefaultDataSet::*field) {
    return {
        [field](InMemoryManagedClock& c) { return static_cast<int>(c.defaultDataSet.*field); },
        [field](InMemoryManagedClock& c, int v) { c.defaultDataSet.*field = static_cast<T>(v); }};
}
template <typename T>
Member member(T InMemoryManagedClock::Port::*field) {
    return {[field](InMemoryManagedClock& c) { return static_cast<int>(c.port(1).*field); },
            [field](InMemoryManagedClock& c, int v) { c.port(1).*field = static_cast<T>(v); }};
}

// One single-value member: how the proxy reads and writes it, where the clock keeps it, a
// value that the clock accepts, and the proxy's result when the exchange fails.
struct SingleValueCase {
    const char* name;
    std::uint16_t managementId;
    int (*get)(tPTPClockProxy&, tStatus&);
    void (*set)(tPTPClockProxy&, int, tStatus&);
    Member clockMember;
    int value;
    int failure;
};

std::vector<SingleValueCase> singleValueCases() {
    using P = tPTPClockProxy;
    using C = InMemoryManagedClock;
    Member accuracy{
        [](C& c) { return static_cast<int>(c.defaultDataSet.clockQuality.clockAccuracy); },
        [](C& c, int v) {
            c.defaultDataSet.clockQuality.clockAccuracy = static_cast<std::uint8_t>(v);
        }};
    return {
        {"priority1", 0x2005, [](P& p, tStatus& s) { return int{p.getPriority1(s)}; },
         [](P& p, int v, tStatus& s) { p.setPriority1(static_cast<std::uint8_t>(v), s); },
         member(&C::DefaultDataSet::priority1), 17, 0},
        {"priority2", 0x2006, [](P& p, tStatus& s) { return int{p.getPriority2(s)}; },
         [](P& p, int v, tStatus& s) { p.setPriority2(static_cast<std::uint8_t>(v), s); },
         member(&C::DefaultDataSet::priority2), 33, 0},
        {"slaveOnly", 0x2008, [](P& p, tStatus& s) { return int{p.getSlaveOnly(s)}; },
         [](P& p, int v, tStatus& s) { p.setSlaveOnly(v != 0, s); },
         member(&C::DefaultDataSet::slaveOnly), 1, 0},
        {"clockAccuracy", 0x2010, [](P& p, tStatus& s) { return int{p.getClockAccuracy(s)}; },
         [](P& p, int v, tStatus& s) { p.setClockAccuracy(static_cast<std::uint32_t>(v), s); },
         accuracy, 0x21, 0xFE},
        {"announceReceiptTimeout", 0x200A,
         [](P& p, tStatus& s) { return int{p.getAnnounceReceiptTimeout(s)}; },
         [](P& p, int v, tStatus& s) {
             p.setAnnounceReceiptTimeout(static_cast<std::uint8_t>(v), s);
         },
         member(&C::Port::announceReceiptTimeout), 5, 0},
        {"delayMechanism", 0x6000, [](P& p, tStatus& s) { return int{p.getDelayMechanism(s)}; },
         [](P& p, int v, tStatus& s) { p.setDelayMechanism(static_cast<std::uint32_t>(v), s); },
         member(&C::Port::delayMechanism), 2, 1},
        {"logMinPdelayReqInterval", 0x6001,
         [](P& p, tStatus& s) { return int{p.getLogMinPdelayReqInterval(s)}; },
         [](P& p, int v, tStatus& s) {
             p.setLogMinPdelayReqInterval(static_cast<std::int8_t>(v), s);
         },
         member(&C::Port::logMinPdelayReqInterval), -3, 0},
        {"logAnnounceInterval", 0x2009,
         [](P& p, tStatus& s) { return int{p.getLogAnnounceInterval(s)}; },
         [](P& p, int v, tStatus& s) { p.setLogAnnounceInterval(static_cast<std::int8_t>(v), s); },
         member(&C::Port::logAnnounceInterval), -2, 0},
        {"logSyncInterval", 0x200B, [](P& p, tStatus& s) { return int{p.getLogSyncInterval(s)}; },
         [](P& p, int v, tStatus& s) { p.setLogSyncInterval(static_cast<std::int8_t>(v), s); },
         member(&C::Port::logSyncInterval), -4, 0},
        {"versionNumber", 0x200C, [](P& p, tStatus& s) { return int{p.getVersionNumber(s)}; },
         [](P& p, int v, tStatus& s) { p.setVersionNumber(static_cast<std::uint8_t>(v), s); },
         member(&C::Port::versionNumber), 3, 0},
    };
}

TEST_F(tPTPClockProxyOperationsTest, SingleValuesAreReadAndWritten) {
    for (const SingleValueCase& value : singleValueCases()) {
        SCOPED_TRACE(value.name);
        tStatus status;
        value.set(proxy(), value.value, status);
        ASSERT_TRUE(status.succeeded());
        expectLastRequest(value.managementId, kSet);
        EXPECT_EQ(value.clockMember.read(managed()), value.value);
        // The next GET reads what the clock holds now.
        const int changed = value.value == 1 ? 0 : value.value + 1;
        value.clockMember.write(managed(), value.value == 0x21 ? 0x22 : changed);
        EXPECT_EQ(value.get(proxy(), status), value.clockMember.read(managed()));
        expectLastRequest(value.managementId, kGet);
        EXPECT_TRUE(status.succeeded());
    }
}

TEST_F(tPTPClockProxyOperationsTest, SingleValuesGiveTheirFailureValueFromASilentClock) {
    clock_.setFault(Fault::silent);
    proxy().setExchangeTimeout(20);
    for (const SingleValueCase& value : singleValueCases()) {
        SCOPED_TRACE(value.name);
        tStatus status;
        EXPECT_EQ(value.get(proxy(), status), value.failure);
        EXPECT_EQ(status.code, kStatusNoData);
        status.reset();
        value.set(proxy(), value.value, status);
        EXPECT_EQ(status.code, kStatusNoData);
    }
    tStatus status;
    EXPECT_EQ(proxy().getDomain(status), 0);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST_F(tPTPClockProxyOperationsTest, ARefusedValueFailsAndLeavesTheClockAlone) {
    proxy().setClockAccuracy(0x05, status_);  // not a clockAccuracy the clock accepts
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(managed().defaultDataSet.clockQuality.clockAccuracy,
              nQVPTP000::tClockQuality().clockAccuracy);
}

TEST_F(tPTPClockProxyOperationsTest, NothingIsSentOnceAnErrorIsRecorded) {
    const std::size_t before = network_.sentCount();
    status_.set(kStatusSocketError, "test", "test", 1);
    EXPECT_EQ(proxy().getClockAccuracy(status_), 0xFE);
    proxy().setPriority1(3, status_);
    proxy().enablePort(status_);
    EXPECT_EQ(network_.sentCount(), before);
    EXPECT_EQ(status_.code, kStatusSocketError);
}

TEST_F(tPTPClockProxyOperationsTest, AClockAccuracyFromASilentClockIsFEAfterFiveSeconds) {
    clock_.setFault(Fault::silent);
    std::uint8_t accuracy = 0;
    const double took = millisecondsOf([&] { accuracy = proxy().getClockAccuracy(status_); });
    EXPECT_EQ(accuracy, 0xFE);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_GE(took, 4990.0);
    EXPECT_LT(took, 6000.0);
}

TEST_F(tPTPClockProxyOperationsTest, SetDomainMovesLaterRequestsToTheNewDomain) {
    proxy().setDomain(7, status_);
    ASSERT_TRUE(status_.succeeded());
    expectLastRequest(0x2007, kSet);
    EXPECT_EQ(lastRequest()->getHeader()->getDomainNumber(), 0);
    EXPECT_EQ(managed().defaultDataSet.domainNumber, 7);
    EXPECT_EQ(proxy().getDomainNumber(), 7);
    // The clock now answers in domain 7 only, and the proxy asks there.
    managed().defaultDataSet.priority1 = 77;
    EXPECT_EQ(proxy().getPriority1(status_), 77);
    EXPECT_EQ(lastRequest()->getHeader()->getDomainNumber(), 7);
    EXPECT_EQ(proxy().getDomain(status_), 7);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPClockProxyOperationsTest, AFailedSetDomainKeepsTheOldDomain) {
    managed().failures.setters = true;
    proxy().setDomain(7, status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(proxy().getDomainNumber(), 0);
    EXPECT_EQ(managed().defaultDataSet.domainNumber, 0);
}

TEST_F(tPTPClockProxyOperationsTest, CommandsAreAcknowledged) {
    using P = tPTPClockProxy;
    struct Command {
        const char* name;
        void (*run)(P&, tStatus&);
        std::uint16_t managementId;
        std::uint32_t action;
        bool acknowledged;  // the simulated clock has no non-volatile storage
    } commands[] = {
        {"getNullManagement", [](P& p, tStatus& s) { p.getNullManagement(s); }, 0x0000, kGet, true},
        {"setNullManagement", [](P& p, tStatus& s) { p.setNullManagement(s); }, 0x0000, kSet, true},
        {"commandNullManagement", [](P& p, tStatus& s) { p.commandNullManagement(s); }, 0x0000,
         kCommand, true},
        {"saveInNonVolatileStorage", [](P& p, tStatus& s) { p.saveInNonVolatileStorage(s); },
         0x0003, kCommand, false},
        {"resetNonVolatileStorage", [](P& p, tStatus& s) { p.resetNonVolatileStorage(s); }, 0x0004,
         kCommand, false},
        {"initialize", [](P& p, tStatus& s) { p.initialize(0x0000, s); }, 0x0005, kCommand, true},
        {"disablePort", [](P& p, tStatus& s) { p.disablePort(s); }, 0x200E, kCommand, true},
        {"enablePort", [](P& p, tStatus& s) { p.enablePort(s); }, 0x200D, kCommand, true},
    };
    managed().port(1).enabled = true;
    for (const Command& command : commands) {
        SCOPED_TRACE(command.name);
        tStatus status;
        command.run(proxy(), status);
        EXPECT_EQ(status.code, command.acknowledged ? 0 : kStatusNoData);
        expectLastRequest(command.managementId, command.action);
        if (std::string(command.name) == "disablePort") {
            EXPECT_FALSE(managed().port(1).enabled);
        }
    }
    EXPECT_TRUE(managed().port(1).enabled);
    EXPECT_EQ(managed().port(1).initializations, 1U);
    EXPECT_EQ(managed().port(2).initializations, 0U);
}

TEST_F(tPTPClockProxyOperationsTest, CommandsFailWhenTheClockRefuses) {
    proxy().initialize(0x1234, status_);  // an initialization key the clock does not know
    EXPECT_EQ(status_.code, kStatusNoData);
    status_.reset();
    managed().failures.commands = true;
    proxy().enablePort(status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    status_.reset();
    clock_.setFault(Fault::silent);
    proxy().setExchangeTimeout(20);
    proxy().commandNullManagement(status_);
    EXPECT_EQ(status_.code, kStatusNoData);
}

TEST_F(tPTPClockProxyOperationsTest, DataSetsAreRead) {
    managed().defaultDataSet.priority1 = 11;
    managed().defaultDataSet.clockQuality.clockClass = 6;
    managed().currentDataSet.stepsRemoved = 3;
    managed().parentDataSet.grandmasterPriority2 = 44;
    managed().timeProperties.currentUtcOffset = 37;
    managed().timeProperties.timeSource = 0x20;
    managed().port(1).logSyncInterval = -5;
    managed().port(2).logSyncInterval = 2;

    const auto defaults = proxy().getDefaultDataSet(status_);
    EXPECT_EQ(defaults.getPriority1(), 11);
    EXPECT_EQ(defaults.getClockQuality().clockClass, 6);
    EXPECT_EQ(defaults.getNumberPorts(), 2);
    EXPECT_EQ(defaults.getClockIdentity(), clockIdentity(1));
    EXPECT_EQ(proxy().getCurrentDataSet(status_).getStepsRemoved(), 3);
    EXPECT_EQ(proxy().getParentDataSet(status_).getGrandmasterPriority2(), 44);
    const auto timeProperties = proxy().getTimePropertiesDataSet(status_);
    EXPECT_EQ(timeProperties.getCurrentUtcOffset(), 37);
    EXPECT_EQ(timeProperties.getTimeSource(), 0x20);
    const auto port = proxy().getPortDataSet(status_);
    EXPECT_EQ(port.getPortIdentity(), proxy().getPortIdentity());
    EXPECT_EQ(port.getLogSyncInterval(), -5);
    EXPECT_EQ(otherPort_->getPortDataSet(status_).getLogSyncInterval(), 2);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPClockProxyOperationsTest, RecordsHoldTheirDefaultsWhenTheExchangeFails) {
    clock_.setFault(Fault::silent);
    proxy().setExchangeTimeout(20);
    const auto defaults = proxy().getDefaultDataSet(status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(defaults.getPriority1(), 100);
    EXPECT_EQ(defaults.getPriority2(), 100);
    EXPECT_EQ(defaults.getClockQuality().clockClass, 187);
    status_.reset();
    EXPECT_EQ(proxy().getCurrentDataSet(status_).getStepsRemoved(), 0);
    status_.reset();
    EXPECT_EQ(proxy().getPortDataSet(status_).getPortIdentity(),
              nQVPTP000::tPortDataSetTLV().getPortIdentity());
    status_.reset();
    EXPECT_EQ(proxy().getTime(status_), tTimestamp());
    EXPECT_EQ(status_.code, kStatusNoData);
    for (auto* read : {+[](tPTPClockProxy&p, tStatus&s) { p.getParentDataSet(s); },
                       +[](tPTPClockProxy&p, tStatus&s) { p.getTimePropertiesDataSet(s); },
                       +[](tPTPClockProxy&p, tStatus&s) { p.getUTCProperties(s); },
                       +[](tPTPClockProxy&p, tStatus&s) { p.getTraceabilityProperties(s); },
                       +[](tPTPClockProxy&p, tStatus&s) { p.refreshClockDescription(s); }}) {
        tStatus status;
        read(proxy(), status);
        EXPECT_EQ(status.code, kStatusNoData);
    }
}

TEST_F(tPTPClockProxyOperationsTest, TimeIsReadAndSet) {
    managed().time = tTimestamp(1700000000, 123456789);
    EXPECT_EQ(proxy().getTime(status_), tTimestamp(1700000000, 123456789));
    expectLastRequest(0x200F, kGet);
    proxy().setTime(tTimestamp(0x0000FFFFFFFFFFFFULL, 999999999), status_);
    expectLastRequest(0x200F, kSet);
    EXPECT_EQ(managed().time, tTimestamp(0x0000FFFFFFFFFFFFULL, 999999999));
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPClockProxyOperationsTest, UtcAndTraceabilityPropertiesGoBothWays) {
    managed().timeProperties.currentUtcOffset = 37;
    managed().timeProperties.leap61 = true;
    managed().timeProperties.currentUtcOffsetValid = true;
    managed().timeProperties.timeTraceable = true;
    const auto utc = proxy().getUTCProperties(status_);
    expectLastRequest(0x2011, kGet);
    EXPECT_EQ(utc.getCurrentUtcOffset(), 37);
    EXPECT_TRUE(utc.getLeap61());
    EXPECT_FALSE(utc.getLeap59());
    EXPECT_TRUE(utc.getCurrentUtcOffsetValid());
    const auto traceability = proxy().getTraceabilityProperties(status_);
    expectLastRequest(0x2012, kGet);
    EXPECT_TRUE(traceability.getTimeTraceable());
    EXPECT_FALSE(traceability.getFrequencyTraceable());

    // Written back after the clock changed: the clock takes the values sent.
    managed().timeProperties = {};
    managed().timeProperties.currentUtcOffset = 0;
    proxy().setUTCProperties(utc, status_);
    expectLastRequest(0x2011, kSet);
    proxy().setTraceabilityProperties(traceability, status_);
    expectLastRequest(0x2012, kSet);
    ASSERT_TRUE(status_.succeeded());
    EXPECT_EQ(managed().timeProperties.currentUtcOffset, 37);
    EXPECT_TRUE(managed().timeProperties.leap61);
    EXPECT_TRUE(managed().timeProperties.currentUtcOffsetValid);
    EXPECT_TRUE(managed().timeProperties.timeTraceable);
    EXPECT_FALSE(managed().timeProperties.frequencyTraceable);
}

TEST_F(tPTPClockProxyOperationsTest, UserDescriptionIsWrittenAndRead) {
    proxy().setUserDescription("abc", status_);
    ASSERT_TRUE(status_.succeeded());
    expectLastRequest(0x0002, kSet);
    ASSERT_EQ(managed().userDescription.getLengthField(), 3);
    char four[5] = {'x', 'x', 'x', 'x', 'x'};
    proxy().getUserDescription(four, 4, status_);
    expectLastRequest(0x0002, kGet);
    EXPECT_EQ(std::string(four, 5), std::string("abc\0x", 5));
    EXPECT_TRUE(status_.succeeded());
    // No room for the terminating zero: refused like the cached texts, buffer untouched.
    char three[4] = {'x', 'x', 'x', 'x'};
    proxy().getUserDescription(three, 3, status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(std::string(three, 4), "xxxx");
}

TEST_F(tPTPClockProxyOperationsTest, ATooLongUserDescriptionIsNotSent) {
    const std::size_t before = network_.sentCount();
    proxy().setUserDescription(std::string(256, 'u').c_str(), status_);
    EXPECT_EQ(status_.code, kStatusUnsupported);
    EXPECT_EQ(network_.sentCount(), before);
    status_.reset();
    proxy().setUserDescription(std::string(255, 'u').c_str(), status_);
    EXPECT_TRUE(status_.succeeded());
    EXPECT_EQ(managed().userDescription.getLengthField(), 255);
}

TEST_F(tPTPClockProxyOperationsTest, UserDescriptionFromASilentClockLeavesTheBuffer) {
    clock_.setFault(Fault::silent);
    proxy().setExchangeTimeout(20);
    char buffer[4] = {'x', 'x', 'x', 'x'};
    proxy().getUserDescription(buffer, sizeof(buffer), status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(std::string(buffer, 4), "xxxx");
}

}  // namespace
