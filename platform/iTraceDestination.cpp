#include "platform/iTraceDestination.h"

#include <algorithm>
#include <cstring>

namespace nQVTARN000 {

void iTraceDestination::describe(char* buffer, std::uint32_t size, std::uint32_t& needed) const {
    static constexpr char kDescription[] = " --destination tarn";
    needed = sizeof(kDescription);
    if (buffer == nullptr || size == 0) {
        return;
    }
    const std::size_t count = std::min<std::size_t>(size - 1, sizeof(kDescription) - 1);
    std::memcpy(buffer, kDescription, count);
    buffer[count] = '\0';
}

}  // namespace nQVTARN000
