#include "platform/tConsoleTraceDestination.h"

#include <climits>
#include <cstdio>

#include "platform/DebugOutput.h"

namespace nQVTARN000 {

void tConsoleTraceDestination::write(const char* text, std::size_t length) {
    char buffer[kBufferSize];
    const int precision = length > INT_MAX ? INT_MAX : static_cast<int>(length);
    std::snprintf(buffer, sizeof(buffer), "%.*s", precision, text);
    outputDebugString(buffer);
}

bool tConsoleTraceDestination::isAvailable() const {
    return debugOutputListens();
}

void tConsoleTraceDestination::write(const char* text) {
    char buffer[kBufferSize];
    std::snprintf(buffer, sizeof(buffer), "%s", text);
    outputDebugString(buffer);
}

}  // namespace nQVTARN000
