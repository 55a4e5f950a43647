#ifndef QV_PLATFORM_WINERROR_H
#define QV_PLATFORM_WINERROR_H

#include <cstdint>
#include <string>

#include "platform/OSException.h"

namespace qv::dsc::osdep {

// An operating-system failure described by the calling thread's errno. The errno value is
// first translated to the error number that the same failure has on the host platform
// (ENOENT is 2, EACCES is 5 ...), which is what `osErrorCode` answers and what selects
// `errorCode`. An errno without such a counterpart becomes kUnmappedFlag | errno: that
// number keeps the errno visible and never collides with a host number. On Windows
// (WinErrorWin32.cpp) the number is the system's own (GetLastError) and the text comes from
// FormatMessageA.
class WinError : public OSException {
  public:
    static constexpr std::uint32_t kUnmappedFlag = 0x20000000u;

    // Takes errno as it is on entry.
    WinError(const char* file, std::uint32_t line);
    WinError(int posixError, const char* file, std::uint32_t line);
    ~WinError() override = default;

    std::uint32_t errorCode() const noexcept override;

    static std::uint32_t hostErrorNumber(int posixError) noexcept;
    static std::uint32_t codeOf(std::uint32_t hostError) noexcept;
    // The system's text for errno, cut at the first line end together with the character
    // before it (a full stop that ends a sentence); "Unknown error" when there is none.
    static std::string messageOf(int posixError);
};

}  // namespace qv::dsc::osdep

#endif
