#ifndef QV1588_QV1588_H
#define QV1588_QV1588_H

// What the qv-1588 expert adds to the host framework's contract (qv1588/corbel.h): the
// attribute tags it serves with their names, types and sources, which of them a host may
// change, two more result codes, and its own interfaces for the reason of a failure.

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "qv1588/corbel.h"

// Two more results of the expert: an item operation before Initialize (or after a failed
// one), and a second Initialize.
#ifndef E_NOT_VALID_STATE  // the Windows headers have it
inline constexpr HRESULT E_NOT_VALID_STATE = static_cast<HRESULT>(0x8007139Fu);
#endif
inline constexpr HRESULT QV_E_ALREADY_INITIALIZED = static_cast<HRESULT>(0x800704DFu);

// The attribute tags that the expert reads, sets or writes. The kxQv tags are the expert's
// own; the kxSys ones are the host's general tags, whose meaning is the host's (the expert
// sets the values listed in kxQvAttributes).
enum kxQvAttributeTag : kxSysAttributeTagID {
    kxSysTag1001000 = 0x1001000,
    kxSysTag1002000 = 0x1002000,
    kxSysTag1004000 = 0x1004000,
    kxSysTag1006000 = 0x1006000,
    kxSysTag1007000 = 0x1007000,
    kxSysOwnManufacturer = 0x1008000,  // manufacturerIdentity is 02-A5-3C
    kxSysTag101C000 = 0x101C000,
    kxSysItemName = 0x101D000,
    kxSysTag1025000 = 0x1025000,
    kxSysTag102A000 = 0x102A000,
    kxSysTag102B000 = 0x102B000,
    kxSysNetworkAddress = 0x102C000,   // dotted IPv4, or "xxx.xxx.xxx.xxx"
    kxSysHardwareAddress = 0x1033000,  // physicalAddress, octets joined by ":"
    kxSysTag1037000 = 0x1037000,
    kxQvPortState = 0xE001000,
    kxQvProductDescription = 0xE002000,
    kxQvUserDescription = 0xE003000,
    kxQvProfileIdentity = 0xE004000,
    kxQvDomainNumber = 0xE005000,
    kxQvPriority1 = 0xE006000,
    kxQvPriority2 = 0xE007000,
    kxQvSlaveOnly = 0xE008000,
    kxQvTwoStepFlag = 0xE009000,
    kxQvAnnounceReceiptTimeout = 0xE00A000,
    kxQvLogAnnounceInterval = 0xE00B000,
    kxQvLogSyncInterval = 0xE00C000,
    kxQvLogMinPdelayReqInterval = 0xE00D000,
    kxQvStepsRemoved = 0xE00E000,
    kxQvOffsetFromMaster = 0xE00F000,  // nanoseconds
    kxQvMeanPathDelay = 0xE010000,     // nanoseconds
    kxQvParentPortIdentity = 0xE011000,
    kxQvParentOffsetVariance = 0xE012000,  // 2 ^ observedParentOffsetScaledLogVariance, or 0
    kxQvParentPhaseChangeRate = 0xE013000,
    kxQvGrandmasterIdentity = 0xE014000,
    kxQvGrandmasterPriority1 = 0xE015000,
    kxQvGrandmasterPriority2 = 0xE016000,
    kxQvGrandmasterClockClass = 0xE017000,
    kxQvGrandmasterClockAccuracy = 0xE018000,
    kxQvParentReserved = 0xE019000,  // always 0.0
    kxQvClockAccuracy = 0xE01A000,
    kxQvClockClass = 0xE01B000,
    kxQvTimeSource = 0xE01C000,
    kxQvCurrentUtcOffset = 0xE01D000,
    kxQvLeap59 = 0xE01E000,
    kxQvLeap61 = 0xE01F000,
    kxQvCurrentUtcOffsetValid = 0xE020000,
    kxQvPtpTimescale = 0xE021000,
    kxQvTimeTraceable = 0xE022000,
    kxQvFrequencyTraceable = 0xE023000,
    kxQvTime = 0xE024000,
    kxQvExpertItem = 0xE025000,  // always true
    kxQvClockPortName = 0xE026000,
    kxQvPortEnabled = 0xE027000,  // port state is not DISABLED
    kxQvDelayMechanism = 0xE028000,
};

