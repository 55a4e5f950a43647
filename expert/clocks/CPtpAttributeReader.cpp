#include "expert/clocks/CPtpAttributeReader.h"

#include <algorithm>
#include <array>
#include <cstring>

#include "expert/clocks/CPtpValueFormat.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"

namespace {

using nQVPTPMGMT000::iPTPClockProxy;
using F = CPtpValueFormat;

constexpr std::uint8_t kPortDisabled = 3;
constexpr std::uint16_t kTextBuffer = 256;
constexpr std::uint8_t kOwnManufacturer[3] = {0x02, 0xA5, 0x3C};

void readTime(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const nQVPTP000::tTimestamp time = proxy.getTime(status);
    if (status.succeeded()) {
        bag.setTimestamp(kxQvTime, F::hostTimeOf(time));
    }
}

void readPort(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto port = proxy.getPortDataSet(status);
    if (status.failed()) {
        return;
    }
    bag.setLong(kxQvPortState, port.getPortState())
        .setBool(kxQvPortEnabled, port.getPortState() != kPortDisabled)
        .setDouble(kxQvAnnounceReceiptTimeout, port.getAnnounceReceiptTimeout())
        .setULong(kxQvDelayMechanism, port.getDelayMechanism())
        .setLong(kxQvLogSyncInterval, port.getLogSyncInterval())
        .setLong(kxQvLogAnnounceInterval, port.getLogAnnounceInterval())
        .setLong(kxQvLogMinPdelayReqInterval, port.getLogMinPdelayReqInterval());
}

void readCurrent(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto current = proxy.getCurrentDataSet(status);
    if (status.succeeded()) {
        bag.setULong(kxQvStepsRemoved, current.getStepsRemoved())
            .setDouble(kxQvOffsetFromMaster, F::nanosecondsOf(current.getOffsetFromMaster()))
            .setDouble(kxQvMeanPathDelay, F::nanosecondsOf(current.getMeanPathDelay()));
    }
}

void readDefault(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto dataSet = proxy.getDefaultDataSet(status);
    if (status.succeeded()) {
        bag.setULong(kxQvDomainNumber, dataSet.getDomainNumber())
            .setULong(kxQvPriority1, dataSet.getPriority1())
            .setULong(kxQvPriority2, dataSet.getPriority2())
            .setBool(kxQvSlaveOnly, dataSet.getSlaveOnly())
            .setULong(kxQvClockClass, dataSet.getClockQuality().clockClass)
            .setULong(kxQvClockAccuracy, dataSet.getClockQuality().clockAccuracy)
            .setBool(kxQvTwoStepFlag, dataSet.getTwoStepFlag());
    }
}

void readTimeProperties(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto properties = proxy.getTimePropertiesDataSet(status);
    if (status.succeeded()) {
        bag.setULong(kxQvTimeSource, properties.getTimeSource())
            .setBool(kxQvPtpTimescale, properties.getPtpTimescale())
            .setBool(kxQvTimeTraceable, properties.getTimeTraceable())
            .setBool(kxQvFrequencyTraceable, properties.getFrequencyTraceable());
    }
}

void readParent(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto parent = proxy.getParentDataSet(status);
    if (status.failed()) {
        return;
    }
    const nQVPTP000::tClockIdentity grandmaster = parent.getGrandmasterIdentity();
    const bool stats = parent.getParentStats();
    bag.setString(kxQvParentPortIdentity, F::portIdentity(parent.getParentPortIdentity()))
        .setString(kxQvGrandmasterIdentity,
                   F::hexOctets(grandmaster.getOctets(), nQVPTP000::tClockIdentity::kSize, '-'))
        .setULong(kxQvGrandmasterPriority1, parent.getGrandmasterPriority1())
        .setULong(kxQvGrandmasterPriority2, parent.getGrandmasterPriority2())
        .setULong(kxQvGrandmasterClockClass, parent.getGrandmasterClockQuality().clockClass)
        .setULong(kxQvGrandmasterClockAccuracy, parent.getGrandmasterClockQuality().clockAccuracy)
        .setDouble(kxQvParentReserved, 0.0)
        .setDouble(kxQvParentOffsetVariance,
                   stats ? F::varianceOf(parent.getObservedParentOffsetScaledLogVariance()) : 0.0)
        .setDouble(kxQvParentPhaseChangeRate,
                   stats ? parent.getObservedParentClockPhaseChangeRate() : 0.0);
}

void readUtc(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    const auto utc = proxy.getUTCProperties(status);
    if (status.succeeded()) {
        const std::int32_t offset = utc.getCurrentUtcOffset();
        bag.setULong(kxQvCurrentUtcOffset, static_cast<ULONG>(offset))
            .setBool(kxQvLeap59, utc.getLeap59())
            .setBool(kxQvLeap61, utc.getLeap61())
            .setBool(kxQvCurrentUtcOffsetValid, utc.getCurrentUtcOffsetValid());
    }
}

void readRefreshedDescription(iPTPClockProxy& proxy, CPtpBagFiller& bag, tStatus& status) {
    CPtpAttributeReader::readDescription(proxy, true, bag, status);
}

using tGroupReader = void (*)(iPTPClockProxy&, CPtpBagFiller&, tStatus&);

// One reader per clock source, in the order of kxQvSource.
constexpr std::array<tGroupReader, kxQvClockSources> kGroupReaders = {
    readTime,           readPort,   readCurrent, readDefault,
    readTimeProperties, readParent, readUtc,     readRefreshedDescription};

std::u16string networkAddressOf(const nQVPTP000::tPortAddress& address) {
    const std::uint8_t* octets = address.getAddressField();
    const bool unset = std::all_of(octets, octets + 4, [](std::uint8_t o) { return o == 0; });
    if (address.getAddressLength() != 4 || unset) {
        return u"xxx.xxx.xxx.xxx";
    }
    return F::dottedIPv4(octets);
}

}  // namespace

