#ifndef QV_PTPMGMT_TPTPCLOCKPROXY_H
#define QV_PTPMGMT_TPTPCLOCKPROXY_H

#include <atomic>
#include <cstdint>
#include <memory>
#include <mutex>

#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/tManagementMessage.h"
#include "ptp/tPortAddress.h"
#include "ptp/transport/iPTPPortMessaging.h"
#include "ptpmgmt/iPTPClockProxy.h"
#include "ptpmgmt/tClockKey.h"

namespace nQVPTPMGMT000 {

class tPTPMgmtNode;

// Stands for one port of one remote clock found by discovery. Every remote operation is
// one exchange through the node's sendAndAwait, addressed to this port in this clock's
// domain with a 5000 ms time-out, sent through the interface on which the port answered
// discovery first.
//
// The cached clock description is shared with the node, so that a discovery replacing it
// never pulls it away from under a reader on another thread.
class tPTPClockProxy final : public iPTPClockProxy {
  public:
    static constexpr std::uint16_t kTimeoutMs = 5000;
    using tDescription = std::shared_ptr<nQVPTP000::tManagementMessage>;

    tPTPClockProxy(tPTPMgmtNode* node, const tClockKey& key, tDescription description,
                   nQVPTP000::tInterfaceIndex via, tStatus& status);

    iPTPClockProxy& assign(const iPTPClockProxy& other) override;
    const nQVPTP000::tPortIdentity& getPortIdentity() const override { return target_; }

    bool isManagementNode() const override;
    bool isOrdinaryClock() const override;
    bool isP2PTransparentClock() const override;
    bool isE2ETransparentClock() const override;
    bool isBoundaryClock() const override;
    void getPhysicalLayerProtocol(char* buffer, std::uint16_t size, tStatus& status) const override;
    std::uint16_t getPhysicalAddressLength() const override;
    void getPhysicalAddress(std::uint8_t* buffer, std::uint16_t size,
                            tStatus& status) const override;
    void getManufacturerIdentity(std::uint8_t* buffer, std::uint16_t size,
                                 tStatus& status) const override;
    void getProductDescription(char* buffer, std::uint16_t size, tStatus& status) const override;
    void getRevisionData(char* buffer, std::uint16_t size, tStatus& status) const override;
    void getCachedUserDescription(char* buffer, std::uint16_t size, tStatus& status) const override;
    void getProfileIdentity(std::uint8_t* buffer, std::uint16_t size,
                            tStatus& status) const override;

    void getNullManagement(tStatus& status) override;
    void setNullManagement(tStatus& status) override;
    void commandNullManagement(tStatus& status) override;
    void getUserDescription(char* buffer, std::uint16_t size, tStatus& status) override;
    void setUserDescription(const char* text, tStatus& status) override;
    void saveInNonVolatileStorage(tStatus& status) override;
    void resetNonVolatileStorage(tStatus& status) override;
    void initialize(std::uint16_t initializationKey, tStatus& status) override;
    nQVPTP000::tTimestamp getTime(tStatus& status) override;
    void setTime(const nQVPTP000::tTimestamp& time, tStatus& status) override;
    std::uint8_t getPriority1(tStatus& status) override;
    void setPriority1(std::uint8_t priority1, tStatus& status) override;
    std::uint8_t getPriority2(tStatus& status) override;
    void setPriority2(std::uint8_t priority2, tStatus& status) override;
    std::uint8_t getDomain(tStatus& status) override;
    void setDomain(std::uint8_t domainNumber, tStatus& status) override;
    bool getSlaveOnly(tStatus& status) override;
    void setSlaveOnly(bool slaveOnly, tStatus& status) override;
    void enablePort(tStatus& status) override;
    void disablePort(tStatus& status) override;
    std::uint8_t getClockAccuracy(tStatus& status) override;
    void setClockAccuracy(std::uint32_t clockAccuracy, tStatus& status) override;
    std::uint8_t getAnnounceReceiptTimeout(tStatus& status) override;
    void setAnnounceReceiptTimeout(std::uint8_t timeout, tStatus& status) override;
    std::uint8_t getDelayMechanism(tStatus& status) override;
    void setDelayMechanism(std::uint32_t delayMechanism, tStatus& status) override;
    std::int8_t getLogMinPdelayReqInterval(tStatus& status) override;
    void setLogMinPdelayReqInterval(std::int8_t interval, tStatus& status) override;
    std::int8_t getLogAnnounceInterval(tStatus& status) override;
    void setLogAnnounceInterval(std::int8_t interval, tStatus& status) override;
    std::int8_t getLogSyncInterval(tStatus& status) override;
    void setLogSyncInterval(std::int8_t interval, tStatus& status) override;
    std::uint8_t getVersionNumber(tStatus& status) override;
    void setVersionNumber(std::uint8_t versionNumber, tStatus& status) override;
    nQVPTP000::tDefaultDataSetTLV getDefaultDataSet(tStatus& status) override;
    nQVPTP000::tCurrentDataSetTLV getCurrentDataSet(tStatus& status) override;
    nQVPTP000::tTimePropertiesDataSetTLV getTimePropertiesDataSet(tStatus& status) override;
    nQVPTP000::tParentDataSetTLV getParentDataSet(tStatus& status) override;
    nQVPTP000::tPortDataSetTLV getPortDataSet(tStatus& status) override;
    nQVPTP000::tUTCPropertiesTLV getUTCProperties(tStatus& status) override;
    void setUTCProperties(const nQVPTP000::tUTCPropertiesTLV& properties, tStatus& status) override;
    nQVPTP000::tTraceabilityPropertiesTLV getTraceabilityProperties(tStatus& status) override;
    void setTraceabilityProperties(const nQVPTP000::tTraceabilityPropertiesTLV& properties,
                                   tStatus& status) override;
    const std::uint8_t* getClockKey() override;

