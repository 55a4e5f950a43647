#ifndef QV_PTP_IMANAGEDCLOCK_H
#define QV_PTP_IMANAGEDCLOCK_H

#include <array>
#include <cstdint>
#include <span>

#include "platform/tStatus.h"
#include "ptp/tClockIdentity.h"
#include "ptp/tClockQuality.h"
#include "ptp/tPTPText.h"
#include "ptp/tPortAddress.h"
#include "ptp/tPortIdentity.h"
#include "ptp/tTimeInterval.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {

// The clock that the responder operations of the management TLVs read and change: a PTP
// node that embeds this codec implements it.
//
// One getter per dataset member and one setter per member that a management SET changes.
// Members of a port take the port number as the request addressed it. Every operation
// does nothing (and a getter returns a default value) when the status already holds an
// error; a clock that cannot serve a request (an unknown port, a failing device) records an
// error in the status, which the TLV turns into a GENERAL_ERROR answer.
class iManagedClock {
  public:
    virtual ~iManagedClock() = default;

    // Default data set.
    virtual bool getTwoStepFlag(tStatus& status) = 0;
    virtual bool getSlaveOnly(tStatus& status) = 0;
    virtual void setSlaveOnly(bool slaveOnly, tStatus& status) = 0;
    virtual std::uint16_t getNumberPorts(tStatus& status) = 0;
    virtual std::uint8_t getPriority1(tStatus& status) = 0;
    virtual void setPriority1(std::uint8_t priority1, tStatus& status) = 0;
    virtual std::uint8_t getPriority2(tStatus& status) = 0;
    virtual void setPriority2(std::uint8_t priority2, tStatus& status) = 0;
    virtual std::uint8_t getDomainNumber(tStatus& status) = 0;
    virtual void setDomainNumber(std::uint8_t domainNumber, tStatus& status) = 0;
    virtual tClockQuality getClockQuality(tStatus& status) = 0;
    virtual void setClockAccuracy(std::uint8_t clockAccuracy, tStatus& status) = 0;
    virtual tClockIdentity getClockIdentity(tStatus& status) = 0;

    // Current data set.
    virtual std::uint16_t getStepsRemoved(tStatus& status) = 0;
    virtual tTimeInterval getOffsetFromMaster(tStatus& status) = 0;
    virtual tTimeInterval getMeanPathDelay(tStatus& status) = 0;

    // Parent data set.
    virtual tPortIdentity getParentPortIdentity(tStatus& status) = 0;
    virtual bool getParentStats(tStatus& status) = 0;
    virtual std::uint16_t getObservedParentOffsetScaledLogVariance(tStatus& status) = 0;
    virtual std::int32_t getObservedParentClockPhaseChangeRate(tStatus& status) = 0;
    virtual std::uint8_t getGrandmasterPriority1(tStatus& status) = 0;
    virtual tClockIdentity getGrandmasterIdentity(tStatus& status) = 0;
    virtual std::uint8_t getGrandmasterPriority2(tStatus& status) = 0;
    virtual tClockQuality getGrandmasterClockQuality(tStatus& status) = 0;

    // Time properties data set.
    virtual std::int16_t getCurrentUtcOffset(tStatus& status) = 0;
    virtual void setCurrentUtcOffset(std::int16_t currentUtcOffset, tStatus& status) = 0;
    virtual bool getCurrentUtcOffsetValid(tStatus& status) = 0;
    virtual void setCurrentUtcOffsetValid(bool valid, tStatus& status) = 0;
    virtual bool getLeap59(tStatus& status) = 0;
    virtual void setLeap59(bool leap59, tStatus& status) = 0;
    virtual bool getLeap61(tStatus& status) = 0;
    virtual void setLeap61(bool leap61, tStatus& status) = 0;
    virtual bool getTimeTraceable(tStatus& status) = 0;
    virtual void setTimeTraceable(bool timeTraceable, tStatus& status) = 0;
    virtual bool getFrequencyTraceable(tStatus& status) = 0;
    virtual void setFrequencyTraceable(bool frequencyTraceable, tStatus& status) = 0;
    virtual bool getPtpTimescale(tStatus& status) = 0;
    virtual void setPtpTimescale(bool ptpTimescale, tStatus& status) = 0;
    virtual std::uint8_t getTimeSource(tStatus& status) = 0;
    virtual void setTimeSource(std::uint8_t timeSource, tStatus& status) = 0;

