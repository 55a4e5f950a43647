// Which requests the simulated clock answers, and how.
#include "tests/support/ptpmgmt/SimulatedClock.h"

#include <gtest/gtest.h>

#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/tMessageHeader.h"
#include "tests/ptpmgmt/ClientTestSupport.h"

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tPortIdentity;
using namespace qvtest;

namespace {

class SimulatedClockTest : public ::testing::Test {
  protected:
    // The answers of the clock to a GET PRIORITY1 with these header and body fields.
    std::vector<SimulatedAnswer> ask(const tPortIdentity& target, std::uint8_t domain = 0,
                                     std::uint32_t action = tManagementMessagePayload::kGet) {
        tStatus status;
        tManagementMessage request(status);
        request.setActionField(action, status);
        request.setTargetPortIdentity(target, status);
        request.setPayload(std::make_unique<nQVPTP000::tPriority1TLV>(), status);
        request.getHeader()->setDomainNumber(domain, status);
        request.getHeader()->setSequenceId(0x1234, status);
        request.getHeader()->setSourcePortIdentity(clientPort(), status);
        const std::vector<std::uint8_t> octets = encodeMessage(request);
        return clock_.answer(octets.data(), octets.size());
    }

    SimulatedClock clock_{clockIdentity(1), 3, 2};
};

TEST_F(SimulatedClockTest, AnswersRequestsToItsPortsInItsDomain) {
    const auto answers = ask(tPortIdentity(clockIdentity(1), 2), 2);
    ASSERT_EQ(answers.size(), 1U);
    std::unique_ptr<tManagementMessage> answer = decodeManagement(answers[0].octets);
    ASSERT_TRUE(answer);
    EXPECT_EQ(answer->getActionField(), tManagementMessagePayload::kResponse);
    EXPECT_EQ(answer->getTargetPortIdentity(), clientPort());
    EXPECT_EQ(answer->getHeader()->getSourcePortIdentity(), tPortIdentity(clockIdentity(1), 2));
    EXPECT_EQ(answer->getHeader()->getSequenceId(), 0x1234);
    EXPECT_EQ(answer->getHeader()->getDomainNumber(), 2);
    EXPECT_EQ(clock_.requestsSeen(), 1U);
}

TEST_F(SimulatedClockTest, WildcardsReachEveryPort) {
    EXPECT_EQ(ask(nQVPTP000::allOnesPortIdentity(), 2).size(), 3U);
    EXPECT_EQ(ask(tPortIdentity(clockIdentity(1), 0xFFFF), 2).size(), 3U);
    EXPECT_EQ(ask(tPortIdentity(nQVPTP000::allOnesClockIdentity(), 3), 2).size(), 1U);
}

TEST_F(SimulatedClockTest, IgnoresWhatIsNotARequestToIt) {
    EXPECT_TRUE(ask(nQVPTP000::allOnesPortIdentity(), 0).empty());  // another domain
    EXPECT_TRUE(ask(tPortIdentity(clockIdentity(2), 1), 2).empty());
    EXPECT_TRUE(ask(tPortIdentity(clockIdentity(1), 4), 2).empty());  // no such port
    EXPECT_TRUE(ask(tPortIdentity(clockIdentity(1), 0), 2).empty());
    EXPECT_TRUE(
        ask(nQVPTP000::allOnesPortIdentity(), 2, tManagementMessagePayload::kResponse).empty());
    EXPECT_TRUE(
        ask(nQVPTP000::allOnesPortIdentity(), 2, tManagementMessagePayload::kAcknowledge).empty());
    const std::uint8_t garbage[] = {0x0D, 0x02, 0x00};
    EXPECT_TRUE(clock_.answer(garbage, sizeof(garbage)).empty());
    EXPECT_EQ(clock_.requestsSeen(), 0U);
}

TEST_F(SimulatedClockTest, MisbehavesAsToldAndLate) {
    const tPortIdentity port1(clockIdentity(1), 1);
    clock_.setDelay(std::chrono::milliseconds(30));
    clock_.setFault(SimulatedClock::Fault::twice);
    const auto twice = ask(port1, 2);
    ASSERT_EQ(twice.size(), 2U);
    EXPECT_EQ(twice[0].octets, twice[1].octets);
    EXPECT_EQ(twice[0].delay, std::chrono::milliseconds(30));

    clock_.setFault(SimulatedClock::Fault::wrongTargetPort);
    EXPECT_EQ(decodeManagement(ask(port1, 2)[0].octets)->getTargetPortIdentity(),
              tPortIdentity(clientIdentity(), kClientPort + 1));
    clock_.setFault(SimulatedClock::Fault::wrongAction);
    EXPECT_EQ(decodeManagement(ask(port1, 2)[0].octets)->getActionField(),
              tManagementMessagePayload::kAcknowledge);
    clock_.setFault(SimulatedClock::Fault::garbage);
    EXPECT_FALSE(decodeManagement(ask(port1, 2)[0].octets));
    clock_.setFault(SimulatedClock::Fault::silent);
    EXPECT_TRUE(ask(port1, 2).empty());
    EXPECT_EQ(clock_.requestsSeen(), 5U);
}

}  // namespace