void CPtpAttributeReader::readDescription(iPTPClockProxy& proxy, bool refresh, CPtpBagFiller& bag,
                                          tStatus& status) {
    if (refresh) {
        proxy.refreshClockDescription(status);
    }
    if (status.failed()) {
        return;
    }
    bag.setString(kxSysNetworkAddress, networkAddressOf(proxy.getProtocolAddress()));
    std::array<std::uint8_t, kTextBuffer> octets{};
    const std::uint16_t length = std::min(proxy.getPhysicalAddressLength(), kTextBuffer);
    proxy.getPhysicalAddress(octets.data(), kTextBuffer, status);
    if (status.succeeded()) {
        bag.setString(kxSysHardwareAddress, F::hexOctets(octets.data(), length, ':'));
    }
    std::array<char, kTextBuffer> text{};
    proxy.getProductDescription(text.data(), kTextBuffer, status);
    if (status.succeeded()) {
        bag.setString(kxQvProductDescription, F::clockText(text.data()));
    }
    text.fill('\0');
    proxy.getCachedUserDescription(text.data(), kTextBuffer, status);
    if (status.succeeded()) {
        bag.setString(kxQvUserDescription, F::clockText(text.data()));
    }
    std::array<std::uint8_t, 6> profile{};
    proxy.getProfileIdentity(profile.data(), profile.size(), status);
    if (status.succeeded()) {
        bag.setString(kxQvProfileIdentity, F::hexOctets(profile.data(), profile.size(), '-'));
    }
    std::array<std::uint8_t, 3> manufacturer{};
    proxy.getManufacturerIdentity(manufacturer.data(), manufacturer.size(), status);
    if (status.succeeded()) {
        bag.setBool(kxSysOwnManufacturer,
                    std::memcmp(manufacturer.data(), kOwnManufacturer, manufacturer.size()) == 0);
    }
}

HRESULT CPtpAttributeReader::fillBaseProperties(const std::u16string& itemName,
                                                iPTPClockProxy* proxy, IkxSysPropertyBag2& bag) {
    // A clock is named after its port identity, whatever spelling found it: a host that keys
    // its items by name must see one item per clock.
    const std::u16string name =
        proxy != nullptr ? F::portIdentity(proxy->getPortIdentity()) : itemName;
    CPtpBagFiller filler(bag);
    filler.setLong(kxSysTag101C000, 1)
        .setString(kxSysItemName, name)
        .setLong(kxSysTag102A000, -200)
        .setBool(kxSysTag1001000, true)
        .setString(kxSysTag1004000, u"")
        .setString(kxSysTag1006000, u"")
        .setULong(kxSysTag1002000, 6)
        .setString(kxSysTag1025000, u"")
        .setLong(kxSysTag102B000, 1)
        .setString(kxSysTag1007000, u"")
        .setULong(kxSysTag1037000, 0x10001)
        .setBool(kxQvExpertItem, true)
        .setString(kxQvClockPortName, name);
    if (!filler.succeeded()) {
        return filler.result();
    }
    if (proxy == nullptr) {
        return CORBEL_E_ITEM_NOT_FOUND;
    }
    tStatus status;
    readDescription(*proxy, false, filler, status);
    if (!filler.succeeded()) {
        return filler.result();
    }
    return status.failed() ? E_FAIL : S_OK;
}

HRESULT CPtpAttributeReader::readRequested(iPTPClockProxy& proxy, ULONG count,
                                           const kxSysAttributeTagID* tags, IkxSysPropertyBag2& bag,
                                           tStatus& failure) {
    std::array<ULONG, kxQvClockSources> requested{};
    bool baseTagAsked = false;
    for (ULONG i = 0; i < count; ++i) {
        const kxQvAttribute* row = kxQvFindAttribute(tags[i]);
        if (row != nullptr && row->requestable) {
            ++requested[static_cast<std::size_t>(row->source)];
        }
        baseTagAsked = baseTagAsked || (row != nullptr && row->source == kxQvSource::constant);
    }
    ULONG served = 0;
    HRESULT outcome = S_OK;
    for (std::size_t group = 0; group < kxQvClockSources; ++group) {
        if (requested[group] == 0) {
            continue;
        }
        // Each group has an outcome of its own: one that fails leaves the others alone.
        CPtpBagFiller filler(bag);
        tStatus status;
        kGroupReaders[group](proxy, filler, status);
        if (status.succeeded() && filler.succeeded()) {
            served += requested[group];
            continue;
        }
        if (filler.result() == E_OUTOFMEMORY || status.code == kStatusNoMemory) {
            outcome = E_OUTOFMEMORY;
        } else if (outcome == S_OK) {
            failure = status;
            outcome = E_FAIL;
        }
    }
    if (FAILED(outcome)) {
        return outcome;
    }
    if (served == count) {
        return S_OK;
    }
    return served == 0 && !baseTagAsked ? CORBEL_E_TAG_NOT_FOUND : S_FALSE;
}