    std::uint8_t getDomainNumber() const override { return domainNumber_.load(); }
    nQVPTP000::tPortAddress getProtocolAddress() const override;
    nQVPTP000::tClockDescriptionTLV refreshClockDescription(tStatus& status) override;

    nQVPTP000::tInterfaceIndex getInterface() const { return via_; }
    // Used by the node when a later discovery brings a newer description of this port.
    void setCachedDescription(tDescription description);
    // Only the client's own tests call this, to keep failing exchanges short; in use every
    // exchange waits kTimeoutMs.
    void setExchangeTimeout(std::uint16_t timeoutMs) { timeout_ = timeoutMs; }

  private:
    template <typename Make>
    std::unique_ptr<nQVPTP000::tManagementMessage> exchange(Make&& make, std::uint32_t actionField,
                                                            tStatus& status);
    template <typename TLV>
    static TLV copyOf(const TLV* tlv, tStatus& status);
    template <typename TLV>
    static const TLV* payloadOf(nQVPTP000::tManagementMessage* answer, tStatus& status);
    template <typename TLV, typename Value>
    Value getValueOf(Value failure, tStatus& status);
    template <typename TLV, typename Value>
    void setValueOf(Value value, tStatus& status);
    template <typename TLV>
    TLV getRecord(tStatus& status);
    template <typename TLV, typename... Arguments>
    void run(std::uint32_t actionField, tStatus& status, const Arguments&... arguments);

    // The cached description's payload, or null when the answer was not a description.
    tDescription cachedDescription() const;
    template <typename Read, typename Result>
    Result readDescription(Read&& read, Result failure) const;
    void copyText(nQVPTP000::tPTPText (nQVPTP000::tClockDescriptionTLV::*getter)() const,
                  char* buffer, std::uint16_t size, tStatus& status) const;
    template <typename Field>
    void copyOctets(Field field, std::uint8_t* buffer, std::uint16_t size, tStatus& status) const;

    tPTPMgmtNode* node_;  // not owned: the node owns this proxy
    nQVPTP000::tPortIdentity target_;
    tClockKey clockKey_{};
    std::uint16_t timeout_ = kTimeoutMs;
    nQVPTP000::tInterfaceIndex via_ = nQVPTP000::kEveryInterface;
    std::atomic<std::uint8_t> domainNumber_{0};
    mutable std::mutex cacheLock_;
    tDescription cachedDescription_;  // guarded by cacheLock_
};

}  // namespace nQVPTPMGMT000

#endif
