#include "ptp/tManagementIdTable.h"

#include <array>

#include "ptp/TLVs/tNullManagementTLV.h"

namespace nQVPTP000 {

namespace {

template <typename T>
std::unique_ptr<tManagementTLV> createDefault() {
    return std::make_unique<T>();
}

const tManagementIdEntry kTable[] = {
    {kNullManagement, "NULL_MANAGEMENT", &createDefault<tNullManagementTLV>},
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
