// The remote operations of the clock proxy against a simulated clock: every GET returns the
// clock's value, every SET changes it, every COMMAND is acknowledged, and each fails with
// its documented value when the clock stays silent.
#include <gtest/gtest.h>

#include <string>

#include "platform/tStatusReason.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "tests/ptpmgmt/ProxyFixture.h"
#include "tests/support/TraceCapture.h"

using nQVPTP000::tManagementMessagePayload;
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

using P = tPTPClockProxy;

// An operation of the proxy, with the value it gives when the exchange fails (-1: none to
// check); a SET gives 0.
#define QV_OP(expression, failure)                                                             \
    {                                                                                          \
#expression, [](P & p, tStatus & s) { return static_cast<long>(expression); }, failure \
    }

TEST_F(tPTPClockProxyOperationsTest, ASilentClockFailsEveryOperationWithItsFailureValue) {
    const struct {
        const char* name;
        long (*run)(P&, tStatus&);
        long failure;
    } operations[] = {
        QV_OP(p.getPriority1(s), 0),
        QV_OP(p.getPriority2(s), 0),
        QV_OP(p.getSlaveOnly(s), 0),
        QV_OP(p.getClockAccuracy(s), 0xFE),
        QV_OP(p.getAnnounceReceiptTimeout(s), 0),
        QV_OP(p.getDelayMechanism(s), 1),
        QV_OP(p.getLogMinPdelayReqInterval(s), 0),
        QV_OP(p.getLogAnnounceInterval(s), 0),
        QV_OP(p.getLogSyncInterval(s), 0),
        QV_OP(p.getVersionNumber(s), 0),
        QV_OP(p.getDomain(s), 0),
        QV_OP(p.getDefaultDataSet(s).getPriority1(), 100),
        QV_OP(p.getDefaultDataSet(s).getClockQuality().clockClass, 187),
        QV_OP(p.getCurrentDataSet(s).getStepsRemoved(), 0),
        QV_OP(p.getTime(s).getSeconds(), 0),
        QV_OP(p.getParentDataSet(s).getGrandmasterPriority1(), -1),
        QV_OP(p.getTimePropertiesDataSet(s).getCurrentUtcOffset(), -1),
        QV_OP(p.getUTCProperties(s).getCurrentUtcOffset(), -1),
        QV_OP(p.getTraceabilityProperties(s).getTimeTraceable(), -1),
        QV_OP(p.getPortDataSet(s).getLogSyncInterval(), -1),
        QV_OP((p.setPriority1(17, s), 0), 0),
        QV_OP((p.setClockAccuracy(0x21, s), 0), 0),
        QV_OP((p.setDelayMechanism(2, s), 0), 0),
    };
    clock_.setFault(Fault::silent);
    proxy().setExchangeTimeout(20);
    for (const auto& operation : operations) {
        tStatus status;
        const long value = operation.run(proxy(), status);
        EXPECT_EQ(status.code, kStatusNoData) << operation.name;
        EXPECT_TRUE(operation.failure < 0 || value == operation.failure) << operation.name;
    }
    // Without setExchangeTimeout an exchange waits five seconds.
    EXPECT_EQ(tPTPClockProxy::kTimeoutMs, 5000);
}

TEST_F(tPTPClockProxyOperationsTest, CommandsAreAcknowledged) {
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

TEST_F(tPTPClockProxyOperationsTest, UserDescriptionIsWrittenAndReadWithinItsLimits) {
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
    status_.reset();
    const std::size_t before = network_.sentCount();
    proxy().setUserDescription(std::string(256, 'u').c_str(), status_);
    EXPECT_EQ(status_.code, kStatusUnsupported);
    EXPECT_EQ(network_.sentCount(), before);
    status_.reset();
    proxy().setUserDescription(std::string(255, 'u').c_str(), status_);
    EXPECT_TRUE(status_.succeeded());
    EXPECT_EQ(managed().userDescription.getLengthField(), 255);
}

// Every failed exchange keeps -52012; its extension words and its trace line tell why.
TEST_F(tPTPClockProxyOperationsTest, TheStatusSaysWhyTheExchangeFailed) {
    const struct {
        Fault fault;
        std::string description;  // from the clock's error id and text, or the time-out
    } cases[] = {
        {Fault::errorStatus, "refused by the clock: GENERAL_ERROR (simulated failure)"},
        {Fault::silent, "no answer within 20 ms"},
        {Fault::wrongAction, "answer of the wrong kind (actionField 4, managementId 0x2005)"},
    };
    proxy().setExchangeTimeout(20);
    for (const auto& c : cases) {
        clock_.setFault(c.fault);
        tStatus status;
        const DebugOutputCapture trace;
        proxy().getPriority1(status);
        EXPECT_EQ(status.code, kStatusNoData);
        EXPECT_EQ(tStatusReason::describe(status), c.description);
        EXPECT_NE(trace.text().find("failed: " + c.description), std::string::npos);
    }
}

}  // namespace
