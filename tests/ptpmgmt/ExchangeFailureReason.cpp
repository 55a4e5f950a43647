#include <gtest/gtest.h>

#include <string>

#include "platform/tStatusReason.h"
#include "tests/ptpmgmt/ProxyFixture.h"
#include "tests/support/TraceCapture.h"

namespace {

using Fault = qvtest::SimulatedClock::Fault;
using Kind = tStatusReason::tKind;

class ExchangeFailureReason : public qvtest::ProxyFixture {};

// Every failed exchange keeps -52012; its extension words tell why.
TEST_F(ExchangeFailureReason, TheStatusSaysWhyTheExchangeFailed) {
    const struct {
        Fault fault;
        Kind kind;
        std::uint64_t number;
        std::string text;
        std::string description;
    } cases[] = {
        {Fault::errorStatus, Kind::kRefused, 0xFFFE, "simulated failure",
         "refused by the clock: GENERAL_ERROR (simulated failure)"},
        {Fault::silent, Kind::kNoAnswer, 20, "", "no answer within 20 ms"},
        {Fault::wrongAction, Kind::kWrongAnswer, 4U << 16 | 0x2005, "",
         "answer of the wrong kind (actionField 4, managementId 0x2005)"},
    };
    proxy().setExchangeTimeout(20);
    for (const auto& c : cases) {
        clock_.setFault(c.fault);
        tStatus status;
        const qvtest::DebugOutputCapture trace;
        proxy().getPriority1(status);
        EXPECT_EQ(status.code, kStatusNoData);
        EXPECT_EQ(tStatusReason::kindOf(status), c.kind);
        EXPECT_EQ(tStatusReason::numberOf(status), c.number);
        EXPECT_EQ(tStatusReason::textOf(status), c.text);
        EXPECT_EQ(tStatusReason::describe(status), c.description);
        EXPECT_NE(trace.text().find("failed: " + c.description), std::string::npos) << trace.text();
    }
}

}  // namespace
