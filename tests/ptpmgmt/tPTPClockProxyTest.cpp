// The clock proxy's own state: the cached clock description, the clock key, assign and
// refreshClockDescription.
#include "ptpmgmt/tPTPClockProxy.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "tests/ptpmgmt/ProxyFixture.h"
#include "tests/support/FailingAllocation.h"

using nQVPTP000::tPortIdentity;
using nQVPTP000::tPTPText;
using nQVPTPMGMT000::tPTPClockProxy;
using namespace qvtest;
using Fault = SimulatedClock::Fault;

namespace {

tPTPText text(const char* value) {
    tStatus status;
    return tPTPText(value, status);
}

// The clock describes port 1 fully before discovery; port 2 keeps the defaults.
class tPTPClockProxyTest : public ProxyFixture {
  protected:
    void SetUp() override {
        InMemoryManagedClock::Port& port = managed().port(1);
        port.physicalAddress = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
        port.manufacturerIdentity = {0x00, 0x1B, 0x19};
        port.productDescription = text("0123456789");
        port.profileIdentity = {0x00, 0x1B, 0x19, 0x00, 0x01, 0x00};
        ProxyFixture::SetUp();
    }
};

TEST_F(tPTPClockProxyTest, TextsNeedRoomForTheirTerminatingZero) {
    char product[12];
    std::memset(product, 'x', sizeof(product));
    proxy().getProductDescription(product, 10, status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(std::string(product, sizeof(product)), std::string(12, 'x'));
    status_.reset();
    proxy().getProductDescription(product, 11, status_);
    EXPECT_TRUE(status_.succeeded());
    EXPECT_STREQ(product, "0123456789");

    char buffer[1];
    otherPort_->getProductDescription(buffer, 1, status_);  // an empty text fits in one
    EXPECT_STREQ(buffer, "");
    EXPECT_TRUE(status_.succeeded());
}

// A buffer one octet short gets nothing; one of the field's size gets the field only.
TEST_F(tPTPClockProxyTest, OctetFieldsNeedTheirWholeSize) {
    EXPECT_EQ(proxy().getPhysicalAddressLength(), 6);
    using tOctetReader = void (tPTPClockProxy::*)(std::uint8_t*, std::uint16_t, tStatus&) const;
    struct {
        tOctetReader read;
        std::vector<std::uint8_t> field;
    } const cases[] = {
        {&tPTPClockProxy::getPhysicalAddress, {0x02, 0x11, 0x22, 0x33, 0x44, 0x55}},
        {&tPTPClockProxy::getManufacturerIdentity, {0x00, 0x1B, 0x19}},
        {&tPTPClockProxy::getProfileIdentity, {0x00, 0x1B, 0x19, 0x00, 0x01, 0x00}},
    };
    for (const auto& c : cases) {
        const auto size = static_cast<std::uint16_t>(c.field.size());
        std::vector<std::uint8_t> octets(size + 1U, 0xEE);
        tStatus status;
        (proxy().*c.read)(octets.data(), static_cast<std::uint16_t>(size - 1), status);
        EXPECT_EQ(status.code, kStatusNoData);
        EXPECT_EQ(octets, std::vector<std::uint8_t>(size + 1U, 0xEE));
        status.reset();
        (proxy().*c.read)(octets.data(), size, status);
        std::vector<std::uint8_t> expected = c.field;
        expected.push_back(0xEE);
        EXPECT_EQ(octets, expected);
        EXPECT_TRUE(status.succeeded());
    }
}

TEST_F(tPTPClockProxyTest, AssignTakesTargetAndDomainButNotTheDescription) {
    // A proxy for another clock in domain 2, whose description differs.
    SimulatedClock other(clockIdentity(9), 1, 2);
    other.managed().port(1).physicalAddress = {0x0A, 0x0B};
    network_.attach(other);
    ASSERT_TRUE(discoverAll(node_, 3, status_));
    nQVPTPMGMT000::iPTPClockProxy* found[3] = {};
    node_.copyClockProxies(found, 3, status_);
    auto& source = *static_cast<tPTPClockProxy*>(found[2]);
    ASSERT_EQ(source.getPortIdentity().getClockIdentity(), clockIdentity(9));
    proxy().assign(source);
    EXPECT_EQ(proxy().getPortIdentity(), source.getPortIdentity());
    EXPECT_EQ(proxy().getDomainNumber(), 2);
    EXPECT_EQ(proxy().getPhysicalAddressLength(), 6);  // its own cached description
    EXPECT_EQ(proxy().getClockKey()[7], 9);
    // Requests now go to the other clock, in its domain.
    other.managed().defaultDataSet.priority1 = 99;
    EXPECT_EQ(proxy().getPriority1(status_), 99);
    EXPECT_EQ(lastRequest()->getHeader()->getDomainNumber(), 2);
    EXPECT_TRUE(status_.succeeded());
    node_.close(status_);  // before `other` goes
}

// After assign, the proxy's key names the other port; removing it must not take that one.
TEST_F(tPTPClockProxyTest, RemovesTheProxyItselfNotTheOneItsKeyNames) {
    const nQVPTP000::tPortIdentity other = otherPort_->getPortIdentity();
    proxy().assign(*otherPort_);
    node_.removeClock(proxy_, status_);
    ASSERT_TRUE(status_.succeeded());
    EXPECT_EQ(node_.clockCount(), 1);
    EXPECT_EQ(node_.findClock(nQVPTPMGMT000::makeClockKey(other), status_), otherPort_);
    EXPECT_TRUE(status_.succeeded());
}

TEST_F(tPTPClockProxyTest, RefreshReplacesTheCachedDescriptionOnSuccessOnly) {
    managed().port(1).productDescription = text("renamed");
    const nQVPTP000::tClockDescriptionTLV fresh = proxy().refreshClockDescription(status_);
    ASSERT_TRUE(status_.succeeded());
    std::unique_ptr<nQVPTP000::tManagementMessage> request = lastRequest();
    EXPECT_EQ(request->getPayload(status_)->getManagementId(), 0x0001);
    EXPECT_EQ(request->getTargetPortIdentity(), proxy().getPortIdentity());
    EXPECT_EQ(fresh.getProductDescription(), text("renamed"));
    char product[16];
    proxy().getProductDescription(product, sizeof(product), status_);
    EXPECT_STREQ(product, "renamed");

    managed().port(1).productDescription = text("again");
    clock_.setFault(Fault::errorStatus);
    const nQVPTP000::tClockDescriptionTLV failed = proxy().refreshClockDescription(status_);
    EXPECT_EQ(status_.code, kStatusNoData);
    EXPECT_EQ(failed.getProductDescription(), tPTPText());
    tStatus status;
    proxy().getProductDescription(product, sizeof(product), status);
    EXPECT_STREQ(product, "renamed");
}

}  // namespace

namespace {

// Makes each allocation of `operation` on the calling thread fail in turn, until one run
// needs no more than it was given: memory running out must end as a failed status, never
// as an exception out of the management client.
template <typename Operation>
void failEachAllocationOf(const char* name, Operation&& operation) {
    for (unsigned nth = 1; nth < 1000; ++nth) {
        tStatus status;
        bool triggered = false;
        {
            ScopedAllocationFailure failure(nth);
            EXPECT_NO_THROW(operation(status)) << "allocation " << nth;
            triggered = failure.triggered();
        }
        if (!triggered) {
            EXPECT_TRUE(status.succeeded()) << status.code;
            return;
        }
        EXPECT_TRUE(status.failed()) << name << ": allocation " << nth;
    }
    ADD_FAILURE() << "the operation kept allocating";
}

}  // namespace

TEST_F(tPTPClockProxyTest, RunningOutOfMemoryInExchangesIsRecordedNotThrown) {
    proxy().setExchangeTimeout(20);
    failEachAllocationOf("getDefaultDataSet",
                         [&](tStatus& status) { proxy().getDefaultDataSet(status); });
    failEachAllocationOf("refreshClockDescription",
                         [&](tStatus& status) { proxy().refreshClockDescription(status); });
    failEachAllocationOf("findClocks", [&](tStatus& status) { node_.findClocks(20, status); });
}
