#include "ptpmgmt/tPTPClockProxy.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "platform/tStatusReason.h"
#include "ptp/TLVs/tAnnounceReceiptTimeoutTLV.h"
#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tDelayMechanismTLV.h"
#include "ptp/TLVs/tDisablePortTLV.h"
#include "ptp/TLVs/tDomainTLV.h"
#include "ptp/TLVs/tEnablePortTLV.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "ptp/TLVs/tLogAnnounceIntervalTLV.h"
#include "ptp/TLVs/tLogMinPdelayReqIntervalTLV.h"
#include "ptp/TLVs/tLogSyncIntervalTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/TLVs/tPriority2TLV.h"
#include "ptp/TLVs/tResetNonVolatileStorageTLV.h"
#include "ptp/TLVs/tSaveInNonVolatileStorageTLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/TLVs/tVersionNumberTLV.h"
#include "ptp/tMessageHeader.h"
#include "ptpmgmt/tPTPMgmtNode.h"

namespace nQVPTPMGMT000 {

using namespace nQVPTP000;
using tAction = tManagementMessagePayload::tActionField;

namespace {

// Copies a text with its terminating zero, or records -52012 when it does not fit: every
// text reader of the proxy leaves a caller's buffer either terminated or untouched.
void copyTerminated(const tPTPText& text, char* buffer, std::uint16_t size, tStatus& status) {
    if (text.getLengthField() + 1U > size) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
        return;
    }
    if (text.getLengthField() != 0) {
        std::memcpy(buffer, text.getTextField(), text.getLengthField());
    }
    buffer[text.getLengthField()] = '\0';
}

}  // namespace

tPTPClockProxy::tPTPClockProxy(tPTPMgmtNode* node, const tClockKey& key, tDescription description,
                               tInterfaceIndex via, tStatus& status)
    : node_(node),
      target_(allOnesPortIdentity()),
      via_(via),
      cachedDescription_(std::move(description)) {
    if (status.succeeded()) {
        target_ = portIdentityOf(key);
        const tMessageHeader* header =
            cachedDescription_ ? cachedDescription_->getHeader() : nullptr;
        domainNumber_.store(header != nullptr ? header->getDomainNumber() : 0);
    }
}

iPTPClockProxy& tPTPClockProxy::assign(const iPTPClockProxy& other) {
    if (const auto* proxy = dynamic_cast<const tPTPClockProxy*>(&other); proxy != this) {
        if (proxy != nullptr) {
            node_ = proxy->node_;
            domainNumber_.store(proxy->domainNumber_.load());
            timeout_ = proxy->timeout_;
            via_ = proxy->via_;
        }
        target_ = other.getPortIdentity();
    }
    return *this;
}

const std::uint8_t* tPTPClockProxy::getClockKey() {
    clockKey_ = makeClockKey(target_);
    return clockKey_.data();
}

// ---- exchanges ----

// One exchange whose payload `make` builds (and fills, for a SET). Memory running out on
// the way is recorded as -52000: no exception leaves the protocol layer.
template <typename Make>
std::unique_ptr<tManagementMessage> tPTPClockProxy::exchange(Make&& make, std::uint32_t actionField,
                                                             tStatus& status) {
    if (status.failed()) {
        return nullptr;
    }
    try {
        return node_->sendAndAwait(target_, make(), actionField, timeout_, domainNumber_.load(),
                                   via_, status);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
        return nullptr;
    }
}

// A copy of an answer's record, or the defaults of its class when there is none or memory
// runs out while copying.
template <typename TLV>
TLV tPTPClockProxy::copyOf(const TLV* tlv, tStatus& status) {
    if (tlv == nullptr) {
        return TLV();
    }
    try {
        return TLV(*tlv);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
        return TLV();
    }
}

