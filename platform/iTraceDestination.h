#ifndef QV_PLATFORM_ITRACEDESTINATION_H
#define QV_PLATFORM_ITRACEDESTINATION_H

#include <cstddef>
#include <cstdint>

namespace nQVTARN000 {

// Receives the finished pieces of trace lines.
class iTraceDestination {
  public:
    virtual ~iTraceDestination() = default;
    // Outputs exactly `length` characters of `text`.
    virtual void write(const char* text, std::size_t length) = 0;
    // Outputs a NUL-terminated text.
    virtual void write(const char* text) = 0;
    virtual void flush() {}
    // Copies " --destination tarn" cut to size - 1 characters and NUL-terminated; `needed`
    // receives its full length plus 1.
    virtual void describe(char* buffer, std::uint32_t size, std::uint32_t& needed) const;
    virtual bool isAvailable() const { return true; }
    virtual void release() {}
    virtual const char* getName() const { return "nQVTARNS100_printf"; }
};

}  // namespace nQVTARN000

#endif
