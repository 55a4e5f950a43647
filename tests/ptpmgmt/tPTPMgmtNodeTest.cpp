#include "ptpmgmt/tPTPMgmtNode.h"

#include <gtest/gtest.h>

#include <cstring>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/tMessageHeader.h"
#include "ptpmgmt/tPTPClockProxy.h"
#include "tests/ptpmgmt/ClientTestSupport.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

using nQVPTP000::tManagementMessage;
using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tPortIdentity;
using nQVPTPMGMT000::iPTPClockProxy;
using nQVPTPMGMT000::tClockKey;
using nQVPTPMGMT000::tPTPClockProxy;
using nQVPTPMGMT000::tPTPMgmtNode;
using namespace qvtest;
using Fault = SimulatedClock::Fault;

namespace {

constexpr auto kGet = tManagementMessagePayload::kGet;
constexpr auto kSet = tManagementMessagePayload::kSet;
constexpr auto kCommand = tManagementMessagePayload::kCommand;
constexpr std::uint16_t kDiscoveryMs = 30;

nQVPTP000::tPTPText text(const char* value) {
    tStatus status;
    return nQVPTP000::tPTPText(value, status);
}

class tPTPMgmtNodeTest : public ::testing::Test {
  protected:
    void SetUp() override {
        node_.open(status_);
        ASSERT_TRUE(status_.succeeded());
    }

    SimulatedClock& addClock(std::uint8_t last, std::uint16_t ports = 1, std::uint8_t domain = 0) {
        clocks_.push_back(std::make_unique<SimulatedClock>(clockIdentity(last), ports, domain));
        network_.attach(*clocks_.back());
        return *clocks_.back();
    }
    std::vector<tPTPClockProxy*> proxies() {
        std::vector<iPTPClockProxy*> found(node_.clockCount());
        node_.copyClockProxies(found.data(), node_.clockCount(), status_);
        std::vector<tPTPClockProxy*> concrete;
        for (iPTPClockProxy* proxy : found) {
            concrete.push_back(static_cast<tPTPClockProxy*>(proxy));
        }
        return concrete;
    }
    // One exchange with port 1 of clock 1 in domain 0.
    std::unique_ptr<tManagementMessage> exchange(std::unique_ptr<tManagementMessagePayload> payload,
                                                 std::uint32_t action, std::uint16_t timeoutMs) {
        return node_.sendAndAwait(tPortIdentity(clockIdentity(1), 1), std::move(payload), action,
                                  timeoutMs, 0, status_);
    }