template <typename TLV>
const TLV* tPTPClockProxy::payloadOf(tManagementMessage* answer, tStatus& status) {
    if (answer == nullptr || status.failed()) {
        return nullptr;
    }
    const tManagementMessagePayload* payload = answer->getPayload(status);
    const TLV* tlv = dynamic_cast<const TLV*>(payload);
    if (tlv == nullptr && QV_STATUS_SET(status, kStatusNoData, kComponentMgmt)) {
        tStatusReason::wrongAnswer(status, answer->getActionField(),
                                   payload != nullptr ? payload->getManagementId() : 0);
    }
    return tlv;
}

template <typename TLV, typename Value>
Value tPTPClockProxy::getValueOf(Value failure, tStatus& status) {
    std::unique_ptr<tManagementMessage> answer =
        exchange([] { return std::make_unique<TLV>(); }, tAction::kGet, status);
    const TLV* tlv = payloadOf<TLV>(answer.get(), status);
    return tlv != nullptr ? static_cast<Value>(tlv->getValue()) : failure;
}

template <typename TLV, typename Value>
void tPTPClockProxy::setValueOf(Value value, tStatus& status) {
    exchange(
        [&] {
            auto tlv = std::make_unique<TLV>();
            tlv->setValue(value, status);
            return tlv;
        },
        tAction::kSet, status);
}

template <typename TLV>
TLV tPTPClockProxy::getRecord(tStatus& status) {
    std::unique_ptr<tManagementMessage> answer =
        exchange([] { return std::make_unique<TLV>(); }, tAction::kGet, status);
    return copyOf(payloadOf<TLV>(answer.get(), status), status);
}

template <typename TLV, typename... Arguments>
void tPTPClockProxy::run(std::uint32_t actionField, tStatus& status,
                         const Arguments&... arguments) {
    exchange([&] { return std::make_unique<TLV>(arguments...); }, actionField, status);
}

void tPTPClockProxy::getNullManagement(tStatus& status) {
    run<tNullManagementTLV>(tAction::kGet, status);
}
void tPTPClockProxy::setNullManagement(tStatus& status) {
    run<tNullManagementTLV>(tAction::kSet, status);
}
void tPTPClockProxy::commandNullManagement(tStatus& status) {
    run<tNullManagementTLV>(tAction::kCommand, status);
}
void tPTPClockProxy::saveInNonVolatileStorage(tStatus& status) {
    run<tSaveInNonVolatileStorageTLV>(tAction::kCommand, status);
}
void tPTPClockProxy::resetNonVolatileStorage(tStatus& status) {
    run<tResetNonVolatileStorageTLV>(tAction::kCommand, status);
}
void tPTPClockProxy::initialize(std::uint16_t initializationKey, tStatus& status) {
    run<tInitializeTLV>(tAction::kCommand, status, initializationKey);
}
void tPTPClockProxy::enablePort(tStatus& status) {
    run<tEnablePortTLV>(tAction::kCommand, status);
}
void tPTPClockProxy::disablePort(tStatus& status) {
    run<tDisablePortTLV>(tAction::kCommand, status);
}

void tPTPClockProxy::getUserDescription(char* buffer, std::uint16_t size, tStatus& status) {
    std::unique_ptr<tManagementMessage> answer =
        exchange([] { return std::make_unique<tUserDescriptionTLV>(); }, tAction::kGet, status);
    const tUserDescriptionTLV* tlv = payloadOf<tUserDescriptionTLV>(answer.get(), status);
    if (tlv == nullptr) {
        return;
    }
    try {
        copyTerminated(tlv->getUserDescription(), buffer, size, status);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
    }
}

void tPTPClockProxy::setUserDescription(const char* text, tStatus& status) {
    const tPTPText description(text, status);
    exchange(
        [&] {
            auto tlv = std::make_unique<tUserDescriptionTLV>();
            tlv->setUserDescription(description, status);
            return tlv;
        },
        tAction::kSet, status);
}

