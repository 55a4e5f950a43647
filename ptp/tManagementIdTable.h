#ifndef QV_PTP_TMANAGEMENTIDTABLE_H
#define QV_PTP_TMANAGEMENTIDTABLE_H

#include <cstdint>
#include <memory>
#include <span>

#include "ptp/tManagementTLV.h"

namespace nQVPTP000 {

// The management ids that the codec builds, as IEEE 1588-2008 numbers them.
enum tManagementId : std::uint16_t {
    kNullManagement = 0x0000,
    kClockDescription = 0x0001,
    kUserDescription = 0x0002,
    kSaveInNonVolatileStorage = 0x0003,
    kResetNonVolatileStorage = 0x0004,
    kInitialize = 0x0005,
    kFaultLog = 0x0006,
    kFaultLogReset = 0x0007,
    kDefaultDataSet = 0x2000,
    kCurrentDataSet = 0x2001,
    kParentDataSet = 0x2002,
    kTimePropertiesDataSet = 0x2003,
    kPortDataSet = 0x2004,
    kPriority1 = 0x2005,
    kPriority2 = 0x2006,
    kDomain = 0x2007,
    kSlaveOnly = 0x2008,
    kLogAnnounceInterval = 0x2009,
    kAnnounceReceiptTimeout = 0x200A,
    kLogSyncInterval = 0x200B,
    kVersionNumber = 0x200C,
    kEnablePort = 0x200D,
    kDisablePort = 0x200E,
    kTime = 0x200F,
    kClockAccuracy = 0x2010,
    kUtcProperties = 0x2011,
    kTraceabilityProperties = 0x2012,
    kTimescaleProperties = 0x2013,
    kDelayMechanism = 0x6000,
    kLogMinPdelayReqInterval = 0x6001,
};

// One row per management id: its name and how to make the default object of its class.
// The TLV factory, the traces and the tests all read this one table.
struct tManagementIdEntry {
    std::uint16_t managementId;
    const char* name;
    std::unique_ptr<tManagementTLV> (*create)();
};

std::span<const tManagementIdEntry> managementIdTable();

// The row of `managementId`, or null when the codec does not build that id.
const tManagementIdEntry* findManagementId(std::uint16_t managementId);

}  // namespace nQVPTP000

#endif
