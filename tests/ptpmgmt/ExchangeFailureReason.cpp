#include <gtest/gtest.h>

#include <string>

#include "platform/tStatusReason.h"
#include "tests/ptpmgmt/ProxyFixture.h"
#include "tests/support/TraceCapture.h"

namespace {

using Fault = qvtest::SimulatedClock::Fault;
using ExchangeFailureReason = qvtest::ProxyFixture;

// Every failed exchange keeps -52012; its extension words and its trace line tell why.
TEST_F(ExchangeFailureReason, TheStatusSaysWhyTheExchangeFailed) {
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
        const qvtest::DebugOutputCapture trace;
        proxy().getPriority1(status);
        EXPECT_EQ(status.code, kStatusNoData);
        EXPECT_EQ(tStatusReason::describe(status), c.description);
        EXPECT_NE(trace.text().find("failed: " + c.description), std::string::npos);
    }
}

}  // namespace
