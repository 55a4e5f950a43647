#ifndef QV_PTPMGMT_IPTPCLOCKPROXY_H
#define QV_PTPMGMT_IPTPCLOCKPROXY_H

#include <cstdint>

#include "platform/tStatus.h"
#include "ptp/tPortAddress.h"
#include "ptp/tPortIdentity.h"
#include "ptp/tTimestamp.h"

namespace nQVPTP000 {
class tDefaultDataSetTLV;
class tCurrentDataSetTLV;
class tTimePropertiesDataSetTLV;
class tParentDataSetTLV;
class tPortDataSetTLV;
class tUTCPropertiesTLV;
class tTraceabilityPropertiesTLV;
class tClockDescriptionTLV;
}  // namespace nQVPTP000

namespace nQVPTPMGMT000 {

// One port of one remote clock: one operation per management id and action, each a single
// checked request/response exchange addressed to this port in this clock's domain, plus
// read-only access to the clock description that the port sent to discovery. An operation
// that finds an error already recorded sends nothing; a failed one leaves its code in the
// status and returns the documented failure value.
class iPTPClockProxy {
  public:
    virtual ~iPTPClockProxy() = default;
    // Takes the other proxy's node, domain, time-out and target; not its cached description.
    virtual iPTPClockProxy& assign(const iPTPClockProxy& other) = 0;
    virtual const nQVPTP000::tPortIdentity& getPortIdentity() const = 0;

    // From the cached clock description; false / 0 when there is none.
    virtual bool isManagementNode() const = 0;
    virtual bool isOrdinaryClock() const = 0;
    virtual bool isP2PTransparentClock() const = 0;
    virtual bool isE2ETransparentClock() const = 0;
    virtual bool isBoundaryClock() const = 0;
    // Texts, cached or fetched, are copied with a terminating zero; a buffer too small records
    // -52012 and is left untouched.
    virtual void getPhysicalLayerProtocol(char* buffer, std::uint16_t size,
                                          tStatus& status) const = 0;
    virtual std::uint16_t getPhysicalAddressLength() const = 0;
    virtual void getPhysicalAddress(std::uint8_t* buffer, std::uint16_t size,
                                    tStatus& status) const = 0;
    virtual void getManufacturerIdentity(std::uint8_t* buffer, std::uint16_t size,
                                         tStatus& status) const = 0;
    virtual void getProductDescription(char* buffer, std::uint16_t size, tStatus& status) const = 0;
    virtual void getRevisionData(char* buffer, std::uint16_t size, tStatus& status) const = 0;
    virtual void getCachedUserDescription(char* buffer, std::uint16_t size,
                                          tStatus& status) const = 0;
    virtual void getProfileIdentity(std::uint8_t* buffer, std::uint16_t size,
                                    tStatus& status) const = 0;

    virtual void getNullManagement(tStatus& status) = 0;
    virtual void setNullManagement(tStatus& status) = 0;
    virtual void commandNullManagement(tStatus& status) = 0;
    virtual void getUserDescription(char* buffer, std::uint16_t size, tStatus& status) = 0;
    virtual void setUserDescription(const char* text, tStatus& status) = 0;
    virtual void saveInNonVolatileStorage(tStatus& status) = 0;
    virtual void resetNonVolatileStorage(tStatus& status) = 0;
    virtual void initialize(std::uint16_t initializationKey, tStatus& status) = 0;
    virtual nQVPTP000::tTimestamp getTime(tStatus& status) = 0;
    virtual void setTime(const nQVPTP000::tTimestamp& time, tStatus& status) = 0;
    virtual std::uint8_t getPriority1(tStatus& status) = 0;
    virtual void setPriority1(std::uint8_t priority1, tStatus& status) = 0;
    virtual std::uint8_t getPriority2(tStatus& status) = 0;
    virtual void setPriority2(std::uint8_t priority2, tStatus& status) = 0;
    virtual std::uint8_t getDomain(tStatus& status) = 0;
    // On success later requests go to the new domain.
    virtual void setDomain(std::uint8_t domainNumber, tStatus& status) = 0;
    virtual bool getSlaveOnly(tStatus& status) = 0;
    virtual void setSlaveOnly(bool slaveOnly, tStatus& status) = 0;
    virtual void enablePort(tStatus& status) = 0;
    virtual void disablePort(tStatus& status) = 0;
    // 0xFE when the exchange fails.
    virtual std::uint8_t getClockAccuracy(tStatus& status) = 0;
    virtual void setClockAccuracy(std::uint32_t clockAccuracy, tStatus& status) = 0;
    virtual std::uint8_t getAnnounceReceiptTimeout(tStatus& status) = 0;
    virtual void setAnnounceReceiptTimeout(std::uint8_t timeout, tStatus& status) = 0;
    // 1 (E2E) when the exchange fails.
    virtual std::uint8_t getDelayMechanism(tStatus& status) = 0;
    virtual void setDelayMechanism(std::uint32_t delayMechanism, tStatus& status) = 0;
    virtual std::int8_t getLogMinPdelayReqInterval(tStatus& status) = 0;
    virtual void setLogMinPdelayReqInterval(std::int8_t interval, tStatus& status) = 0;
    virtual std::int8_t getLogAnnounceInterval(tStatus& status) = 0;
    virtual void setLogAnnounceInterval(std::int8_t interval, tStatus& status) = 0;
    virtual std::int8_t getLogSyncInterval(tStatus& status) = 0;
    virtual void setLogSyncInterval(std::int8_t interval, tStatus& status) = 0;
    virtual std::uint8_t getVersionNumber(tStatus& status) = 0;
    virtual void setVersionNumber(std::uint8_t versionNumber, tStatus& status) = 0;
    // Records: the defaults of their class when the exchange fails.
    virtual nQVPTP000::tDefaultDataSetTLV getDefaultDataSet(tStatus& status) = 0;
    virtual nQVPTP000::tCurrentDataSetTLV getCurrentDataSet(tStatus& status) = 0;
    virtual nQVPTP000::tTimePropertiesDataSetTLV getTimePropertiesDataSet(tStatus& status) = 0;
    virtual nQVPTP000::tParentDataSetTLV getParentDataSet(tStatus& status) = 0;
    virtual nQVPTP000::tPortDataSetTLV getPortDataSet(tStatus& status) = 0;
    virtual nQVPTP000::tUTCPropertiesTLV getUTCProperties(tStatus& status) = 0;
    virtual void setUTCProperties(const nQVPTP000::tUTCPropertiesTLV& properties,
                                  tStatus& status) = 0;
    virtual nQVPTP000::tTraceabilityPropertiesTLV getTraceabilityProperties(tStatus& status) = 0;
    virtual void setTraceabilityProperties(const nQVPTP000::tTraceabilityPropertiesTLV& properties,
                                           tStatus& status) = 0;
    // The 10-octet clock key of the target port.
    virtual const std::uint8_t* getClockKey() = 0;

    // The domain of every request; follows a successful setDomain.
    virtual std::uint8_t getDomainNumber() const = 0;
    // A copy of the protocolAddress of the cached clock description.
    virtual nQVPTP000::tPortAddress getProtocolAddress() const = 0;
    // Asks the port for its clock description again; on success it becomes the cached one.
    // On failure the result holds the defaults and the cache is unchanged.
    virtual nQVPTP000::tClockDescriptionTLV refreshClockDescription(tStatus& status) = 0;
};

}  // namespace nQVPTPMGMT000

#endif
