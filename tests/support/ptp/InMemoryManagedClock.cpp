#include "tests/support/ptp/InMemoryManagedClock.h"

using nQVPTP000::tClockIdentity;
using nQVPTP000::tClockQuality;
using nQVPTP000::tPortAddress;
using nQVPTP000::tPortIdentity;
using nQVPTP000::tPTPText;
using nQVPTP000::tTimeInterval;
using nQVPTP000::tTimestamp;

namespace qvtest {

namespace {
constexpr std::uint8_t kIdentity[tClockIdentity::kSize] = {0x02, 0x00, 0x00, 0xFF,
                                                           0xFE, 0x00, 0x00, 0x01};
}

InMemoryManagedClock::InMemoryManagedClock(std::uint16_t numberPorts) : ports(numberPorts) {
    defaultDataSet.clockIdentity = tClockIdentity(kIdentity);
    parentDataSet.parentPortIdentity = tPortIdentity(defaultDataSet.clockIdentity, 0);
    parentDataSet.grandmasterIdentity = defaultDataSet.clockIdentity;
    for (std::uint16_t i = 0; i < numberPorts; ++i) {
        ports[i].portIdentity =
            tPortIdentity(defaultDataSet.clockIdentity, static_cast<std::uint16_t>(i + 1));
    }
}

bool InMemoryManagedClock::proceed(Kind kind, tStatus& status) const {
    if (status.failed()) {
        return false;
    }
    const bool fail = (kind == Kind::getter && failures.getters) ||
                      (kind == Kind::setter && failures.setters) ||
                      (kind == Kind::command && failures.commands);
    if (fail) {
        status.set(failures.failureCode, "inmemory", "InMemoryManagedClock", 0);
        return false;
    }
    return true;
}

InMemoryManagedClock::Port* InMemoryManagedClock::find(Kind kind, std::uint16_t port,
                                                       tStatus& status) {
    if (!proceed(kind, status)) {
        return nullptr;
    }
    if (port == 0 || port > ports.size()) {
        status.set(kStatusUnsupported, "inmemory", "InMemoryManagedClock", 0);
        return nullptr;
    }
    return &ports[port - 1U];
}

bool InMemoryManagedClock::getTwoStepFlag(tStatus& status) {
    return read(defaultDataSet.twoStepFlag, status);
}
bool InMemoryManagedClock::getSlaveOnly(tStatus& status) {
    return read(defaultDataSet.slaveOnly, status);
}
void InMemoryManagedClock::setSlaveOnly(bool slaveOnly, tStatus& status) {
    write(defaultDataSet.slaveOnly, slaveOnly, status);
}
std::uint16_t InMemoryManagedClock::getNumberPorts(tStatus& status) {
    return read(static_cast<std::uint16_t>(ports.size()), status);
}
std::uint8_t InMemoryManagedClock::getPriority1(tStatus& status) {
    return read(defaultDataSet.priority1, status);
}
void InMemoryManagedClock::setPriority1(std::uint8_t priority1, tStatus& status) {
    write(defaultDataSet.priority1, priority1, status);
}
std::uint8_t InMemoryManagedClock::getPriority2(tStatus& status) {
    return read(defaultDataSet.priority2, status);
}
void InMemoryManagedClock::setPriority2(std::uint8_t priority2, tStatus& status) {
    write(defaultDataSet.priority2, priority2, status);
}
std::uint8_t InMemoryManagedClock::getDomainNumber(tStatus& status) {
    return read(defaultDataSet.domainNumber, status);
}
void InMemoryManagedClock::setDomainNumber(std::uint8_t domainNumber, tStatus& status) {
    write(defaultDataSet.domainNumber, domainNumber, status);
}
tClockQuality InMemoryManagedClock::getClockQuality(tStatus& status) {
    return read(defaultDataSet.clockQuality, status);
}
void InMemoryManagedClock::setClockAccuracy(std::uint8_t clockAccuracy, tStatus& status) {
    write(defaultDataSet.clockQuality.clockAccuracy, std::uint32_t{clockAccuracy}, status);
}
tClockIdentity InMemoryManagedClock::getClockIdentity(tStatus& status) {
    return read(defaultDataSet.clockIdentity, status);
}

std::uint16_t InMemoryManagedClock::getStepsRemoved(tStatus& status) {
    return read(currentDataSet.stepsRemoved, status);
}
tTimeInterval InMemoryManagedClock::getOffsetFromMaster(tStatus& status) {
    return read(currentDataSet.offsetFromMaster, status);
}
tTimeInterval InMemoryManagedClock::getMeanPathDelay(tStatus& status) {
    return read(currentDataSet.meanPathDelay, status);
}

tPortIdentity InMemoryManagedClock::getParentPortIdentity(tStatus& status) {
    return read(parentDataSet.parentPortIdentity, status);
}
bool InMemoryManagedClock::getParentStats(tStatus& status) {
    return read(parentDataSet.parentStats, status);
}
std::uint16_t InMemoryManagedClock::getObservedParentOffsetScaledLogVariance(tStatus& status) {
    return read(parentDataSet.observedParentOffsetScaledLogVariance, status);
}
std::int32_t InMemoryManagedClock::getObservedParentClockPhaseChangeRate(tStatus& status) {
    return read(parentDataSet.observedParentClockPhaseChangeRate, status);
}
std::uint8_t InMemoryManagedClock::getGrandmasterPriority1(tStatus& status) {
    return read(parentDataSet.grandmasterPriority1, status);
}
tClockIdentity InMemoryManagedClock::getGrandmasterIdentity(tStatus& status) {
    return read(parentDataSet.grandmasterIdentity, status);
}
std::uint8_t InMemoryManagedClock::getGrandmasterPriority2(tStatus& status) {
    return read(parentDataSet.grandmasterPriority2, status);
}
tClockQuality InMemoryManagedClock::getGrandmasterClockQuality(tStatus& status) {
    return read(parentDataSet.grandmasterClockQuality, status);
}

std::int16_t InMemoryManagedClock::getCurrentUtcOffset(tStatus& status) {
    return read(timeProperties.currentUtcOffset, status);
}
void InMemoryManagedClock::setCurrentUtcOffset(std::int16_t currentUtcOffset, tStatus& status) {
    write(timeProperties.currentUtcOffset, currentUtcOffset, status);
}
bool InMemoryManagedClock::getCurrentUtcOffsetValid(tStatus& status) {
    return read(timeProperties.currentUtcOffsetValid, status);
}
void InMemoryManagedClock::setCurrentUtcOffsetValid(bool valid, tStatus& status) {
    write(timeProperties.currentUtcOffsetValid, valid, status);
}
bool InMemoryManagedClock::getLeap59(tStatus& status) {
    return read(timeProperties.leap59, status);
}
void InMemoryManagedClock::setLeap59(bool leap59, tStatus& status) {
    write(timeProperties.leap59, leap59, status);
}
bool InMemoryManagedClock::getLeap61(tStatus& status) {
    return read(timeProperties.leap61, status);
}
void InMemoryManagedClock::setLeap61(bool leap61, tStatus& status) {
    write(timeProperties.leap61, leap61, status);
}
bool InMemoryManagedClock::getTimeTraceable(tStatus& status) {
    return read(timeProperties.timeTraceable, status);
}
void InMemoryManagedClock::setTimeTraceable(bool timeTraceable, tStatus& status) {
    write(timeProperties.timeTraceable, timeTraceable, status);
}
bool InMemoryManagedClock::getFrequencyTraceable(tStatus& status) {
    return read(timeProperties.frequencyTraceable, status);
}
void InMemoryManagedClock::setFrequencyTraceable(bool frequencyTraceable, tStatus& status) {
    write(timeProperties.frequencyTraceable, frequencyTraceable, status);
}
bool InMemoryManagedClock::getPtpTimescale(tStatus& status) {
    return read(timeProperties.ptpTimescale, status);
}
void InMemoryManagedClock::setPtpTimescale(bool ptpTimescale, tStatus& status) {
    write(timeProperties.ptpTimescale, ptpTimescale, status);
}
std::uint8_t InMemoryManagedClock::getTimeSource(tStatus& status) {
    return read(timeProperties.timeSource, status);
}
void InMemoryManagedClock::setTimeSource(std::uint8_t timeSource, tStatus& status) {
    write(timeProperties.timeSource, timeSource, status);
}

tPortIdentity InMemoryManagedClock::getPortIdentity(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::portIdentity, status);
}
std::uint8_t InMemoryManagedClock::getPortState(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::portState, status);
}
std::int8_t InMemoryManagedClock::getLogMinDelayReqInterval(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::logMinDelayReqInterval, status);
}
tTimeInterval InMemoryManagedClock::getPeerMeanPathDelay(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::peerMeanPathDelay, status);
}
std::int8_t InMemoryManagedClock::getLogAnnounceInterval(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::logAnnounceInterval, status);
}
void InMemoryManagedClock::setLogAnnounceInterval(std::uint16_t port, std::int8_t value,
                                                  tStatus& status) {
    writePort(port, &Port::logAnnounceInterval, value, status);
}
std::uint8_t InMemoryManagedClock::getAnnounceReceiptTimeout(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::announceReceiptTimeout, status);
}
void InMemoryManagedClock::setAnnounceReceiptTimeout(std::uint16_t port, std::uint8_t value,
                                                     tStatus& status) {
    writePort(port, &Port::announceReceiptTimeout, value, status);
}
std::int8_t InMemoryManagedClock::getLogSyncInterval(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::logSyncInterval, status);
}
void InMemoryManagedClock::setLogSyncInterval(std::uint16_t port, std::int8_t value,
                                              tStatus& status) {
    writePort(port, &Port::logSyncInterval, value, status);
}
std::uint8_t InMemoryManagedClock::getDelayMechanism(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::delayMechanism, status);
}
void InMemoryManagedClock::setDelayMechanism(std::uint16_t port, std::uint8_t value,
                                             tStatus& status) {
    writePort(port, &Port::delayMechanism, value, status);
}
std::int8_t InMemoryManagedClock::getLogMinPdelayReqInterval(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::logMinPdelayReqInterval, status);
}
void InMemoryManagedClock::setLogMinPdelayReqInterval(std::uint16_t port, std::int8_t value,
                                                      tStatus& status) {
    writePort(port, &Port::logMinPdelayReqInterval, value, status);
}
std::uint8_t InMemoryManagedClock::getVersionNumber(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::versionNumber, status);
}
void InMemoryManagedClock::setVersionNumber(std::uint16_t port, std::uint8_t value,
                                            tStatus& status) {
    writePort(port, &Port::versionNumber, value, status);
}

