#include "platform/EnvironmentVariable.h"

#include <stdlib.h>

namespace qv::dsc::osdep {

std::optional<std::string> EnvironmentVariable::read(const char* name) {
    const char* value = ::getenv(name);
    if (value == nullptr || *value == '\0') {
        return std::nullopt;
    }
    return std::string(value);
}

bool EnvironmentVariable::set(const char* name, const char* value) {
    return (value == nullptr ? ::unsetenv(name) : ::setenv(name, value, 1)) == 0;
}

}  // namespace qv::dsc::osdep
