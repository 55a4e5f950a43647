#ifndef QV_PLATFORM_TTRACE_H
#define QV_PLATFORM_TTRACE_H

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <mutex>
#include <thread>

#include "platform/iTraceDestination.h"
#include "platform/iTraceable.h"

namespace nQVTARN000 {

// Formatted output longer than this is announced and cut.
inline constexpr std::size_t kMaxTraceLine = 1024;

// Assembles one diagnostic line at a time: a header ("[" component "--" line "--" file,
// filled with "-" to 49 characters, "] "), then appended pieces. Finished pieces of at most
// 253 characters go to the destination, each ending at a line end or at that limit.
class tTrace {
  public:
    static constexpr std::size_t kMaxPiece = 253;

    enum class Flag {
        enabled,
        showComponent,
        showVersion,
        showLine,
        showFile,
        showTime,
        showCode,
        showThread,
        lockLines,
        indent,
        limitHeader,
    };
    enum Nesting { kNoNesting = 0, kOpenLevel = 1, kCloseLevel = 2 };

    explicit tTrace(iTraceDestination* destination);
    virtual ~tTrace();
    tTrace(const tTrace&) = delete;
    tTrace& operator=(const tTrace&) = delete;

    tTrace& setFlag(Flag flag, bool on);
    tTrace& setHeaderWidth(std::uint32_t width);
    // Ignores appends until the end of the current line.
    tTrace& suppress();

    tTrace& beginLine(const char* component, std::uint32_t line, const char* file,
                      std::int32_t code, int nesting);
    tTrace& append(const char* text);
    tTrace& append(const char* text, std::size_t length);
    tTrace& append(char c);
    tTrace& append(bool value);
    tTrace& append(std::uint8_t value, unsigned radix = 10);
    tTrace& append(std::uint16_t value, unsigned radix = 10);
    tTrace& append(std::uint32_t value, unsigned radix = 10);
    tTrace& append(std::int8_t value, unsigned radix = 10);
    tTrace& append(std::int16_t value, unsigned radix = 10);
    tTrace& append(std::int32_t value, unsigned radix = 10);
    tTrace& append(const iTraceable& object);
    tTrace& appendFormatted(const char* format, ...) __attribute__((format(printf, 2, 3)));
    tTrace& endLine();

  private:
    bool on(Flag flag) const { return (flags_ & bit(flag)) != 0; }
    static std::uint32_t bit(Flag flag) { return 1U << static_cast<unsigned>(flag); }
    bool appending() const { return on(Flag::enabled) && !suppressed_; }
    void put(char c);
    void flushPiece();
    template <typename Integer>
    void appendNumber(Integer value, unsigned radix);
    void writeHeader(const char* component, std::uint32_t line, const char* file,
                     std::int32_t code);

    iTraceDestination* destination_;  // not owned
    std::uint32_t flags_;
    bool suppressed_ = false;
    std::uint32_t headerWidth_ = 50;
    std::int32_t depth_ = 0;
    // Held from beginLine to endLine while lockLines is on. Recursive: describing an object
    // may begin a line of its own inside the current one on the same thread.
    std::recursive_mutex lock_;
    std::atomic<std::thread::id> owner_{};  // the thread holding lock_, if any
    std::uint32_t linesHeld_ = 0;           // times owner_ holds lock_; guarded by lock_
    char line_[kMaxPiece + 1] = {};
    std::size_t cursor_ = 0;
};

}  // namespace nQVTARN000

#endif
