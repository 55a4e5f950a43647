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
    using Manufacturer = std::array<std::uint8_t, 3>;
    using Profile = std::array<std::uint8_t, 6>;
    struct DefaultDataSet {
        bool twoStepFlag = false, slaveOnly = false;
        std::uint8_t priority1 = 128, priority2 = 128, domainNumber = 0;
        nQVPTP000::tClockQuality clockQuality;
        nQVPTP000::tClockIdentity clockIdentity;
    };
    struct CurrentDataSet {
        std::uint16_t stepsRemoved = 0;
        nQVPTP000::tTimeInterval offsetFromMaster, meanPathDelay;
    };
    struct ParentDataSet {
        nQVPTP000::tPortIdentity parentPortIdentity;
        bool parentStats = false;
        std::uint16_t observedParentOffsetScaledLogVariance = 0xFFFF;
        std::int32_t observedParentClockPhaseChangeRate = 0x7FFFFFFF;
        std::uint8_t grandmasterPriority1 = 128, grandmasterPriority2 = 128;
        nQVPTP000::tClockIdentity grandmasterIdentity;
        nQVPTP000::tClockQuality grandmasterClockQuality;
    };
    struct TimePropertiesDataSet {
        std::int16_t currentUtcOffset = 37;
        bool currentUtcOffsetValid = false, leap59 = false, leap61 = false, timeTraceable = false,
             frequencyTraceable = false, ptpTimescale = true;
        std::uint8_t timeSource = 0xA0;
    };
    struct Port {
        nQVPTP000::tPortIdentity portIdentity;
        nQVPTP000::tTimeInterval peerMeanPathDelay;
        std::uint8_t portState = 1, announceReceiptTimeout = 3, delayMechanism = 1,
                     versionNumber = 2;
        std::int8_t logMinDelayReqInterval = 0, logAnnounceInterval = 1, logSyncInterval = 0,
                    logMinPdelayReqInterval = 0;
        // Clock description as seen through this port.
        std::uint16_t clockType = 0x8000;
        nQVPTP000::tPTPText physicalLayerProtocol;
        std::vector<std::uint8_t> physicalAddress;
        nQVPTP000::tPortAddress protocolAddress;
        Manufacturer manufacturerIdentity{};
        nQVPTP000::tPTPText productDescription, revisionData;
        Profile profileIdentity{};
        // Commands.
        bool enabled = true;
        unsigned initializations = 0;
    };
    // Which operations fail, recording -52002.
    struct Failures {
        bool getters = false, setters = false, commands = false;
    };

    // A clock with ports 1 to `numberPorts`, each port identity naming the clock and its
    // number; its identity is 02-00-00-FF-FE-00-00-01 unless given.
    explicit InMemoryManagedClock(std::uint16_t numberPorts = 1);
    InMemoryManagedClock(std::uint16_t numberPorts, const nQVPTP000::tClockIdentity& identity);

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

    // One row per member that the clock reads, or reads and writes.
// clang-format off
#define QV_GET(Type, Name, member) Type get##Name(tStatus& s) override { return read(member, s); }
#define QV_GET_SET(Type, Name, member) QV_GET(Type, Name, member) \
    void set##Name(Type v, tStatus& s) override { write(member, v, s); }
#define QV_PORT_GET(Type, Name, member) \
    Type get##Name(std::uint16_t p, tStatus& s) override { return readPort(p, &Port::member, s); }