    tStatus status_;
    SimulatedNetwork network_;
    std::vector<std::unique_ptr<SimulatedClock>> clocks_;
    tPTPMgmtNode node_{&network_, clientIdentity(), kClientPort, status_};
};

TEST_F(tPTPMgmtNodeTest, DiscoveryAsksAllClocksInDomainsZeroToThree) {
    addClock(1);
    const double took = millisecondsOf([&] { node_.findClocks(kDiscoveryMs, status_); });
    ASSERT_TRUE(status_.succeeded());
    EXPECT_GE(took, kDiscoveryMs);
    const auto sent = network_.sentDatagrams();
    ASSERT_EQ(sent.size(), 4U);
    for (std::uint8_t domain = 0; domain < 4; ++domain) {
        std::unique_ptr<tManagementMessage> request = decodeManagement(sent[domain]);
        ASSERT_TRUE(request);
        EXPECT_EQ(request->getActionField(), kGet);
        EXPECT_EQ(request->getTargetPortIdentity(), nQVPTP000::allOnesPortIdentity());
        EXPECT_EQ(request->getHeader()->getDomainNumber(), domain);
        EXPECT_EQ(request->getHeader()->getSequenceId(), domain);
        EXPECT_EQ(request->getHeader()->getSourcePortIdentity(), clientPort());
        EXPECT_EQ(request->getPayload(status_)->getManagementId(), 0x0001);
    }
    EXPECT_EQ(node_.clockCount(), 1);
}

TEST_F(tPTPMgmtNodeTest, DiscoveryInTheDefaultDomainSendsOneRequest) {
    addClock(1);
    addClock(2, 1, 1);
    node_.findClocksInDefaultDomain(kDiscoveryMs, status_);
    EXPECT_EQ(network_.sentCount(), 1U);
    EXPECT_EQ(node_.clockCount(), 1);
}

TEST_F(tPTPMgmtNodeTest, EachPortBecomesAProxyInKeyOrder) {
    addClock(2, 2);
    addClock(1);
    node_.findClocks(kDiscoveryMs, status_);
    const auto found = proxies();
    ASSERT_TRUE(status_.succeeded());
    ASSERT_EQ(found.size(), 3U);
    EXPECT_EQ(found[0]->getPortIdentity(), tPortIdentity(clockIdentity(1), 1));
    EXPECT_EQ(found[1]->getPortIdentity(), tPortIdentity(clockIdentity(2), 1));
    EXPECT_EQ(found[2]->getPortIdentity(), tPortIdentity(clockIdentity(2), 2));
}

TEST_F(tPTPMgmtNodeTest, AClockInTwoDomainsKeepsItsFirstDomainAndTheLastDescription) {
    // One clock identity seen in domain 0 and in domain 3.
    addClock(1, 1, 0).update(
        [](auto& clock) { clock.port(1).productDescription = text("domain zero"); });
    addClock(1, 1, 3).update(
        [](auto& clock) { clock.port(1).productDescription = text("domain three"); });
    node_.findClocks(kDiscoveryMs, status_);
    const auto found = proxies();
    ASSERT_EQ(found.size(), 1U);
    EXPECT_EQ(found[0]->getDomainNumber(), 0);
    char product[32] = {};
    found[0]->getProductDescription(product, sizeof(product), status_);
    EXPECT_STREQ(product, "domain three");
}

TEST_F(tPTPMgmtNodeTest, ALaterDiscoveryRefreshesDescriptionsAndKeepsSilentClocks) {
    SimulatedClock& first = addClock(1);
    SimulatedClock& second = addClock(2);
    first.update([](auto& clock) { clock.port(1).productDescription = text("old"); });
    second.update([](auto& clock) { clock.port(1).productDescription = text("second"); });
    node_.findClocks(kDiscoveryMs, status_);
    const auto before = proxies();
    first.update([](auto& clock) { clock.port(1).productDescription = text("new"); });
    second.setFault(Fault::silent);
    node_.findClocks(kDiscoveryMs, status_);
    ASSERT_EQ(node_.clockCount(), 2);
    const auto after = proxies();
    EXPECT_EQ(after, before);  // the same proxies
    char product[16] = {};
    after[0]->getProductDescription(product, sizeof(product), status_);
    EXPECT_STREQ(product, "new");
    after[1]->getProductDescription(product, sizeof(product), status_);
    EXPECT_STREQ(product, "second");
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPMgmtNodeTest, CopyingProxiesNeedsTheExactCount) {
    addClock(1);
    node_.findClocks(kDiscoveryMs, status_);
    iPTPClockProxy* found[2] = {nullptr, nullptr};
    node_.copyClockProxies(found, 2, status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(found[0], nullptr);
}

TEST_F(tPTPMgmtNodeTest, FindsAndRemovesClocksByKey) {
    addClock(1, 2);
    node_.findClocks(kDiscoveryMs, status_);
    tClockKey key = {0x00, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, 0x01, 0x00, 0x02};
    iPTPClockProxy* proxy = node_.findClock(key, status_);
    ASSERT_NE(proxy, nullptr);
    EXPECT_EQ(proxy->getPortIdentity(), tPortIdentity(clockIdentity(1), 2));
    node_.removeClock(proxy, status_);
    EXPECT_EQ(node_.clockCount(), 1);
    EXPECT_TRUE(status_.succeeded());
    EXPECT_EQ(node_.findClock(key, status_), nullptr);
    EXPECT_EQ(status_.code, kStatusNoData);
}

TEST_F(tPTPMgmtNodeTest, AnExchangeReturnsTheCheckedAnswer) {
    addClock(1).update([](auto& clock) { clock.defaultDataSet.priority1 = 17; });
    std::unique_ptr<tManagementMessage> answer =
        exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 1000);
    ASSERT_TRUE(answer);
    ASSERT_TRUE(status_.succeeded());
    EXPECT_EQ(answer->getActionField(), tManagementMessagePayload::kResponse);
    EXPECT_EQ(answer->getHeader()->getSourcePortIdentity(), tPortIdentity(clockIdentity(1), 1));
    const auto* priority = dynamic_cast<nQVPTP000::tPriority1TLV*>(answer->getPayload(status_));
    ASSERT_NE(priority, nullptr);
    EXPECT_EQ(priority->getValue(), 17);
}

// An error status, an answer of the wrong action and an answer about another management id
// end the exchange as failed as soon as they arrive, whatever the request's action.
TEST_F(tPTPMgmtNodeTest, AnswersThatDoNotFitTheRequestFailAsSoonAsTheyArrive) {
    SimulatedClock& clock = addClock(1);
    for (Fault fault : {Fault::errorStatus, Fault::wrongAction, Fault::wrongManagementId}) {
        clock.setFault(fault);
        for (std::uint32_t action : {kGet, kSet, kCommand}) {
            tStatus status;
            const double took = millisecondsOf([&] {
                EXPECT_FALSE(node_.sendAndAwait(tPortIdentity(clockIdentity(1), 1),
                                                std::make_unique<nQVPTP000::tNullManagementTLV>(),
                                                action, 5000, 0, status));
            });
            EXPECT_EQ(status.code, kStatusNoData) << "action " << action;
            EXPECT_TRUE(isManagementComponent(status));
            EXPECT_LT(took, 1000.0);
        }
    }
}

TEST_F(tPTPMgmtNodeTest, AnExchangeTimesOutAfterItsPollSteps) {
    addClock(1).setFault(Fault::silent);
    // 120 ms is three steps of 50 ms: about 150 ms.
    const double took = millisecondsOf(
        [&] { EXPECT_FALSE(exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 120)); });
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_GE(took, 140.0);
    EXPECT_LT(took, 1000.0);
}

