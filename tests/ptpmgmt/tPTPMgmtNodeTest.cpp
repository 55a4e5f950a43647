#include "ptpmgmt/tPTPMgmtNode.h"

#include <gtest/gtest.h>

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
using nQVPTPMGMT000::tPTPClockProxy;
using namespace qvtest;
using Fault = SimulatedClock::Fault;

namespace {

constexpr auto kGet = tManagementMessagePayload::kGet;
constexpr auto kSet = tManagementMessagePayload::kSet;
constexpr auto kCommand = tManagementMessagePayload::kCommand;
// Long enough for the receive thread to store the answers on a loaded machine: these tests
// count what one discovery sent and found.
constexpr std::uint16_t kDiscoveryMs = 100;

nQVPTP000::tPTPText text(const char* value) {
    tStatus status;
    return nQVPTP000::tPTPText(value, status);
}

std::string productOf(const tPTPClockProxy& proxy) {
    char product[32] = {};
    tStatus status;
    proxy.getProductDescription(product, sizeof(product), status);
    return status.succeeded() ? product : "(" + std::to_string(status.code) + ")";
}

class tPTPMgmtNodeTest : public ::testing::Test {
  protected:
    void SetUp() override {
        node_.open(status_);
        ASSERT_TRUE(status_.succeeded());
    }

