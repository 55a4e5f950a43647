#include "ptp/tManagementIdTable.h"

#include <array>

#include "ptp/TLVs/tAnnounceReceiptTimeoutTLV.h"
#include "ptp/TLVs/tClockAccuracyTLV.h"
#include "ptp/TLVs/tClockDescriptionTLV.h"
#include "ptp/TLVs/tCurrentDataSetTLV.h"
#include "ptp/TLVs/tDefaultDataSetTLV.h"
#include "ptp/TLVs/tDelayMechanismTLV.h"
#include "ptp/TLVs/tDisablePortTLV.h"
#include "ptp/TLVs/tDomainTLV.h"
#include "ptp/TLVs/tEnablePortTLV.h"
#include "ptp/TLVs/tFaultLogResetTLV.h"
#include "ptp/TLVs/tFaultLogTLV.h"
#include "ptp/TLVs/tInitializeTLV.h"
#include "ptp/TLVs/tLogAnnounceIntervalTLV.h"
#include "ptp/TLVs/tLogMinPdelayReqIntervalTLV.h"
#include "ptp/TLVs/tLogSyncIntervalTLV.h"
#include "ptp/TLVs/tNullManagementTLV.h"
#include "ptp/TLVs/tParentDataSetTLV.h"
#include "ptp/TLVs/tPortDataSetTLV.h"
#include "ptp/TLVs/tPriority1TLV.h"
#include "ptp/TLVs/tPriority2TLV.h"
#include "ptp/TLVs/tResetNonVolatileStorageTLV.h"
#include "ptp/TLVs/tSaveInNonVolatileStorageTLV.h"
#include "ptp/TLVs/tSlaveOnlyTLV.h"
#include "ptp/TLVs/tTimePropertiesDataSetTLV.h"
#include "ptp/TLVs/tTimeTLV.h"
#include "ptp/TLVs/tTimescalePropertiesTLV.h"
#include "ptp/TLVs/tTraceabilityPropertiesTLV.h"
#include "ptp/TLVs/tUTCPropertiesTLV.h"
#include "ptp/TLVs/tUserDescriptionTLV.h"
#include "ptp/TLVs/tVersionNumberTLV.h"

namespace nQVPTP000 {

namespace {

template <typename T>
std::unique_ptr<tManagementTLV> createDefault() {
    return std::make_unique<T>();
}

const tManagementIdEntry kTable[] = {
    {kNullManagement, "NULL_MANAGEMENT", &createDefault<tNullManagementTLV>},
    {kClockDescription, "CLOCK_DESCRIPTION", &createDefault<tClockDescriptionTLV>},
    {kUserDescription, "USER_DESCRIPTION", &createDefault<tUserDescriptionTLV>},
    {kSaveInNonVolatileStorage, "SAVE_IN_NON_VOLATILE_STORAGE",
     &createDefault<tSaveInNonVolatileStorageTLV>},
    {kResetNonVolatileStorage, "RESET_NON_VOLATILE_STORAGE",
     &createDefault<tResetNonVolatileStorageTLV>},
    {kInitialize, "INITIALIZE", &createDefault<tInitializeTLV>},
    {kFaultLog, "FAULT_LOG", &createDefault<tFaultLogTLV>},
    {kFaultLogReset, "FAULT_LOG_RESET", &createDefault<tFaultLogResetTLV>},
    {kDefaultDataSet, "DEFAULT_DATA_SET", &createDefault<tDefaultDataSetTLV>},
    {kCurrentDataSet, "CURRENT_DATA_SET", &createDefault<tCurrentDataSetTLV>},
    {kParentDataSet, "PARENT_DATA_SET", &createDefault<tParentDataSetTLV>},
    {kTimePropertiesDataSet, "TIME_PROPERTIES_DATA_SET", &createDefault<tTimePropertiesDataSetTLV>},
    {kPortDataSet, "PORT_DATA_SET", &createDefault<tPortDataSetTLV>},
    {kPriority1, "PRIORITY1", &createDefault<tPriority1TLV>},
    {kPriority2, "PRIORITY2", &createDefault<tPriority2TLV>},
    {kDomain, "DOMAIN", &createDefault<tDomainTLV>},
    {kSlaveOnly, "SLAVE_ONLY", &createDefault<tSlaveOnlyTLV>},
    {kLogAnnounceInterval, "LOG_ANNOUNCE_INTERVAL", &createDefault<tLogAnnounceIntervalTLV>},
    {kAnnounceReceiptTimeout, "ANNOUNCE_RECEIPT_TIMEOUT",
     &createDefault<tAnnounceReceiptTimeoutTLV>},
    {kLogSyncInterval, "LOG_SYNC_INTERVAL", &createDefault<tLogSyncIntervalTLV>},
    {kVersionNumber, "VERSION_NUMBER", &createDefault<tVersionNumberTLV>},
    {kEnablePort, "ENABLE_PORT", &createDefault<tEnablePortTLV>},
    {kDisablePort, "DISABLE_PORT", &createDefault<tDisablePortTLV>},
    {kTime, "TIME", &createDefault<tTimeTLV>},
    {kClockAccuracy, "CLOCK_ACCURACY", &createDefault<tClockAccuracyTLV>},
    {kUtcProperties, "UTC_PROPERTIES", &createDefault<tUTCPropertiesTLV>},
    {kTraceabilityProperties, "TRACEABILITY_PROPERTIES",
     &createDefault<tTraceabilityPropertiesTLV>},
    {kTimescaleProperties, "TIMESCALE_PROPERTIES", &createDefault<tTimescalePropertiesTLV>},
    {kDelayMechanism, "DELAY_MECHANISM", &createDefault<tDelayMechanismTLV>},
    {kLogMinPdelayReqInterval, "LOG_MIN_PDELAY_REQ_INTERVAL",
     &createDefault<tLogMinPdelayReqIntervalTLV>},
};

}  // namespace

std::span<const tManagementIdEntry> managementIdTable() {
    return kTable;
}

const tManagementIdEntry* findManagementId(std::uint16_t managementId) {
    for (const tManagementIdEntry& entry : kTable) {
        if (entry.managementId == managementId) {
            return &entry;
        }
    }
    return nullptr;
}

}  // namespace nQVPTP000