TEST_F(tPTPMgmtNodeTest, ATimeOutOfZeroSendsButAwaitsNothing) {
    addClock(1);
    EXPECT_FALSE(exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 0));
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(network_.sentCount(), 1U);
}

TEST_F(tPTPMgmtNodeTest, UnusableAnswersLeadToATimeOut) {
    SimulatedClock& clock = addClock(1);
    for (Fault fault : {Fault::garbage, Fault::wrongTargetPort}) {
        clock.setFault(fault);
        tStatus status;
        EXPECT_FALSE(node_.sendAndAwait(tPortIdentity(clockIdentity(1), 1),
                                        std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 100, 0,
                                        status));
        EXPECT_EQ(status.code, kStatusNoData);
    }
}

TEST_F(tPTPMgmtNodeTest, ALateAnswerWithinTheTimeOutIsTaken) {
    addClock(1).setDelay(std::chrono::milliseconds(120));
    const double took = millisecondsOf(
        [&] { EXPECT_TRUE(exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 1000)); });
    EXPECT_TRUE(status_.succeeded());
    EXPECT_GE(took, 119.0);
    EXPECT_LT(took, 900.0);  // woken by the arrival, not by the end of the time-out
}

TEST_F(tPTPMgmtNodeTest, SecondAnswersToAnExchangeAreNotKept) {
    addClock(1).setFault(Fault::twice);
    for (int round = 0; round < 10; ++round) {
        EXPECT_TRUE(exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 1000));
    }
    ASSERT_TRUE(eventually([&] { return network_.queuedCount() == 0; }));
    clocks_.back()->setFault(Fault::none);
    EXPECT_TRUE(exchange(std::make_unique<nQVPTP000::tPriority1TLV>(), kGet, 1000));
    EXPECT_EQ(node_.getTransceiver().storedResponseCount(), 0U);
}

TEST_F(tPTPMgmtNodeTest, AnErrorStatusAnsweringDiscoveryGivesAProxyWithoutDescription) {
    addClock(1).setFault(Fault::errorStatus);
    node_.findClocks(kDiscoveryMs, status_);
    const auto found = proxies();
    ASSERT_EQ(found.size(), 1U);
    tPTPClockProxy& proxy = *found[0];
    EXPECT_FALSE(proxy.isOrdinaryClock());
    EXPECT_FALSE(proxy.isBoundaryClock());
    EXPECT_FALSE(proxy.isManagementNode());
    EXPECT_FALSE(proxy.isP2PTransparentClock());
    EXPECT_FALSE(proxy.isE2ETransparentClock());
    EXPECT_EQ(proxy.getPhysicalAddressLength(), 0);
    EXPECT_EQ(proxy.getProtocolAddress(), nQVPTP000::tPortAddress());
    char textBuffer[64] = "untouched";
    std::uint8_t octets[64] = {0xAA};
    using tTextReader = void (tPTPClockProxy::*)(char*, std::uint16_t, tStatus&) const;
    for (tTextReader reader :
         {&tPTPClockProxy::getPhysicalLayerProtocol, &tPTPClockProxy::getProductDescription,
          &tPTPClockProxy::getRevisionData, &tPTPClockProxy::getCachedUserDescription}) {
        tStatus status;
        (proxy.*reader)(textBuffer, sizeof(textBuffer), status);
        EXPECT_EQ(status.code, kStatusNoData);
    }
    using tOctetReader = void (tPTPClockProxy::*)(std::uint8_t*, std::uint16_t, tStatus&) const;
    for (tOctetReader reader :
         {&tPTPClockProxy::getPhysicalAddress, &tPTPClockProxy::getManufacturerIdentity,
          &tPTPClockProxy::getProfileIdentity}) {
        tStatus status;
        (proxy.*reader)(octets, sizeof(octets), status);
        EXPECT_EQ(status.code, kStatusNoData);
    }
    EXPECT_STREQ(textBuffer, "untouched");
    EXPECT_EQ(octets[0], 0xAA);
}

}  // namespace
