#include "platform/tTrace.h"

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cstdarg>
#include <cstdio>
#include <cstring>

#include "platform/CurrentThread.h"
#include "platform/tStatus.h"

namespace nQVTARN000 {

namespace {

constexpr char kOverflowNotice[] = "!!Formatted string exceeds kMaxTraceLine characters!!";

}  // namespace

tTrace::tTrace(iTraceDestination* destination)
    : destination_(destination),
      flags_(bit(Flag::enabled) | bit(Flag::showComponent) | bit(Flag::showLine) |
             bit(Flag::showFile) | bit(Flag::indent) | bit(Flag::limitHeader)) {}

tTrace::~tTrace() {
    flags_ &= ~bit(Flag::enabled);
    for (; linesHeld_ > 0; --linesHeld_) {
        lock_.unlock();
    }
}

tTrace& tTrace::setFlag(Flag flag, bool enable) {
    flags_ = enable ? (flags_ | bit(flag)) : (flags_ & ~bit(flag));
    return *this;
}

tTrace& tTrace::setHeaderWidth(std::uint32_t width) {
    headerWidth_ = width;
    return *this;
}

tTrace& tTrace::suppress() {
    suppressed_ = true;
    return *this;
}

void tTrace::flushPiece() {
    line_[cursor_] = '\0';
    if (destination_ != nullptr) {
        destination_->write(line_);
    }
    cursor_ = 0;
}

void tTrace::put(char c) {
    line_[cursor_++] = c;
    if (c == '\n' || cursor_ == kMaxPiece) {
        flushPiece();
    }
}

tTrace& tTrace::append(const char* text, std::size_t length) {
    if (appending() && text != nullptr) {
        for (std::size_t i = 0; i < length; ++i) {
            put(text[i]);
        }
    }
    return *this;
}

tTrace& tTrace::append(const char* text) {
    return text == nullptr ? *this : append(text, std::strlen(text));
}

tTrace& tTrace::append(char c) {
    return append(&c, 1);
}

tTrace& tTrace::append(bool value) {
    return append(value ? "true(1)" : "false(0)");
}

template <typename Integer>
void tTrace::appendNumber(Integer value, unsigned radix) {
    char digits[34];  // 32 binary digits and a sign
    const int base = radix < 2 || radix > 36 ? 10 : static_cast<int>(radix);
    const std::to_chars_result end = std::to_chars(digits, digits + sizeof digits, value, base);
    append(digits, static_cast<std::size_t>(end.ptr - digits));
}

tTrace& tTrace::append(std::uint8_t value, unsigned radix) {
    return append(static_cast<std::uint32_t>(value), radix);
}
tTrace& tTrace::append(std::uint16_t value, unsigned radix) {
    return append(static_cast<std::uint32_t>(value), radix);
}
tTrace& tTrace::append(std::uint32_t value, unsigned radix) {
    appendNumber(value, radix);
    return *this;
}
tTrace& tTrace::append(std::int8_t value, unsigned radix) {
    return append(static_cast<std::int32_t>(value), radix);
}
tTrace& tTrace::append(std::int16_t value, unsigned radix) {
    return append(static_cast<std::int32_t>(value), radix);
}
tTrace& tTrace::append(std::int32_t value, unsigned radix) {
    appendNumber(value, radix);
    return *this;
}

tTrace& tTrace::append(const iTraceable& object) {
    if (appending()) {
        object.trace(*this);
    }
    return *this;
}

tTrace& tTrace::appendFormatted(const char* format, ...) {
    if (!appending()) {
        return *this;
    }
    char buffer[kMaxTraceLine];
    va_list arguments;
    va_start(arguments, format);
    const int needed = std::vsnprintf(buffer, sizeof(buffer), format, arguments);
    va_end(arguments);
    if (needed < 0) {
        return *this;
    }
    if (static_cast<std::size_t>(needed) >= sizeof(buffer)) {
        append(kOverflowNotice);
    }
    return append(buffer);
}

tTrace& tTrace::endLine() {
    if (on(Flag::enabled)) {
        suppressed_ = false;
        append('\n');
    }
    // Only the thread that locked the line may end its hold.
    if (owner_.load() == std::this_thread::get_id() && linesHeld_ > 0) {
        if (--linesHeld_ == 0) {
            owner_.store(std::thread::id());
        }
        lock_.unlock();
    }
    return *this;
}

void tTrace::writeHeader(const char* component, std::uint32_t line, const char* file,
                         std::int32_t code) {
    char header[256];
    std::size_t length = 0;
    bool anyField = false;
    auto field = [&](const char* text) {
        const int n = std::snprintf(header + length, sizeof(header) - length, "%s%s",
                                    anyField ? "--" : "[", text);
        length = std::min(sizeof(header) - 1, length + static_cast<std::size_t>(n));
        anyField = true;
    };
    char number[32];
    if (on(Flag::showComponent)) {
        field(component != nullptr ? component : "");
    }
    if (on(Flag::showVersion)) {
        field("v1.0");
    }
    if (on(Flag::showLine)) {
        std::snprintf(number, sizeof(number), "%u", line);
        field(number);
    }
    if (on(Flag::showFile)) {
        field(file != nullptr ? sourceBaseName(file) : "");
    }
    if (on(Flag::showThread)) {
        std::snprintf(number, sizeof(number), "%lu",
                      static_cast<unsigned long>(qv::dsc::osdep::CurrentThread::id()));
        field(number);
    }
    if (on(Flag::showTime)) {
        const auto ticks = std::chrono::duration_cast<std::chrono::milliseconds>(
            std::chrono::steady_clock::now().time_since_epoch());
        std::snprintf(number, sizeof(number), "%lld", static_cast<long long>(ticks.count()));
        field(number);
    }
    if (on(Flag::showCode)) {
        std::snprintf(number, sizeof(number), "%d", code);
        field(number);
    }
    const std::size_t width = headerWidth_ == 0 ? 0 : headerWidth_ - 1;
    if (on(Flag::limitHeader) && length > width) {
        length = width;
    }
    append(header, length);
    for (std::size_t i = length; i < width; ++i) {
        append(anyField ? '-' : ' ');
    }
    if (anyField && !(on(Flag::limitHeader) && headerWidth_ == 0)) {
        append("] ");
    }
}

tTrace& tTrace::beginLine(const char* component, std::uint32_t line, const char* file,
                          std::int32_t code, int nesting) {
    if (!on(Flag::enabled)) {
        return *this;
    }
    if (on(Flag::lockLines)) {
        lock_.lock();
        owner_.store(std::this_thread::get_id());
        ++linesHeld_;
    }
    writeHeader(component, line, file, code);
    if (nesting == kCloseLevel && depth_ > 0) {
        --depth_;
    }
    if (on(Flag::indent)) {
        for (std::int32_t i = 0; i < depth_; ++i) {
            append("  ");
        }
    }
    if (nesting == kOpenLevel) {
        ++depth_;
    }
    return *this;
}

}  // namespace nQVTARN000
