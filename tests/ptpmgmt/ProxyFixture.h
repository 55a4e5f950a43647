#ifndef QV_TESTS_PTPMGMT_PROXYFIXTURE_H
#define QV_TESTS_PTPMGMT_PROXYFIXTURE_H

#include <gtest/gtest.h>

#include <memory>
#include <vector>

#include "ptp/tMessageHeader.h"
#include "ptpmgmt/tPTPClockProxy.h"
#include "ptpmgmt/tPTPMgmtNode.h"
#include "tests/ptpmgmt/ClientTestSupport.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

namespace qvtest {

// A node that has discovered one simulated clock with two ports; proxy() stands for port 1.
class ProxyFixture : public ::testing::Test {
  protected:
    void SetUp() override {
        network_.attach(clock_);
        node_.open(status_);
        ASSERT_TRUE(discoverAll(node_, 2, status_));
        ASSERT_TRUE(status_.succeeded());
        nQVPTPMGMT000::iPTPClockProxy* found[2] = {};
        node_.copyClockProxies(found, 2, status_);
        proxy_ = static_cast<nQVPTPMGMT000::tPTPClockProxy*>(found[0]);
        otherPort_ = static_cast<nQVPTPMGMT000::tPTPClockProxy*>(found[1]);
    }

    nQVPTPMGMT000::tPTPClockProxy& proxy() { return *proxy_; }
    InMemoryManagedClock& managed() { return clock_.managed(); }
    // The last request that went out.
    std::unique_ptr<nQVPTP000::tManagementMessage> lastRequest() const {
        const auto sent = network_.sentDatagrams();
        return sent.empty() ? nullptr : decodeManagement(sent.back());
    }

    tStatus status_;
    SimulatedNetwork network_;
    SimulatedClock clock_{clockIdentity(1), 2};
    nQVPTPMGMT000::tPTPMgmtNode node_{&network_, clientIdentity(), kClientPort, status_};
    nQVPTPMGMT000::tPTPClockProxy* proxy_ = nullptr;
    nQVPTPMGMT000::tPTPClockProxy* otherPort_ = nullptr;
};

}  // namespace qvtest

#endif
