#include "platform/WinError.h"

#include <cerrno>
#include <cstring>

namespace qv::dsc::osdep {

namespace {

struct tErrnoPair {
    int posixError;
    std::uint32_t hostError;
};

// errno values that have a counterpart among the host platform's error numbers.
constexpr tErrnoPair kHostErrors[] = {
    {ENOENT, 2},   {ENOTDIR, 3}, {EMFILE, 4},         {ENFILE, 4},    {EACCES, 5},
    {EPERM, 5},    {EBADF, 6},   {ENOMEM, 8},         {ENOEXEC, 11},  {EROFS, 19},
    {ETXTBSY, 32}, {EBUSY, 32},  {EWOULDBLOCK, 33},   {ENOSPC, 112},  {EEXIST, 80},
    {EINVAL, 87},  {EPIPE, 109}, {ENAMETOOLONG, 206}, {EILSEQ, 1113}, {EIO, 1117},
    {ELOOP, 1921},
};

// strerror_r comes in two shapes; each overload picks the text out of its own.
[[maybe_unused]] const char* pickText(const char* result, const char*) {
    return result;
}
[[maybe_unused]] const char* pickText(int result, const char* buffer) {
    return result == 0 ? buffer : nullptr;
}

}  // namespace

WinError::WinError(const char* file, std::uint32_t line) : WinError(errno, file, line) {}

WinError::WinError(int posixError, const char* file, std::uint32_t line)
    : OSException(messageOf(posixError), hostErrorNumber(posixError), file, line) {}

std::uint32_t WinError::errorCode() const noexcept {
    return codeOf(osErrorCode());
}

std::uint32_t WinError::hostErrorNumber(int posixError) noexcept {
    if (posixError == 0) {
        return 0;
    }
    for (const tErrnoPair& pair : kHostErrors) {
        if (pair.posixError == posixError) {
            return pair.hostError;
        }
    }
    return kUnmappedFlag | static_cast<std::uint32_t>(posixError);
}

std::string WinError::messageOf(int posixError) {
    char buffer[256] = {};
    const char* text = pickText(strerror_r(posixError, buffer, sizeof(buffer)), buffer);
    if (text == nullptr || *text == '\0') {
        return "Unknown error";
    }
    std::string message(text);
    const std::size_t lineEnd = message.find_first_of("\r\n");
    if (lineEnd != std::string::npos) {
        // The character before the line end is a sentence's full stop; a text that starts
        // with a line end has nothing to drop.
        message.erase(lineEnd > 0 && message[lineEnd - 1] == '.' ? lineEnd - 1 : lineEnd);
    }
    return message.empty() ? "Unknown error" : message;
}

}  // namespace qv::dsc::osdep
