#include "platform/tStatus.h"

#include <cstring>

namespace {

// Copies up to `size` characters, pads with NULs and forces the last character to NUL, so
// that an over-long name keeps its first size - 1 characters.
void copyField(char* field, std::size_t size, const char* text) {
    std::strncpy(field, text != nullptr ? text : "", size);
    field[size - 1] = '\0';
}

bool mayReplace(std::int32_t current, std::int32_t next) {
    return (current == 0 && next != 0) || (current > 0 && next < 0);
}

}  // namespace

bool tStatus::set(std::int32_t newCode, const char* componentName, const char* fileName,
                  std::uint32_t lineNumber) {
    if (!mayReplace(code, newCode)) {
        return false;
    }
    code = newCode;
    if (structSize >= kFullSize) {
        copyField(component, kComponentSize, componentName);
        copyField(file, kFileSize, fileName);
        line = lineNumber;
        extension[0] = 0;
    }
    return true;
}

void tStatus::reset() {
    code = 0;
    if (structSize >= kFullSize) {
        component[0] = '\0';
        file[0] = '\0';
        line = 0;
        extension[0] = 0;
    }
}

void tStatus::merge(const tStatus& other) {
    const bool otherFull = other.structSize >= kFullSize;
    const bool recorded = set(other.code, otherFull ? other.component : "",
                              otherFull ? other.file : "", otherFull ? other.line : 0);
    if (recorded && otherFull && structSize >= kFullSize) {
        std::memcpy(extension, other.extension, sizeof(extension));
    }
}
