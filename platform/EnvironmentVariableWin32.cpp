#include <windows.h>

#include "platform/EnvironmentVariable.h"

namespace qv::dsc::osdep {

// Windows backend: the process environment block, where SetEnvironmentVariable writes.

std::optional<std::string> EnvironmentVariable::read(const char* name) {
    std::string value(64, '\0');
    for (;;) {
        const DWORD size = static_cast<DWORD>(value.size());
        const DWORD length = GetEnvironmentVariableA(name, value.data(), size);
        if (length == 0) {
            return std::nullopt;  // unset, or set to the empty text
        }
        if (length < size) {
            value.resize(length);
            return value;
        }
        value.resize(length);  // the size it asked for, with room for the NUL
    }
}

bool EnvironmentVariable::set(const char* name, const char* value) {
    return SetEnvironmentVariableA(name, value) != 0;
}

}  // namespace qv::dsc::osdep
