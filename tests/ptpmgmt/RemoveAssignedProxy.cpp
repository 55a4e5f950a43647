#include "tests/ptpmgmt/ProxyFixture.h"

namespace {

using RemoveAssignedProxy = qvtest::ProxyFixture;

// After assign, the proxy's key names the other port; removing it must not take that one.
TEST_F(RemoveAssignedProxy, RemovesTheProxyItselfNotTheOneItsKeyNames) {
    const nQVPTP000::tPortIdentity other = otherPort_->getPortIdentity();
    proxy().assign(*otherPort_);
    node_.removeClock(proxy_, status_);
    ASSERT_TRUE(status_.succeeded());
    EXPECT_EQ(node_.clockCount(), 1);
    EXPECT_EQ(node_.findClock(nQVPTPMGMT000::makeClockKey(other), status_), otherPort_);
    EXPECT_TRUE(status_.succeeded());
}

}  // namespace