tTimestamp tPTPClockProxy::getTime(tStatus& status) {
    return getRecord<tTimeTLV>(status).getCurrentTime();
}

void tPTPClockProxy::setTime(const tTimestamp& time, tStatus& status) {
    exchange(
        [&] {
            auto tlv = std::make_unique<tTimeTLV>();
            tlv->setCurrentTime(time, status);
            return tlv;
        },
        tAction::kSet, status);
}

std::uint8_t tPTPClockProxy::getPriority1(tStatus& status) {
    return getValueOf<tPriority1TLV, std::uint8_t>(0, status);
}
void tPTPClockProxy::setPriority1(std::uint8_t priority1, tStatus& status) {
    setValueOf<tPriority1TLV>(priority1, status);
}
std::uint8_t tPTPClockProxy::getPriority2(tStatus& status) {
    return getValueOf<tPriority2TLV, std::uint8_t>(0, status);
}
void tPTPClockProxy::setPriority2(std::uint8_t priority2, tStatus& status) {
    setValueOf<tPriority2TLV>(priority2, status);
}
std::uint8_t tPTPClockProxy::getDomain(tStatus& status) {
    return getValueOf<tDomainTLV, std::uint8_t>(0, status);
}
void tPTPClockProxy::setDomain(std::uint8_t domainNumber, tStatus& status) {
    setValueOf<tDomainTLV>(domainNumber, status);
    if (status.succeeded()) {
        domainNumber_.store(domainNumber);  // the clock now answers in its new domain only
    }
}
bool tPTPClockProxy::getSlaveOnly(tStatus& status) {
    return getValueOf<tSlaveOnlyTLV, bool>(false, status);
}
void tPTPClockProxy::setSlaveOnly(bool slaveOnly, tStatus& status) {
    setValueOf<tSlaveOnlyTLV>(slaveOnly, status);
}
std::uint8_t tPTPClockProxy::getClockAccuracy(tStatus& status) {
    return getValueOf<tClockAccuracyTLV, std::uint8_t>(0xFE, status);
}
void tPTPClockProxy::setClockAccuracy(std::uint32_t clockAccuracy, tStatus& status) {
    setValueOf<tClockAccuracyTLV>(static_cast<std::uint8_t>(clockAccuracy), status);
}
std::uint8_t tPTPClockProxy::getAnnounceReceiptTimeout(tStatus& status) {
    return getValueOf<tAnnounceReceiptTimeoutTLV, std::uint8_t>(0, status);
}
void tPTPClockProxy::setAnnounceReceiptTimeout(std::uint8_t timeout, tStatus& status) {
    setValueOf<tAnnounceReceiptTimeoutTLV>(timeout, status);
}
std::uint8_t tPTPClockProxy::getDelayMechanism(tStatus& status) {
    return getValueOf<tDelayMechanismTLV, std::uint8_t>(1, status);
}
void tPTPClockProxy::setDelayMechanism(std::uint32_t delayMechanism, tStatus& status) {
    setValueOf<tDelayMechanismTLV>(static_cast<std::uint8_t>(delayMechanism), status);
}
std::int8_t tPTPClockProxy::getLogMinPdelayReqInterval(tStatus& status) {
    return getValueOf<tLogMinPdelayReqIntervalTLV, std::int8_t>(0, status);
}
void tPTPClockProxy::setLogMinPdelayReqInterval(std::int8_t interval, tStatus& status) {
    setValueOf<tLogMinPdelayReqIntervalTLV>(interval, status);
}
std::int8_t tPTPClockProxy::getLogAnnounceInterval(tStatus& status) {
    return getValueOf<tLogAnnounceIntervalTLV, std::int8_t>(0, status);
}
void tPTPClockProxy::setLogAnnounceInterval(std::int8_t interval, tStatus& status) {
    setValueOf<tLogAnnounceIntervalTLV>(interval, status);
}
std::int8_t tPTPClockProxy::getLogSyncInterval(tStatus& status) {
    return getValueOf<tLogSyncIntervalTLV, std::int8_t>(0, status);
}
void tPTPClockProxy::setLogSyncInterval(std::int8_t interval, tStatus& status) {
    setValueOf<tLogSyncIntervalTLV>(interval, status);
}
std::uint8_t tPTPClockProxy::getVersionNumber(tStatus& status) {
    return getValueOf<tVersionNumberTLV, std::uint8_t>(0, status);
}
void tPTPClockProxy::setVersionNumber(std::uint8_t versionNumber, tStatus& status) {
    setValueOf<tVersionNumberTLV>(versionNumber, status);
}