// Where a tag's value comes from. The clock sources are in the order in which
// GetItemProperties asks the clock, one management GET each.
enum class kxQvSource : std::uint8_t {
    time,              // GET TIME
    port,              // GET PORT_DATA_SET
    current,           // GET CURRENT_DATA_SET
    defaultDataSet,    // GET DEFAULT_DATA_SET
    timeProperties,    // GET TIME_PROPERTIES_DATA_SET
    parent,            // GET PARENT_DATA_SET
    utc,               // GET UTC_PROPERTIES
    clockDescription,  // GET CLOCK_DESCRIPTION
    constant,          // set by GetItem and EnumerateItems only
};
inline constexpr std::size_t kxQvClockSources = 8;

// One attribute of a clock port. `requestable`: GetItemProperties reads it when asked for
// it (the two clock-description tags that are not come only along with their group or
// with the item). `settable`: ValidateChanges and ApplyChanges take it.
struct kxQvAttribute {
    const char* name;
    kxQvAttributeTag tag;
    kxSysPropertyType type;
    kxQvSource source;
    bool requestable;
    bool settable;
};

// The expert's whole vocabulary, one row per tag.
inline constexpr kxQvAttribute kxQvAttributes[] = {
    // clang-format off
    {"tag1001000", kxSysTag1001000, kxSysPropertyTypeBool, kxQvSource::constant, false, false},
    {"tag1002000", kxSysTag1002000, kxSysPropertyTypeULong, kxQvSource::constant, false, false},
    {"tag1004000", kxSysTag1004000, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"tag1006000", kxSysTag1006000, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"tag1007000", kxSysTag1007000, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"tag101C000", kxSysTag101C000, kxSysPropertyTypeLong, kxQvSource::constant, false, false},
    {"itemName", kxSysItemName, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"tag1025000", kxSysTag1025000, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"tag102A000", kxSysTag102A000, kxSysPropertyTypeLong, kxQvSource::constant, false, false},
    {"tag102B000", kxSysTag102B000, kxSysPropertyTypeLong, kxQvSource::constant, false, false},
    {"tag1037000", kxSysTag1037000, kxSysPropertyTypeULong, kxQvSource::constant, false, false},
    {"expertItem", kxQvExpertItem, kxSysPropertyTypeBool, kxQvSource::constant, false, false},
    {"clockPortName", kxQvClockPortName, kxSysPropertyTypeString, kxQvSource::constant, false, false},
    {"networkAddress", kxSysNetworkAddress, kxSysPropertyTypeString, kxQvSource::clockDescription, false, false},
    {"hardwareAddress", kxSysHardwareAddress, kxSysPropertyTypeString, kxQvSource::clockDescription, true, false},
    {"ownManufacturer", kxSysOwnManufacturer, kxSysPropertyTypeBool, kxQvSource::clockDescription, false, false},
    {"productDescription", kxQvProductDescription, kxSysPropertyTypeString, kxQvSource::clockDescription, true, false},
    {"userDescription", kxQvUserDescription, kxSysPropertyTypeString, kxQvSource::clockDescription, true, true},
    {"profileIdentity", kxQvProfileIdentity, kxSysPropertyTypeString, kxQvSource::clockDescription, true, false},
    {"portState", kxQvPortState, kxSysPropertyTypeLong, kxQvSource::port, true, false},
    {"portEnabled", kxQvPortEnabled, kxSysPropertyTypeBool, kxQvSource::port, true, true},
    {"announceReceiptTimeout", kxQvAnnounceReceiptTimeout, kxSysPropertyTypeDouble, kxQvSource::port, true, true},
    {"logAnnounceInterval", kxQvLogAnnounceInterval, kxSysPropertyTypeLong, kxQvSource::port, true, true},
    {"logSyncInterval", kxQvLogSyncInterval, kxSysPropertyTypeLong, kxQvSource::port, true, true},
    {"logMinPdelayReqInterval", kxQvLogMinPdelayReqInterval, kxSysPropertyTypeLong, kxQvSource::port, true, true},
    {"delayMechanism", kxQvDelayMechanism, kxSysPropertyTypeULong, kxQvSource::port, true, false},
    {"stepsRemoved", kxQvStepsRemoved, kxSysPropertyTypeULong, kxQvSource::current, true, false},
    {"offsetFromMaster", kxQvOffsetFromMaster, kxSysPropertyTypeDouble, kxQvSource::current, true, false},
    {"meanPathDelay", kxQvMeanPathDelay, kxSysPropertyTypeDouble, kxQvSource::current, true, false},
    {"domainNumber", kxQvDomainNumber, kxSysPropertyTypeULong, kxQvSource::defaultDataSet, true, true},
    {"priority1", kxQvPriority1, kxSysPropertyTypeULong, kxQvSource::defaultDataSet, true, true},
    {"priority2", kxQvPriority2, kxSysPropertyTypeULong, kxQvSource::defaultDataSet, true, true},
    {"slaveOnly", kxQvSlaveOnly, kxSysPropertyTypeBool, kxQvSource::defaultDataSet, true, true},
    {"twoStepFlag", kxQvTwoStepFlag, kxSysPropertyTypeBool, kxQvSource::defaultDataSet, true, false},
    {"clockAccuracy", kxQvClockAccuracy, kxSysPropertyTypeULong, kxQvSource::defaultDataSet, true, false},
    {"clockClass", kxQvClockClass, kxSysPropertyTypeULong, kxQvSource::defaultDataSet, true, false},
    {"timeSource", kxQvTimeSource, kxSysPropertyTypeULong, kxQvSource::timeProperties, true, false},
    {"ptpTimescale", kxQvPtpTimescale, kxSysPropertyTypeBool, kxQvSource::timeProperties, true, false},
    {"timeTraceable", kxQvTimeTraceable, kxSysPropertyTypeBool, kxQvSource::timeProperties, true, false},
    {"frequencyTraceable", kxQvFrequencyTraceable, kxSysPropertyTypeBool, kxQvSource::timeProperties, true, false},
    {"parentPortIdentity", kxQvParentPortIdentity, kxSysPropertyTypeString, kxQvSource::parent, true, false},
    {"parentOffsetVariance", kxQvParentOffsetVariance, kxSysPropertyTypeDouble, kxQvSource::parent, true, false},
    {"parentPhaseChangeRate", kxQvParentPhaseChangeRate, kxSysPropertyTypeDouble, kxQvSource::parent, true, false},
    {"grandmasterIdentity", kxQvGrandmasterIdentity, kxSysPropertyTypeString, kxQvSource::parent, true, false},
    {"grandmasterPriority1", kxQvGrandmasterPriority1, kxSysPropertyTypeULong, kxQvSource::parent, true, false},
    {"grandmasterPriority2", kxQvGrandmasterPriority2, kxSysPropertyTypeULong, kxQvSource::parent, true, false},
    {"grandmasterClockClass", kxQvGrandmasterClockClass, kxSysPropertyTypeULong, kxQvSource::parent, true, false},
    {"grandmasterClockAccuracy", kxQvGrandmasterClockAccuracy, kxSysPropertyTypeULong, kxQvSource::parent, true, false},
    {"parentReserved", kxQvParentReserved, kxSysPropertyTypeDouble, kxQvSource::parent, true, false},
    {"currentUtcOffset", kxQvCurrentUtcOffset, kxSysPropertyTypeULong, kxQvSource::utc, true, false},
    {"leap59", kxQvLeap59, kxSysPropertyTypeBool, kxQvSource::utc, true, false},
    {"leap61", kxQvLeap61, kxSysPropertyTypeBool, kxQvSource::utc, true, false},
    {"currentUtcOffsetValid", kxQvCurrentUtcOffsetValid, kxSysPropertyTypeBool, kxQvSource::utc, true, false},
    {"time", kxQvTime, kxSysPropertyTypeTimestamp, kxQvSource::time, true, true},
    // clang-format on
};

