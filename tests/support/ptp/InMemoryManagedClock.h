#ifndef QV_TESTS_SUPPORT_PTP_INMEMORYMANAGEDCLOCK_H
#define QV_TESTS_SUPPORT_PTP_INMEMORYMANAGEDCLOCK_H

#include <array>
#include <cstdint>
#include <vector>

#include "ptp/iManagedClock.h"

namespace qvtest {

// A managed clock that keeps every data set member in plain structs that tests set and read
// directly. Ports are numbered 1 to the count given; any other port number fails with
// -52005. Each kind of operation can be made to fail, to drive the GENERAL_ERROR answers.
class InMemoryManagedClock : public nQVPTP000::iManagedClock {
  public:
    struct DefaultDataSet {
        bool twoStepFlag = false;
        bool slaveOnly = false;
        std::uint8_t priority1 = 128;
        std::uint8_t priority2 = 128;
        std::uint8_t domainNumber = 0;
        nQVPTP000::tClockQuality clockQuality;
        nQVPTP000::tClockIdentity clockIdentity;
    };
    struct CurrentDataSet {
        std::uint16_t stepsRemoved = 0;
        nQVPTP000::tTimeInterval offsetFromMaster;
        nQVPTP000::tTimeInterval meanPathDelay;
    };
    struct ParentDataSet {
        nQVPTP000::tPortIdentity parentPortIdentity;
        bool parentStats = false;
        std::uint16_t observedParentOffsetScaledLogVariance = 0xFFFF;
        std::int32_t observedParentClockPhaseChangeRate = 0x7FFFFFFF;
        std::uint8_t grandmasterPriority1 = 128;
        nQVPTP000::tClockIdentity grandmasterIdentity;
        std::uint8_t grandmasterPriority2 = 128;
        nQVPTP000::tClockQuality grandmasterClockQuality;
    };
    struct TimePropertiesDataSet {
        std::int16_t currentUtcOffset = 37;
        bool currentUtcOffsetValid = false;
        bool leap59 = false;
        bool leap61 = false;
        bool timeTraceable = false;
        bool frequencyTraceable = false;
        bool ptpTimescale = true;
        std::uint8_t timeSource = 0xA0;
    };
    struct Port {
        nQVPTP000::tPortIdentity portIdentity;
        std::uint8_t portState = 1;
        std::int8_t logMinDelayReqInterval = 0;
        nQVPTP000::tTimeInterval peerMeanPathDelay;
        std::int8_t logAnnounceInterval = 1;
        std::uint8_t announceReceiptTimeout = 3;
        std::int8_t logSyncInterval = 0;
        std::uint8_t delayMechanism = 1;
        std::int8_t logMinPdelayReqInterval = 0;
        std::uint8_t versionNumber = 2;
        // Clock description as seen through this port.
        std::uint16_t clockType = 0x8000;
        nQVPTP000::tPTPText physicalLayerProtocol;
        std::vector<std::uint8_t> physicalAddress;
        nQVPTP000::tPortAddress protocolAddress;
        std::array<std::uint8_t, 3> manufacturerIdentity{};
        nQVPTP000::tPTPText productDescription;
        nQVPTP000::tPTPText revisionData;
        std::array<std::uint8_t, 6> profileIdentity{};
        // Commands.
        bool enabled = true;
        unsigned initializations = 0;
    };
    // Which operations fail, recording `failureCode`.
    struct Failures {
        bool getters = false;
        bool setters = false;
        bool commands = false;
        std::int32_t failureCode = kStatusBadContent;
    };

    // A clock with identity 02-00-00-FF-FE-00-00-01 and ports 1 to `numberPorts`, each port
    // identity naming the clock and its number.
    explicit InMemoryManagedClock(std::uint16_t numberPorts = 1);

    DefaultDataSet defaultDataSet;
    CurrentDataSet currentDataSet;
    ParentDataSet parentDataSet;
    TimePropertiesDataSet timeProperties;
    std::vector<Port> ports;  // ports[0] is port 1
    nQVPTP000::tPTPText userDescription;
    nQVPTP000::tTimestamp time;
    Failures failures;

    // The port of that number; the test must know that it exists.
    Port& port(std::uint16_t number) { return ports.at(number - 1U); }

    bool getTwoStepFlag(tStatus& status) override;
    bool getSlaveOnly(tStatus& status) override;
    void setSlaveOnly(bool slaveOnly, tStatus& status) override;
    std::uint16_t getNumberPorts(tStatus& status) override;
    std::uint8_t getPriority1(tStatus& status) override;
    void setPriority1(std::uint8_t priority1, tStatus& status) override;
    std::uint8_t getPriority2(tStatus& status) override;
    void setPriority2(std::uint8_t priority2, tStatus& status) override;
    std::uint8_t getDomainNumber(tStatus& status) override;
    void setDomainNumber(std::uint8_t domainNumber, tStatus& status) override;
    nQVPTP000::tClockQuality getClockQuality(tStatus& status) override;
    void setClockAccuracy(std::uint8_t clockAccuracy, tStatus& status) override;
    nQVPTP000::tClockIdentity getClockIdentity(tStatus& status) override;

    std::uint16_t getStepsRemoved(tStatus& status) override;
    nQVPTP000::tTimeInterval getOffsetFromMaster(tStatus& status) override;
    nQVPTP000::tTimeInterval getMeanPathDelay(tStatus& status) override;