#define QV_PORT_GET_SET(Type, Name, member) QV_PORT_GET(Type, Name, member) \
    void set##Name(std::uint16_t p, Type v, tStatus& s) override { \
        writePort(p, &Port::member, v, s); }
    // clang-format on
    QV_GET(bool, TwoStepFlag, defaultDataSet.twoStepFlag)
    QV_GET_SET(bool, SlaveOnly, defaultDataSet.slaveOnly)
    QV_GET_SET(std::uint8_t, Priority1, defaultDataSet.priority1)
    QV_GET_SET(std::uint8_t, Priority2, defaultDataSet.priority2)
    QV_GET_SET(std::uint8_t, DomainNumber, defaultDataSet.domainNumber)
    QV_GET(nQVPTP000::tClockQuality, ClockQuality, defaultDataSet.clockQuality)
    QV_GET(nQVPTP000::tClockIdentity, ClockIdentity, defaultDataSet.clockIdentity)
    QV_GET(std::uint16_t, StepsRemoved, currentDataSet.stepsRemoved)
    QV_GET(nQVPTP000::tTimeInterval, OffsetFromMaster, currentDataSet.offsetFromMaster)
    QV_GET(nQVPTP000::tTimeInterval, MeanPathDelay, currentDataSet.meanPathDelay)
    QV_GET(nQVPTP000::tPortIdentity, ParentPortIdentity, parentDataSet.parentPortIdentity)
    QV_GET(bool, ParentStats, parentDataSet.parentStats)
    QV_GET(std::uint16_t, ObservedParentOffsetScaledLogVariance,
           parentDataSet.observedParentOffsetScaledLogVariance)
    QV_GET(std::int32_t, ObservedParentClockPhaseChangeRate,
           parentDataSet.observedParentClockPhaseChangeRate)
    QV_GET(std::uint8_t, GrandmasterPriority1, parentDataSet.grandmasterPriority1)
    QV_GET(nQVPTP000::tClockIdentity, GrandmasterIdentity, parentDataSet.grandmasterIdentity)
    QV_GET(std::uint8_t, GrandmasterPriority2, parentDataSet.grandmasterPriority2)
    QV_GET(nQVPTP000::tClockQuality, GrandmasterClockQuality, parentDataSet.grandmasterClockQuality)
    QV_GET_SET(std::int16_t, CurrentUtcOffset, timeProperties.currentUtcOffset)
    QV_GET_SET(bool, CurrentUtcOffsetValid, timeProperties.currentUtcOffsetValid)
    QV_GET_SET(bool, Leap59, timeProperties.leap59)
    QV_GET_SET(bool, Leap61, timeProperties.leap61)
    QV_GET_SET(bool, TimeTraceable, timeProperties.timeTraceable)
    QV_GET_SET(bool, FrequencyTraceable, timeProperties.frequencyTraceable)
    QV_GET_SET(bool, PtpTimescale, timeProperties.ptpTimescale)
    QV_GET_SET(std::uint8_t, TimeSource, timeProperties.timeSource)
    QV_GET(nQVPTP000::tPTPText, UserDescription, userDescription)
    QV_GET(nQVPTP000::tTimestamp, Time, time)
    QV_PORT_GET(nQVPTP000::tPortIdentity, PortIdentity, portIdentity)
    QV_PORT_GET(std::uint8_t, PortState, portState)
    QV_PORT_GET(std::int8_t, LogMinDelayReqInterval, logMinDelayReqInterval)
    QV_PORT_GET(nQVPTP000::tTimeInterval, PeerMeanPathDelay, peerMeanPathDelay)
    QV_PORT_GET_SET(std::int8_t, LogAnnounceInterval, logAnnounceInterval)
    QV_PORT_GET_SET(std::uint8_t, AnnounceReceiptTimeout, announceReceiptTimeout)
    QV_PORT_GET_SET(std::int8_t, LogSyncInterval, logSyncInterval)
    QV_PORT_GET_SET(std::uint8_t, DelayMechanism, delayMechanism)
    QV_PORT_GET_SET(std::int8_t, LogMinPdelayReqInterval, logMinPdelayReqInterval)
    QV_PORT_GET_SET(std::uint8_t, VersionNumber, versionNumber)
    QV_PORT_GET(std::uint16_t, ClockType, clockType)
    QV_PORT_GET(nQVPTP000::tPTPText, PhysicalLayerProtocol, physicalLayerProtocol)
    QV_PORT_GET(nQVPTP000::tPortAddress, ProtocolAddress, protocolAddress)
    QV_PORT_GET(Manufacturer, ManufacturerIdentity, manufacturerIdentity)
    QV_PORT_GET(nQVPTP000::tPTPText, ProductDescription, productDescription)
    QV_PORT_GET(nQVPTP000::tPTPText, RevisionData, revisionData)
    QV_PORT_GET(Profile, ProfileIdentity, profileIdentity)
#undef QV_GET
#undef QV_GET_SET
#undef QV_PORT_GET
#undef QV_PORT_GET_SET

    std::uint16_t getNumberPorts(tStatus& s) override {
        return read(static_cast<std::uint16_t>(ports.size()), s);
    }
    void setClockAccuracy(std::uint8_t a, tStatus& s) override {
        write(defaultDataSet.clockQuality.clockAccuracy, std::uint32_t{a}, s);
    }
    void setUserDescription(const nQVPTP000::tPTPText& t, tStatus& s) override {
        write(userDescription, t, s);
    }
    void setTime(const nQVPTP000::tTimestamp& t, tStatus& s) override {
        write(time, t, s);
    }
    std::span<const std::uint8_t> getPhysicalAddress(std::uint16_t port, tStatus& status) override;
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
    void writePort(std::uint16_t port, T Port::*member, const T& value, tStatus& status,
                   Kind kind = Kind::setter) {
        if (Port* found = find(kind, port, status); found != nullptr) {
            found->*member = value;
        }
    }
};

}  // namespace qvtest

#endif
