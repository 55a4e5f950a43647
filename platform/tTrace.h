#ifndef QV_PLATFORM_TTRACE_H
#define QV_PLATFORM_TTRACE_H

#include <atomic>
#include <cstddef>
#include <cstdint>
#include <map>
#include <mutex>
#include <string>
#include <string_view>
#include <thread>

#include "platform/iTraceDestination.h"
#include "platform/iTraceable.h"

namespace nQVTARN000 {

// Formatted output longer than this is announced and cut.
inline constexpr std::size_t kMaxTraceLine = 1024;

// Assembles diagnostic lines: a header ("[" component "--" line "--" file, filled with "-"
// to 49 characters, "] "), then appended pieces. Finished pieces of at most 253 characters
// go to the destination, each ending at a line end or at that limit.
//
// Threads: every thread assembles its own line (and keeps its own nesting depth and
// suppression), and a finished line goes to the destination in one go, so the pieces of one
// line are never interleaved with another thread's. When the destination does not listen
// (iTraceDestination::isAvailable), nothing is assembled at all.
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
    // Ignores the calling thread's appends until the end of its current line.
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
    // One thread's line in the making.
    struct tLine {
        std::string text;  // since the last line end handed to the destination
        bool suppressed = false;
        std::int32_t depth = 0;  // nesting depth, never below 0
    };

    bool on(Flag flag) const { return (flags_.load() & bit(flag)) != 0; }
    static std::uint32_t bit(Flag flag) { return 1U << static_cast<unsigned>(flag); }
    bool listening() const;
    // The calling thread's line, made on first use; null when tracing is off, nothing
    // listens or memory ran out.
    tLine* threadLine();
    // threadLine() unless its appends are suppressed.
    tLine* appendingLine();
    void forgetIfIdle(const tLine& line);
    void put(tLine& line, const char* text, std::size_t length);
    void deliver(std::string_view lines);
    template <typename Integer>
    void appendNumber(Integer value, unsigned radix);
    void writeHeader(const char* component, std::uint32_t line, const char* file,
                     std::int32_t code);

    iTraceDestination* const destination_;  // not owned; written under deliveryLock_
    std::atomic<std::uint32_t> flags_;
    std::atomic<std::uint32_t> headerWidth_{50};
    std::mutex linesLock_;
    // The map is guarded by linesLock_; an entry's contents belong to its thread alone, which
    // also is the only one to erase it (map entries stay where they are while others come
    // and go).
    std::map<std::thread::id, tLine> lines_;
    std::mutex deliveryLock_;  // held while the pieces of finished lines go out
    // Held from beginLine to endLine while lockLines is on. Recursive: describing an object
    // may begin a line of its own inside the current one on the same thread.
    std::recursive_mutex lock_;
    std::atomic<std::thread::id> owner_{};  // the thread holding lock_, if any
    std::uint32_t linesHeld_ = 0;           // times owner_ holds lock_; guarded by lock_
};

}  // namespace nQVTARN000

#endif
