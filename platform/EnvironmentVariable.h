#ifndef QV_PLATFORM_ENVIRONMENTVARIABLE_H
#define QV_PLATFORM_ENVIRONMENTVARIABLE_H

#include <optional>
#include <string>

namespace qv::dsc::osdep {

// The process's own environment, as the system keeps it: getenv and setenv on POSIX,
// GetEnvironmentVariableA and SetEnvironmentVariableA on Windows
// (EnvironmentVariableWin32.cpp). A host process on Windows sets a variable for itself
// with SetEnvironmentVariable, which the C run-time's getenv does not see; reading it here
// does.
class EnvironmentVariable {
  public:
    // The variable's text; nothing when it is unset or empty.
    static std::optional<std::string> read(const char* name);
    // Sets the variable for this process and the processes it starts (a null `value`
    // removes it); false when the system refuses.
    static bool set(const char* name, const char* value);
};

}  // namespace qv::dsc::osdep

#endif