std::uint16_t InMemoryManagedClock::getClockType(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::clockType, status);
}
tPTPText InMemoryManagedClock::getPhysicalLayerProtocol(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::physicalLayerProtocol, status);
}
std::span<const std::uint8_t> InMemoryManagedClock::getPhysicalAddress(std::uint16_t port,
                                                                       tStatus& status) {
    const Port* found = find(Kind::getter, port, status);
    return found != nullptr ? std::span<const std::uint8_t>(found->physicalAddress)
                            : std::span<const std::uint8_t>();
}
tPortAddress InMemoryManagedClock::getProtocolAddress(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::protocolAddress, status);
}
std::array<std::uint8_t, 3> InMemoryManagedClock::getManufacturerIdentity(std::uint16_t port,
                                                                          tStatus& status) {
    return readPort(port, &Port::manufacturerIdentity, status);
}
tPTPText InMemoryManagedClock::getProductDescription(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::productDescription, status);
}
tPTPText InMemoryManagedClock::getRevisionData(std::uint16_t port, tStatus& status) {
    return readPort(port, &Port::revisionData, status);
}
std::array<std::uint8_t, 6> InMemoryManagedClock::getProfileIdentity(std::uint16_t port,
                                                                     tStatus& status) {
    return readPort(port, &Port::profileIdentity, status);
}

tPTPText InMemoryManagedClock::getUserDescription(tStatus& status) {
    return read(userDescription, status);
}
void InMemoryManagedClock::setUserDescription(const tPTPText& text, tStatus& status) {
    write(userDescription, text, status);
}

tTimestamp InMemoryManagedClock::getTime(tStatus& status) {
    return read(time, status);
}
void InMemoryManagedClock::setTime(const tTimestamp& newTime, tStatus& status) {
    write(time, newTime, status);
}

void InMemoryManagedClock::enablePort(std::uint16_t port, tStatus& status) {
    if (Port* found = find(Kind::command, port, status); found != nullptr) {
        found->enabled = true;
    }
}
void InMemoryManagedClock::disablePort(std::uint16_t port, tStatus& status) {
    if (Port* found = find(Kind::command, port, status); found != nullptr) {
        found->enabled = false;
    }
}
void InMemoryManagedClock::initialize(std::uint16_t port, tStatus& status) {
    if (Port* found = find(Kind::command, port, status); found != nullptr) {
        ++found->initializations;
    }
}

}  // namespace qvtest