tDefaultDataSetTLV tPTPClockProxy::getDefaultDataSet(tStatus& status) {
    return getRecord<tDefaultDataSetTLV>(status);
}
tCurrentDataSetTLV tPTPClockProxy::getCurrentDataSet(tStatus& status) {
    return getRecord<tCurrentDataSetTLV>(status);
}
tTimePropertiesDataSetTLV tPTPClockProxy::getTimePropertiesDataSet(tStatus& status) {
    return getRecord<tTimePropertiesDataSetTLV>(status);
}
tParentDataSetTLV tPTPClockProxy::getParentDataSet(tStatus& status) {
    return getRecord<tParentDataSetTLV>(status);
}
tPortDataSetTLV tPTPClockProxy::getPortDataSet(tStatus& status) {
    return getRecord<tPortDataSetTLV>(status);
}
tUTCPropertiesTLV tPTPClockProxy::getUTCProperties(tStatus& status) {
    return getRecord<tUTCPropertiesTLV>(status);
}
void tPTPClockProxy::setUTCProperties(const tUTCPropertiesTLV& properties, tStatus& status) {
    run<tUTCPropertiesTLV>(tAction::kSet, status, properties);
}
tTraceabilityPropertiesTLV tPTPClockProxy::getTraceabilityProperties(tStatus& status) {
    return getRecord<tTraceabilityPropertiesTLV>(status);
}
void tPTPClockProxy::setTraceabilityProperties(const tTraceabilityPropertiesTLV& properties,
                                               tStatus& status) {
    run<tTraceabilityPropertiesTLV>(tAction::kSet, status, properties);
}

// ---- the cached clock description ----

void tPTPClockProxy::setCachedDescription(tDescription description) {
    std::lock_guard<std::mutex> guard(cacheLock_);
    cachedDescription_ = std::move(description);
}

tPTPClockProxy::tDescription tPTPClockProxy::cachedDescription() const {
    std::lock_guard<std::mutex> guard(cacheLock_);
    return cachedDescription_;
}

// Runs `read` on the cached clock description. A discovery answer that carried something
// else (an error status) is never read as a description: `failure` is the result then.
template <typename Read, typename Result>
Result tPTPClockProxy::readDescription(Read&& read, Result failure) const {
    const tDescription description = cachedDescription();
    if (!description) {
        return failure;
    }
    tStatus scratch;
    const auto* tlv = dynamic_cast<const tClockDescriptionTLV*>(description->getPayload(scratch));
    return tlv != nullptr ? read(*tlv) : failure;
}

bool tPTPClockProxy::isManagementNode() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getManagementNode(); },
                           false);
}
bool tPTPClockProxy::isOrdinaryClock() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getOrdinaryClock(); },
                           false);
}
bool tPTPClockProxy::isP2PTransparentClock() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getP2PTransparentClock(); },
                           false);
}
bool tPTPClockProxy::isE2ETransparentClock() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getE2ETransparentClock(); },
                           false);
}
bool tPTPClockProxy::isBoundaryClock() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getBoundaryClock(); },
                           false);
}
std::uint16_t tPTPClockProxy::getPhysicalAddressLength() const {
    return readDescription(
        [](const tClockDescriptionTLV& d) { return d.getPhysicalAddressLength(); },
        std::uint16_t{0});
}
tPortAddress tPTPClockProxy::getProtocolAddress() const {
    return readDescription([](const tClockDescriptionTLV& d) { return d.getProtocolAddress(); },
                           tPortAddress());
}