    nQVPTP000::tPortIdentity getParentPortIdentity(tStatus& status) override;
    bool getParentStats(tStatus& status) override;
    std::uint16_t getObservedParentOffsetScaledLogVariance(tStatus& status) override;
    std::int32_t getObservedParentClockPhaseChangeRate(tStatus& status) override;
    std::uint8_t getGrandmasterPriority1(tStatus& status) override;
    nQVPTP000::tClockIdentity getGrandmasterIdentity(tStatus& status) override;
    std::uint8_t getGrandmasterPriority2(tStatus& status) override;
    nQVPTP000::tClockQuality getGrandmasterClockQuality(tStatus& status) override;

    std::int16_t getCurrentUtcOffset(tStatus& status) override;
    void setCurrentUtcOffset(std::int16_t currentUtcOffset, tStatus& status) override;
    bool getCurrentUtcOffsetValid(tStatus& status) override;
    void setCurrentUtcOffsetValid(bool valid, tStatus& status) override;
    bool getLeap59(tStatus& status) override;
    void setLeap59(bool leap59, tStatus& status) override;
    bool getLeap61(tStatus& status) override;
    void setLeap61(bool leap61, tStatus& status) override;
    bool getTimeTraceable(tStatus& status) override;
    void setTimeTraceable(bool timeTraceable, tStatus& status) override;
    bool getFrequencyTraceable(tStatus& status) override;
    void setFrequencyTraceable(bool frequencyTraceable, tStatus& status) override;
    bool getPtpTimescale(tStatus& status) override;
    void setPtpTimescale(bool ptpTimescale, tStatus& status) override;
    std::uint8_t getTimeSource(tStatus& status) override;
    void setTimeSource(std::uint8_t timeSource, tStatus& status) override;

    nQVPTP000::tPortIdentity getPortIdentity(std::uint16_t port, tStatus& status) override;
    std::uint8_t getPortState(std::uint16_t port, tStatus& status) override;
    std::int8_t getLogMinDelayReqInterval(std::uint16_t port, tStatus& status) override;
    nQVPTP000::tTimeInterval getPeerMeanPathDelay(std::uint16_t port, tStatus& status) override;
    std::int8_t getLogAnnounceInterval(std::uint16_t port, tStatus& status) override;
    void setLogAnnounceInterval(std::uint16_t port, std::int8_t value, tStatus& status) override;
    std::uint8_t getAnnounceReceiptTimeout(std::uint16_t port, tStatus& status) override;
    void setAnnounceReceiptTimeout(std::uint16_t port, std::uint8_t value,
                                   tStatus& status) override;
    std::int8_t getLogSyncInterval(std::uint16_t port, tStatus& status) override;
    void setLogSyncInterval(std::uint16_t port, std::int8_t value, tStatus& status) override;
    std::uint8_t getDelayMechanism(std::uint16_t port, tStatus& status) override;
    void setDelayMechanism(std::uint16_t port, std::uint8_t value, tStatus& status) override;
    std::int8_t getLogMinPdelayReqInterval(std::uint16_t port, tStatus& status) override;
    void setLogMinPdelayReqInterval(std::uint16_t port, std::int8_t value,
                                    tStatus& status) override;
    std::uint8_t getVersionNumber(std::uint16_t port, tStatus& status) override;
    void setVersionNumber(std::uint16_t port, std::uint8_t value, tStatus& status) override;

    std::uint16_t getClockType(std::uint16_t port, tStatus& status) override;
    nQVPTP000::tPTPText getPhysicalLayerProtocol(std::uint16_t port, tStatus& status) override;
    std::span<const std::uint8_t> getPhysicalAddress(std::uint16_t port, tStatus& status) override;
    nQVPTP000::tPortAddress getProtocolAddress(std::uint16_t port, tStatus& status) override;
    std::array<std::uint8_t, 3> getManufacturerIdentity(std::uint16_t port,
                                                        tStatus& status) override;
    nQVPTP000::tPTPText getProductDescription(std::uint16_t port, tStatus& status) override;
    nQVPTP000::tPTPText getRevisionData(std::uint16_t port, tStatus& status) override;
    std::array<std::uint8_t, 6> getProfileIdentity(std::uint16_t port, tStatus& status) override;

    nQVPTP000::tPTPText getUserDescription(tStatus& status) override;
    void setUserDescription(const nQVPTP000::tPTPText& text, tStatus& status) override;

    nQVPTP000::tTimestamp getTime(tStatus& status) override;
    void setTime(const nQVPTP000::tTimestamp& newTime, tStatus& status) override;

    void enablePort(std::uint16_t port, tStatus& status) override;
    void disablePort(std::uint16_t port, tStatus& status) override;
    void initialize(std::uint16_t port, tStatus& status) override;

  private:
    enum class Kind { getter, setter, command };
    // Whether an operation of that kind may go on: false when the status already holds an
    // error or the operation is made to fail (which it records).
    bool proceed(Kind kind, tStatus& status) const;
    // The port, or null after recording -52005 for a port the clock does not have.
    Port* find(Kind kind, std::uint16_t port, tStatus& status);

    // Reads a clock member, or gives T{} when the getter may not go on.
    template <typename T>
    T read(const T& member, tStatus& status) const {
        return proceed(Kind::getter, status) ? member : T{};
    }
    template <typename T>
    void write(T& member, const T& value, tStatus& status) {
        if (proceed(Kind::setter, status)) {
            member = value;
        }
    }
    template <typename T>
    T readPort(std::uint16_t port, T Port::*member, tStatus& status) {
        const Port* found = find(Kind::getter, port, status);
        return found != nullptr ? found->*member : T{};
    }
    template <typename T>
    void writePort(std::uint16_t port, T Port::*member, const T& value, tStatus& status) {
        if (Port* found = find(Kind::setter, port, status); found != nullptr) {
            found->*member = value;
        }
    }
};

}  // namespace qvtest

#endif
