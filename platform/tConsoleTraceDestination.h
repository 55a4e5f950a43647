#ifndef QV_PLATFORM_TCONSOLETRACEDESTINATION_H
#define QV_PLATFORM_TCONSOLETRACEDESTINATION_H

#include "platform/iTraceDestination.h"

namespace nQVTARN000 {

// Hands every piece to the debug output, formatted into a 1024-character buffer.
class tConsoleTraceDestination final : public iTraceDestination {
  public:
    static constexpr std::size_t kBufferSize = 1024;

    void write(const char* text, std::size_t length) override;
    void write(const char* text) override;
    // Whether the debug output goes anywhere (debugOutputListens).
    bool isAvailable() const override;
};

}  // namespace nQVTARN000

#endif
