#include <gtest/gtest.h>

#include <cmath>
#include <functional>
#include <limits>
#include <string>
#include <vector>

#include "ptp/tManagementIdTable.h"
#include "tests/expert/clocks/ExpertFixture.h"

namespace {

using namespace nQVPTP000;
using qvtest::ExpertFixture;
using qvtest::InMemoryManagedClock;
using tIds = std::vector<std::uint16_t>;
using tTags = std::vector<kxSysAttributeTagID>;

tClockIdentity sampleIdentity() {
    const std::uint8_t octets[8] = {0x02, 0x11, 0x22, 0xFF, 0xFE, 0x33, 0x44, 0x55};
    return tClockIdentity(octets);
}

ULONG tagCount(IkxSysPropertyBag& bag) {
    CQVComPtr<IkxSysEnumPropertyTag> tags;
    ULONG count = 0;
    if (bag.EnumerateTags(tags.Receive()) == S_OK) {
        kxSysAttributeTagID tag = 0;
        while (tags->Next(1, &tag, nullptr) == S_OK) {
            ++count;
        }
    }
    return count;
}

TEST_F(ExpertFixture, EveryReadableTagTakesOneRequestPerSourceInSourceOrder) {
    tTags all;
    for (const kxQvAttribute& row : kxQvAttributes) {
        if (row.requestable) {
            all.push_back(row.tag);
        }
    }
    std::reverse(all.begin(), all.end());
    CQVComPtr<IkxSysPropertyBag> bag;
    newRequests();
    ASSERT_EQ(read(all, bag), S_OK);
    EXPECT_EQ(newRequests(),
              (tIds{kTime, kPortDataSet, kCurrentDataSet, kDefaultDataSet, kTimePropertiesDataSet,
                    kParentDataSet, kUtcProperties, kClockDescription}));
    // Every clock-description tag comes along, the two unrequestable ones too.
    EXPECT_EQ(tagCount(*bag.get()), all.size() + 2);
}

TEST_F(ExpertFixture, ResultSaysHowMuchOfTheRequestWasServed) {
    struct Case {
        tTags tags;
        HRESULT result;
        ULONG tagsInBag;
        std::size_t requests;
    };
    const Case cases[] = {
        {{kxQvPriority1}, S_OK, 7, 1},
        {{kxQvPriority1, kxQvPriority1, kxQvPriority2}, S_OK, 7, 1},
        {{kxQvPriority1, kxSysItemName}, S_FALSE, 7, 1},
        {{kxSysItemName}, S_FALSE, 0, 0},
        {{kxSysNetworkAddress}, CORBEL_E_TAG_NOT_FOUND, 0, 0},
        {{0xE0FF000}, CORBEL_E_TAG_NOT_FOUND, 0, 0},
        {{}, S_OK, 0, 0},
    };
    newRequests();
    for (const Case& c : cases) {
        CQVComPtr<IkxSysPropertyBag> bag;
        EXPECT_EQ(read(c.tags, bag), c.result);
        EXPECT_EQ(tagCount(*bag.get()), c.tagsInBag);
        EXPECT_EQ(newRequests().size(), c.requests);
    }
    // A refused request fails the read, keeping what came before it.
    managed().failures.getters = true;
    CQVComPtr<IkxSysPropertyBag> bag;
    EXPECT_EQ(read({kxQvPriority1, kxQvUserDescription}, bag), E_FAIL);
    EXPECT_EQ(tagCount(*bag.get()), 0U);
    managed().failures.getters = false;
    clock.setFault(qvtest::SimulatedClock::Fault::errorStatus);
    EXPECT_EQ(read({kxQvPriority1}, bag), E_FAIL);
    ASSERT_NE(bag.get(), nullptr);
}

// One clock value, set in the simulated clock and read back through its tag.
struct Conversion {
    const char* what;
    std::function<void(InMemoryManagedClock&)> set;
    kxSysAttributeTagID tag;
    std::function<void(IkxSysPropertyBag2&, kxSysAttributeTagID)> expect;
};

std::function<void(IkxSysPropertyBag2&, kxSysAttributeTagID)> isDouble(double expected) {
    return [expected](IkxSysPropertyBag2& bag, kxSysAttributeTagID tag) {
        double value = 0;
        EXPECT_EQ(bag.GetDouble(tag, &value), S_OK);
        EXPECT_EQ(value, expected);
    };
}
std::function<void(IkxSysPropertyBag2&, kxSysAttributeTagID)> isText(std::u16string expected) {
    return [expected](IkxSysPropertyBag2& bag, kxSysAttributeTagID tag) {
        BSTR value = nullptr;
        EXPECT_EQ(bag.GetString(tag, &value), S_OK);
        EXPECT_EQ(std::u16string(value != nullptr ? value : u""), expected);
        SysFreeString(value);
    };
}
std::function<void(IkxSysPropertyBag2&, kxSysAttributeTagID)> isSeconds(std::int64_t expected) {
    return [expected](IkxSysPropertyBag2& bag, kxSysAttributeTagID tag) {
        kxSysAttrTimestampUTC value{1, 1};
        EXPECT_EQ(bag.GetTimestamp(tag, &value), S_OK);
        EXPECT_EQ(value.seconds, expected);
        EXPECT_EQ(value.fraction, 0U);
    };
}
template <typename T, HRESULT (KXSYS_CALL IkxSysPropertyBag::*Get)(kxSysAttributeTagID, T*)>
std::function<void(IkxSysPropertyBag2&, kxSysAttributeTagID)> is(T expected) {
    return [expected](IkxSysPropertyBag2& bag, kxSysAttributeTagID tag) {
        T value{};
        EXPECT_EQ((bag.*Get)(tag, &value), S_OK);
        EXPECT_EQ(value, expected);
    };
}
constexpr auto isLong = is<LONG, &IkxSysPropertyBag::GetLong>;
constexpr auto isULong = is<ULONG, &IkxSysPropertyBag::GetULong>;
constexpr auto isBool = is<BOOL, &IkxSysPropertyBag::GetBool>;

TEST_F(ExpertFixture, ClockValuesAreConvertedAtTheirEdges) {
    tStatus status;
    const std::uint8_t mac[6] = {0x02, 0x11, 0x22, 0x33, 0x44, 0x55};
    const std::uint8_t ip[4] = {192, 168, 1, 20};
    const Conversion cases[] = {
        {"time 0", [](auto& c) { c.time = tTimestamp(0, 999999999); }, kxQvTime,
         isSeconds(2082844800)},
        {"time 2^32-1904", [](auto& c) { c.time = tTimestamp(2212122496, 5); }, kxQvTime,
         isSeconds(4294967296)},
        {"offset -1.5 ns",
         [](auto& c) { c.currentDataSet.offsetFromMaster.setScaledNanoseconds(-98304); },
         kxQvOffsetFromMaster, isDouble(-1.0)},
        {"delay 1.5 ns",
         [](auto& c) { c.currentDataSet.meanPathDelay.setScaledNanoseconds(98304); },
         kxQvMeanPathDelay, isDouble(1.0)},
        {"sync interval 0xFF", [](auto& c) { c.port(1).logSyncInterval = -1; }, kxQvLogSyncInterval,
         isLong(-1)},
        {"disabled", [](auto& c) { c.port(1).portState = 3; }, kxQvPortEnabled, isBool(0)},
        {"slave", [](auto& c) { c.port(1).portState = 9; }, kxQvPortEnabled, isBool(1)},
        {"timeout", [](auto& c) { c.port(1).announceReceiptTimeout = 255; },
         kxQvAnnounceReceiptTimeout, isDouble(255.0)},
        {"utc offset -5", [](auto& c) { c.timeProperties.currentUtcOffset = -5; },
         kxQvCurrentUtcOffset, isULong(0xFFFFFFFBu)},
        {"mac", [&](auto& c) { c.port(1).physicalAddress.assign(mac, mac + 6); },
         kxSysHardwareAddress, isText(u"02:11:22:33:44:55")},
        {"address", [&](auto& c) { c.port(1).protocolAddress = tPortAddress(1, 4, ip, status); },
         kxSysNetworkAddress, isText(u"192.168.1.20")},
        {"address 0.0.0.0",
         [&](auto& c) {
             c.port(1).protocolAddress =
                 tPortAddress(1, 4, std::vector<std::uint8_t>(4).data(), status);
         },
         kxSysNetworkAddress, isText(u"xxx.xxx.xxx.xxx")},
        {"latin-1 text", [&](auto& c) { c.userDescription = tPTPText("caf\xE9 \xFF", status); },
         kxQvUserDescription, isText(u"caf\uFFFD \uFFFD")},
        {"own maker",
         [](auto& c) {
             c.port(1).manufacturerIdentity = {0x02, 0xA5, 0x3C};
         },
         kxSysOwnManufacturer, isBool(1)},
        {"stats clear", [](auto& c) { c.parentDataSet.parentStats = false; },
         kxQvParentOffsetVariance, isDouble(0.0)},
        {"variance 2^-3 ",
         [](auto& c) {
             c.parentDataSet.parentStats = true;
             c.parentDataSet.observedParentOffsetScaledLogVariance = 3;
             c.parentDataSet.observedParentClockPhaseChangeRate = -7;
         },
         kxQvParentOffsetVariance, isDouble(8.0)},
        {"rate -7", [](auto&) {}, kxQvParentPhaseChangeRate, isDouble(-7.0)},
        {"variance 2^65535",
         [](auto& c) { c.parentDataSet.observedParentOffsetScaledLogVariance = 0xFFFF; },
         kxQvParentOffsetVariance, isDouble(std::numeric_limits<double>::infinity())},
        {"reserved", [](auto&) {}, kxQvParentReserved, isDouble(0.0)},
        {"parent",
         [](auto& c) { c.parentDataSet.parentPortIdentity = tPortIdentity(sampleIdentity(), 258); },
         kxQvParentPortIdentity, isText(u"02-11-22-FF-FE-33-44-55:258")},
    };
    for (const Conversion& c : cases) {
        SCOPED_TRACE(c.what);
        c.set(managed());
        CQVComPtr<IkxSysPropertyBag> bag;
        ASSERT_EQ(read({c.tag}, bag), c.tag == kxSysNetworkAddress || c.tag == kxSysOwnManufacturer
                                          ? CORBEL_E_TAG_NOT_FOUND
                                          : S_OK);
        if (c.tag == kxSysNetworkAddress || c.tag == kxSysOwnManufacturer) {
            ASSERT_EQ(read({kxQvUserDescription}, bag), S_OK);
        }
        CQVComPtr<IkxSysPropertyBag2> second;
        ASSERT_EQ(
            bag->QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(second.Receive())),
            S_OK);
        c.expect(*second.get(), c.tag);
    }
}

}  // namespace
