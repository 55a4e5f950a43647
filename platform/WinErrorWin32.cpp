#include <windows.h>

#include "platform/WinError.h"

namespace qv::dsc::osdep {

// Windows backend: the error numbers are the system's own (GetLastError), so no
// translation is needed, and the system's text comes from FormatMessageA.

namespace {

// The text that FormatMessageA allocates, freed on every path.
class tSystemText {
  public:
    explicit tSystemText(DWORD error) {
        constexpr DWORD kFlags = FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM |
                                 FORMAT_MESSAGE_IGNORE_INSERTS;
        FormatMessageA(kFlags, nullptr, error, 0, reinterpret_cast<LPSTR>(&text_), 0, nullptr);
    }
    ~tSystemText() { LocalFree(text_); }
    tSystemText(const tSystemText&) = delete;
    tSystemText& operator=(const tSystemText&) = delete;

    const char* text() const { return text_; }

  private:
    char* text_ = nullptr;
};

}  // namespace

WinError::WinError(const char* file, std::uint32_t line)
    : WinError(static_cast<int>(GetLastError()), file, line) {}

WinError::WinError(int systemError, const char* file, std::uint32_t line)
    : OSException(messageOf(systemError), hostErrorNumber(systemError), file, line) {}

std::uint32_t WinError::errorCode() const noexcept {
    return codeOf(osErrorCode());
}

std::uint32_t WinError::hostErrorNumber(int systemError) noexcept {
    return static_cast<std::uint32_t>(systemError);
}

std::string WinError::messageOf(int systemError) {
    const tSystemText system(static_cast<DWORD>(systemError));
    if (system.text() == nullptr || *system.text() == '\0') {
        return "Unknown error";
    }
    std::string message(system.text());
    const std::size_t lineEnd = message.find_first_of("\r\n");
    if (lineEnd != std::string::npos) {
        // The character before the line end is a sentence's full stop.
        message.erase(lineEnd > 0 && message[lineEnd - 1] == '.' ? lineEnd - 1 : lineEnd);
    }
    return message.empty() ? "Unknown error" : message;
}

}  // namespace qv::dsc::osdep