void tPTPClockProxy::copyText(tPTPText (tClockDescriptionTLV::*getter)() const, char* buffer,
                              std::uint16_t size, tStatus& status) const {
    if (status.failed()) {
        return;
    }
    bool described = false;
    try {
        described = readDescription(
            [&](const tClockDescriptionTLV& d) {
                copyTerminated((d.*getter)(), buffer, size, status);
                return true;
            },
            false);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
        return;
    }
    if (!described) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
    }
}

// Copies a field of octets, or records -52012 when the buffer is smaller than the field.
template <typename Field>
void tPTPClockProxy::copyOctets(Field field, std::uint8_t* buffer, std::uint16_t size,
                                tStatus& status) const {
    if (status.failed()) {
        return;
    }
    const bool described = readDescription(
        [&](const tClockDescriptionTLV& d) {
            const auto octets = field(d);
            if (octets.size() > size) {
                QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
            } else if (!octets.empty()) {
                std::memcpy(buffer, octets.data(), octets.size());
            }
            return true;
        },
        false);
    if (!described) {
        QV_STATUS_SET(status, kStatusNoData, kComponentMgmt);
    }
}

void tPTPClockProxy::getPhysicalLayerProtocol(char* buffer, std::uint16_t size,
                                              tStatus& status) const {
    copyText(&tClockDescriptionTLV::getPhysicalLayerProtocol, buffer, size, status);
}
void tPTPClockProxy::getProductDescription(char* buffer, std::uint16_t size,
                                           tStatus& status) const {
    copyText(&tClockDescriptionTLV::getProductDescription, buffer, size, status);
}
void tPTPClockProxy::getRevisionData(char* buffer, std::uint16_t size, tStatus& status) const {
    copyText(&tClockDescriptionTLV::getRevisionData, buffer, size, status);
}
void tPTPClockProxy::getCachedUserDescription(char* buffer, std::uint16_t size,
                                              tStatus& status) const {
    copyText(&tClockDescriptionTLV::getUserDescription, buffer, size, status);
}
void tPTPClockProxy::getPhysicalAddress(std::uint8_t* buffer, std::uint16_t size,
                                        tStatus& status) const {
    copyOctets([](const tClockDescriptionTLV& d) { return d.getPhysicalAddress(); }, buffer, size,
               status);
}
void tPTPClockProxy::getManufacturerIdentity(std::uint8_t* buffer, std::uint16_t size,
                                             tStatus& status) const {
    copyOctets([](const tClockDescriptionTLV& d) { return d.getManufacturerIdentity(); }, buffer,
               size, status);
}
void tPTPClockProxy::getProfileIdentity(std::uint8_t* buffer, std::uint16_t size,
                                        tStatus& status) const {
    copyOctets([](const tClockDescriptionTLV& d) { return d.getProfileIdentity(); }, buffer, size,
               status);
}

tClockDescriptionTLV tPTPClockProxy::refreshClockDescription(tStatus& status) {
    std::unique_ptr<tManagementMessage> answer =
        exchange([] { return std::make_unique<tClockDescriptionTLV>(); }, tAction::kGet, status);
    tClockDescriptionTLV copy =
        copyOf(payloadOf<tClockDescriptionTLV>(answer.get(), status), status);
    if (status.succeeded()) {
        try {
            setCachedDescription(tDescription(std::move(answer)));
        } catch (const std::bad_alloc&) {
            QV_STATUS_SET(status, kStatusNoMemory, kComponentMgmt);
            return tClockDescriptionTLV();
        }
    }
    return copy;
}

}  // namespace nQVPTPMGMT000