    SimulatedClock& addClock(std::uint8_t last, std::uint16_t ports = 1, std::uint8_t domain = 0,
                             nQVPTP000::tInterfaceIndex on = nQVPTP000::kEveryInterface) {
        clocks_.push_back(std::make_unique<SimulatedClock>(clockIdentity(last), ports, domain));
        network_.attach(*clocks_.back(), on);
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
    std::unique_ptr<tManagementMessage> exchange(std::uint16_t timeoutMs,
                                                 std::uint32_t action = kGet,
                                                 tStatus* status = nullptr) {
        return node_.sendAndAwait(tPortIdentity(clockIdentity(1), 1),
                                  std::make_unique<nQVPTP000::tPriority1TLV>(), action, timeoutMs,
                                  0, nQVPTP000::kEveryInterface, status ? *status : status_);
    }

    tStatus status_;
    SimulatedNetwork network_;
    std::vector<std::unique_ptr<SimulatedClock>> clocks_;
    nQVPTPMGMT000::tPTPMgmtNode node_{&network_, clientIdentity(), kClientPort, status_};
};

TEST_F(tPTPMgmtNodeTest, DiscoveryAsksAllClocksInDomainsZeroToThree) {
    addClock(1);
    addClock(2, 1, 3);
    node_.findClocks(kDiscoveryMs, status_);
    ASSERT_TRUE(status_.succeeded());
    const auto sent = network_.sentDatagrams();
    ASSERT_EQ(sent.size(), 4U);
    for (std::uint8_t domain = 0; domain < 4; ++domain) {
        std::unique_ptr<tManagementMessage> request = decodeManagement(sent[domain]);
        ASSERT_TRUE(request);
        EXPECT_EQ(request->getTargetPortIdentity(), nQVPTP000::allOnesPortIdentity());
        EXPECT_EQ(request->getHeader()->getDomainNumber(), domain);
        EXPECT_EQ(request->getHeader()->getSequenceId(), domain);
    }
    EXPECT_EQ(node_.clockCount(), 2);
}

TEST_F(tPTPMgmtNodeTest, EachPortBecomesAProxyInKeyOrderFoundAndRemovedByKey) {
    addClock(2, 2);
    addClock(1);
    node_.findClocks(kDiscoveryMs, status_);
    const auto found = proxies();
    ASSERT_TRUE(status_.succeeded());
    ASSERT_EQ(found.size(), 3U);
    EXPECT_EQ(found[2]->getPortIdentity(), tPortIdentity(clockIdentity(2), 2));
    iPTPClockProxy* wrongCount[2] = {};
    node_.copyClockProxies(wrongCount, 2, status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(wrongCount[0], nullptr);

    tStatus status;
    const nQVPTPMGMT000::tClockKey key = {0x00, 0x11, 0x22, 0xFF, 0xFE,
                                          0x33, 0x44, 0x02, 0x00, 0x02};
    EXPECT_EQ(node_.findClock(key, status), found[2]);
    node_.removeClock(found[2], status);
    EXPECT_EQ(node_.clockCount(), 2);
    EXPECT_TRUE(status.succeeded());
    EXPECT_EQ(node_.findClock(key, status), nullptr);
    EXPECT_EQ(status.code, kStatusNoData);
}

TEST_F(tPTPMgmtNodeTest, ALaterDiscoveryRefreshesDescriptionsAndKeepsSilentClocks) {
    // Clock 1 is seen in domains 0 and 3: it keeps its first domain and the last description.
    addClock(1, 1, 0).update([](auto& c) { c.port(1).productDescription = text("domain zero"); });
    addClock(1, 1, 3).update([](auto& c) { c.port(1).productDescription = text("domain three"); });
    SimulatedClock& second = addClock(2);
    second.update([](auto& c) { c.port(1).productDescription = text("second"); });
    node_.findClocks(kDiscoveryMs, status_);
    const auto before = proxies();
    ASSERT_EQ(before.size(), 2U);
    EXPECT_EQ(before[0]->getDomainNumber(), 0);
    EXPECT_EQ(productOf(*before[0]), "domain three");

    clocks_[1]->update([](auto& c) { c.port(1).productDescription = text("new"); });
    second.setFault(Fault::silent);
    node_.findClocks(kDiscoveryMs, status_);
    EXPECT_EQ(proxies(), before);  // the same proxies
    EXPECT_EQ(productOf(*before[0]), "new");
    EXPECT_EQ(productOf(*before[1]), "second");
    EXPECT_TRUE(status_.succeeded());
}

// A port on two networks is one proxy, reached through the interface of its first answer.
TEST_F(tPTPMgmtNodeTest, EachPortIsAskedThroughTheInterfaceItAnsweredOnFirst) {
    network_.attach(addClock(1, 1, 0, 7), 9);
    addClock(2, 1, 0, 9);
    node_.findClocks(kDiscoveryMs, status_);
    for (tPTPClockProxy* proxy : proxies()) {
        proxy->getPriority1(status_);
    }
    const auto via = network_.sentVia();  // four discovery requests, then one per proxy
    EXPECT_EQ(via, (std::vector<nQVPTP000::tInterfaceIndex>{0, 0, 0, 0, 7, 9}));
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPMgmtNodeTest, ADiscoveryWhoseSendFailsPartWayLeavesNothingAwaited) {
    addClock(1);
    network_.failSends(2, 1);  // domains 0 and 1 go out, domain 2 does not
    node_.findClocks(kDiscoveryMs, status_);
    EXPECT_EQ(status_.code, kStatusSocketError);
    EXPECT_EQ(network_.sentCount(), 2U);
    // Late answers to the two requests that went out are dropped, not stored for ever.
    for (std::uint16_t sequenceId = 0; sequenceId < 2; ++sequenceId) {
        network_.inject(answerOctets(sequenceId, clientPort(), tPortIdentity(clockIdentity(1), 1),
                                     tManagementMessagePayload::kResponse));
    }
    tStatus status;
    EXPECT_TRUE(exchange(1000, kGet, &status));  // its answer comes after the late ones
    EXPECT_EQ(node_.getTransceiver().storedResponseCount(), 0U);
    node_.findClocks(kDiscoveryMs, status);
    EXPECT_EQ(node_.clockCount(), 1);
    EXPECT_TRUE(status.succeeded());
}

// An error status, an answer of the wrong action and an answer about another management id
// end the exchange as failed when they arrive: a fitting answer that comes later is not
// taken.
TEST_F(tPTPMgmtNodeTest, AnswersThatDoNotFitTheRequestEndTheExchange) {
    SimulatedClock& clock = addClock(1);
    std::uint16_t sequenceId = 0;
    for (Fault fault : {Fault::errorStatus, Fault::wrongAction, Fault::wrongManagementId}) {
        clock.setFault(fault);
        for (std::uint32_t action : {kGet, kSet, kCommand}) {
            const auto fitting = action == kCommand ? tManagementMessagePayload::kAcknowledge
                                                    : tManagementMessagePayload::kResponse;
            network_.inject(answerOctets(sequenceId++, clientPort(),
                                         tPortIdentity(clockIdentity(1), 1), fitting),
                            std::chrono::milliseconds(2000));
            tStatus status;
            EXPECT_FALSE(node_.sendAndAwait(tPortIdentity(clockIdentity(1), 1),
                                            std::make_unique<nQVPTP000::tNullManagementTLV>(),
                                            action, 5000, 0, nQVPTP000::kEveryInterface, status));
            EXPECT_EQ(status.code, kStatusNoData) << "action " << action;
        }
    }
}

TEST_F(tPTPMgmtNodeTest, SilenceAndUnusableAnswersEndInATimeOut) {
    SimulatedClock& clock = addClock(1);
    for (Fault fault : {Fault::silent, Fault::garbage, Fault::wrongTargetPort}) {
        clock.setFault(fault);
        tStatus status;
        EXPECT_FALSE(exchange(100, kGet, &status));
        EXPECT_EQ(status.code, kStatusNoData);
    }
    // A time-out of zero sends and awaits nothing.
    clock.setFault(Fault::none);
    EXPECT_FALSE(exchange(0));
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(network_.sentCount(), 4U);
}

TEST_F(tPTPMgmtNodeTest, LateAndRepeatedAnswersAreTakenOnce) {
    SimulatedClock& clock = addClock(1);
    clock.setDelay(std::chrono::milliseconds(120));
    EXPECT_TRUE(exchange(1000));
    clock.setDelay(std::chrono::milliseconds(0));
    clock.setFault(Fault::twice);
    for (int round = 0; round < 10; ++round) {
        EXPECT_TRUE(exchange(1000));
    }
    ASSERT_TRUE(eventually([&] { return network_.queuedCount() == 0; }));
    clock.setFault(Fault::none);
    EXPECT_TRUE(exchange(1000));
    EXPECT_EQ(node_.getTransceiver().storedResponseCount(), 0U);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPMgmtNodeTest, AnErrorStatusAnsweringDiscoveryGivesAProxyWithoutDescription) {
    addClock(1).setFault(Fault::errorStatus);
    node_.findClocks(kDiscoveryMs, status_);
    const auto found = proxies();
    ASSERT_EQ(found.size(), 1U);
    EXPECT_FALSE(found[0]->isOrdinaryClock());
    EXPECT_EQ(productOf(*found[0]), "(" + std::to_string(kStatusNoData) + ")");
}

}  // namespace