    // Port data set of one port.
    virtual tPortIdentity getPortIdentity(std::uint16_t port, tStatus& status) = 0;
    virtual std::uint8_t getPortState(std::uint16_t port, tStatus& status) = 0;
    virtual std::int8_t getLogMinDelayReqInterval(std::uint16_t port, tStatus& status) = 0;
    virtual tTimeInterval getPeerMeanPathDelay(std::uint16_t port, tStatus& status) = 0;
    virtual std::int8_t getLogAnnounceInterval(std::uint16_t port, tStatus& status) = 0;
    virtual void setLogAnnounceInterval(std::uint16_t port, std::int8_t value, tStatus& status) = 0;
    virtual std::uint8_t getAnnounceReceiptTimeout(std::uint16_t port, tStatus& status) = 0;
    virtual void setAnnounceReceiptTimeout(std::uint16_t port, std::uint8_t value,
                                           tStatus& status) = 0;
    virtual std::int8_t getLogSyncInterval(std::uint16_t port, tStatus& status) = 0;
    virtual void setLogSyncInterval(std::uint16_t port, std::int8_t value, tStatus& status) = 0;
    virtual std::uint8_t getDelayMechanism(std::uint16_t port, tStatus& status) = 0;
    virtual void setDelayMechanism(std::uint16_t port, std::uint8_t value, tStatus& status) = 0;
    virtual std::int8_t getLogMinPdelayReqInterval(std::uint16_t port, tStatus& status) = 0;
    virtual void setLogMinPdelayReqInterval(std::uint16_t port, std::int8_t value,
                                            tStatus& status) = 0;
    virtual std::uint8_t getVersionNumber(std::uint16_t port, tStatus& status) = 0;
    virtual void setVersionNumber(std::uint16_t port, std::uint8_t value, tStatus& status) = 0;

    // Clock description as seen through one port. clockType is the 16-bit word of
    // IEEE 1588-2008 (ordinary 0x8000, boundary 0x4000, p2p 0x2000, e2e 0x1000, management
    // node 0x0800). The physical address view stays valid until the clock next changes.
    virtual std::uint16_t getClockType(std::uint16_t port, tStatus& status) = 0;
    virtual tPTPText getPhysicalLayerProtocol(std::uint16_t port, tStatus& status) = 0;
    virtual std::span<const std::uint8_t> getPhysicalAddress(std::uint16_t port,
                                                             tStatus& status) = 0;
    virtual tPortAddress getProtocolAddress(std::uint16_t port, tStatus& status) = 0;
    virtual std::array<std::uint8_t, 3> getManufacturerIdentity(std::uint16_t port,
                                                                tStatus& status) = 0;
    virtual tPTPText getProductDescription(std::uint16_t port, tStatus& status) = 0;
    virtual tPTPText getRevisionData(std::uint16_t port, tStatus& status) = 0;
    virtual std::array<std::uint8_t, 6> getProfileIdentity(std::uint16_t port, tStatus& status) = 0;

    // The user description, shared by every port.
    virtual tPTPText getUserDescription(tStatus& status) = 0;
    virtual void setUserDescription(const tPTPText& userDescription, tStatus& status) = 0;

    // The clock's time (PTP timescale).
    virtual tTimestamp getTime(tStatus& status) = 0;
    virtual void setTime(const tTimestamp& time, tStatus& status) = 0;

    // Commands on one port.
    virtual void enablePort(std::uint16_t port, tStatus& status) = 0;
    virtual void disablePort(std::uint16_t port, tStatus& status) = 0;
    virtual void initialize(std::uint16_t port, tStatus& status) = 0;
};

}  // namespace nQVPTP000

#endif
