#include "ptpmgmt/tMgmtMsgTransceiver.h"

#include <gtest/gtest.h>

#include "ptp/tMessageHeader.h"
#include "tests/ptpmgmt/ClientTestSupport.h"
#include "tests/support/FailingAllocation.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tPortIdentity;
using nQVPTPMGMT000::tMgmtMsgTransceiver;
using namespace qvtest;

namespace {

constexpr auto kResponse = tManagementMessagePayload::kResponse;

class tMgmtMsgTransceiverTest : public ::testing::Test {
  protected:
    void SetUp() override {
        transceiver_.start(status_);
        ASSERT_TRUE(status_.succeeded());
    }

    std::uint16_t send() {
        std::unique_ptr<tManagementMessage> request = nullRequest(tManagementMessagePayload::kGet);
        return transceiver_.sendRequest(*request, status_);
    }
    // An answer from port `sourcePort` of a clock, to this client unless told otherwise.
    void inject(std::uint16_t sequenceId, std::uint16_t sourcePort,
                std::uint32_t action = kResponse, const tPortIdentity& target = clientPort()) {
        network_.inject(
            answerOctets(sequenceId, target, tPortIdentity(clockIdentity(1), sourcePort), action));
    }
    // Waits until `count` answers have been stored since the start.
    bool storedTotal(std::uint64_t count) {
        return eventually([&] { return transceiver_.arrivals() >= count; });
    }
    // The source port number of the next answer taken for `sequenceId`, 0 for none.
    std::uint16_t take(std::uint16_t sequenceId) {
        std::unique_ptr<tManagementMessage> answer = transceiver_.takeResponse(sequenceId, status_);
        return answer ? answer->getHeader()->getSourcePortIdentity().getPortNumber() : 0;
    }

    tStatus status_;
    SimulatedNetwork network_;
    tMgmtMsgTransceiver transceiver_{&network_, clientIdentity(), kClientPort, status_};
};

TEST_F(tMgmtMsgTransceiverTest, SequenceIdsCountFromZeroAndWrapAfter65536Requests) {
    for (std::uint32_t sent = 0; sent < 65536; ++sent) {
        tStatus scratch;
        transceiver_.retireRequest(send(), scratch);
    }
    EXPECT_EQ(send(), 0);
    ASSERT_TRUE(status_.succeeded());
    // The ids are written into the datagrams.
    const auto sent = network_.sentDatagrams();
    ASSERT_EQ(sent.size(), 65537U);
    for (unsigned i : {0U, 1U, 65535U, 65536U}) {
        EXPECT_EQ(decodeManagement(sent[i])->getHeader()->getSequenceId(), i % 65536);
    }
}

// Kept: RESPONSE and ACKNOWLEDGE to a pending id, addressed exactly to this port, in
// arrival order.
TEST_F(tMgmtMsgTransceiverTest, OnlyAnswersToPendingRequestsOfThisPortAreKept) {
    const std::uint16_t cancelled = send();
    transceiver_.cancelRequest(cancelled, status_);
    inject(cancelled, 1);
    inject(40, 2);  // never sent
    const std::uint16_t id = send();
    inject(id, 3, kResponse, tPortIdentity(clientIdentity(), kClientPort + 1));
    inject(id, 4, kResponse, nQVPTP000::allOnesPortIdentity());
    inject(id, 5, tManagementMessagePayload::kGet);
    inject(id, 9, tManagementMessagePayload::kAcknowledge);
    inject(id, 8);
    ASSERT_TRUE(storedTotal(2));
    EXPECT_EQ(take(cancelled), 0);
    EXPECT_EQ(take(40), 0);
    EXPECT_EQ(take(id), 9);
    EXPECT_EQ(take(id), 8);
    EXPECT_EQ(take(id), 0);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tMgmtMsgTransceiverTest, StoredAnswersSurviveCancelButNotRetire) {
    const std::uint16_t kept = send();
    const std::uint16_t retired = send();
    inject(kept, 1);
    inject(retired, 2);
    ASSERT_TRUE(storedTotal(2));
    transceiver_.cancelRequest(kept, status_);
    transceiver_.retireRequest(retired, status_);
    EXPECT_EQ(transceiver_.storedResponseCount(), 1U);
    EXPECT_EQ(take(kept), 1);
    EXPECT_EQ(take(retired), 0);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tMgmtMsgTransceiverTest, StopEndsTheThreadClosesTheTransportAndStartAgainWorks) {
    transceiver_.stop(status_);
    EXPECT_TRUE(status_.succeeded());
    EXPECT_FALSE(transceiver_.isRunning());
    EXPECT_FALSE(network_.isOpen());
    std::unique_ptr<tManagementMessage> request = nullRequest(tManagementMessagePayload::kGet);
    EXPECT_EQ(transceiver_.sendRequest(*request, status_), 0);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(network_.sentCount(), 0U);

    status_.reset();
    transceiver_.start(status_);
    ASSERT_TRUE(status_.succeeded());
    const std::uint16_t id = send();
    inject(id, 4);
    ASSERT_TRUE(storedTotal(1));
    EXPECT_EQ(take(id), 4);
}

TEST_F(tMgmtMsgTransceiverTest, ATransportErrorDoesNotStopDelivery) {
    const std::uint16_t id = send();
    network_.failNextReceive();
    network_.inject({0xDE, 0xAD});  // does not decode: dropped quietly
    inject(id, 5);
    ASSERT_TRUE(storedTotal(1));
    EXPECT_EQ(take(id), 5);
    EXPECT_EQ(transceiver_.receiveErrorCount(), 1U);
    EXPECT_EQ(transceiver_.lastReceiveError().code, kStatusSocketError);
}

TEST_F(tMgmtMsgTransceiverTest, AnAnswerThatComesBackAtOnceIsKept) {
    // The simulated clock answers inside sendGeneralMessage: the answer may be received
    // before the send has returned.
    SimulatedClock clock(clockIdentity(1));
    network_.attach(clock);
    for (std::uint64_t round = 1; round <= 200; ++round) {
        const std::uint16_t id = send();
        ASSERT_TRUE(storedTotal(round)) << "answer to request " << id << " was lost";
        EXPECT_EQ(take(id), 1);
    }
}

}  // namespace