// The row of a tag, or null.
inline constexpr const kxQvAttribute* kxQvFindAttribute(kxSysAttributeTagID tag) {
    for (const kxQvAttribute& attribute : kxQvAttributes) {
        if (attribute.tag == tag) {
            return &attribute;
        }
    }
    return nullptr;
}
// The row of a symbolic name such as "priority1" (case matters), or null.
inline const kxQvAttribute* kxQvFindAttribute(const char* name) {
    for (const kxQvAttribute& attribute : kxQvAttributes) {
        if (name != nullptr && std::strcmp(attribute.name, name) == 0) {
            return &attribute;
        }
    }
    return nullptr;
}

#if defined(_WIN32) && defined(__GNUC__)
// The platform's IUnknown leaves its destructor public and non-virtual; each interface
// below makes its own protected, so that nobody deletes through an interface pointer.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wnon-virtual-dtor"
#endif

// The expert's own interface beside its expert interfaces (QueryInterface on the expert):
// why the last operation of the calling thread failed, in the manner of COM's per-thread
// error information. Every item operation of the expert clears the calling thread's record
// when it starts and fills it when a clock exchange, the discovery or the opening fails.
inline constexpr IID IID_IkxQvLastFailure = {
    0x1F618204, 0x6960, 0x4D0F, {0xB9, 0xB2, 0xDA, 0xCE, 0xD2, 0x65, 0xDA, 0xA6}};

struct IkxQvLastFailure : IUnknown {
    // `description`: what failed, in English; `trace`: the diagnostic line of the failure.
    // Both are new BSTRs the caller frees (either pointer may be null). S_FALSE and null
    // texts when the calling thread's last operation recorded no failure.
    virtual HRESULT KXSYS_CALL GetLastFailure(BSTR* description, BSTR* trace) = 0;  // slot 3

  protected:
    ~IkxQvLastFailure() = default;
};

// Why the calling thread's last failed operation failed, as numbers that a program can act
// on (IkxQvLastFailure2).
enum class kxQvFailureKind : ULONG {
    none = 0,
    refusedByClock = 1,  // the clock answered with a management error status
    noAnswer = 2,        // no valid answer within the exchange's time-out
    invalidValue = 3,    // ApplyChanges met a value that validation rejects
    network = 4,         // a send, a receive or the opening of the ports failed
    other = 5,           // memory, an unknown item, or another failure of this library
};

inline constexpr IID IID_IkxQvLastFailure2 = {
    0x85E6E086, 0x6196, 0x401A, {0xAD, 0x6E, 0xFE, 0xEE, 0xB5, 0x65, 0xF5, 0x96}};

struct IkxQvLastFailure2 : IkxQvLastFailure {
    // The kind of the failure; the clock's managementErrorId when it refused (else 0); the
    // tag at which ApplyChanges stopped (else 0). Each pointer may be null. S_FALSE and
    // zeros when the calling thread's last operation recorded no failure.
    virtual HRESULT KXSYS_CALL GetLastFailureCause(ULONG* kind, ULONG* managementErrorId,
                                                   kxSysAttributeTagID* tag) = 0;  // slot 4

  protected:
    ~IkxQvLastFailure2() = default;
};

#if defined(_WIN32) && defined(__GNUC__)
#pragma GCC diagnostic pop
#endif

#endif
