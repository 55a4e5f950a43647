#include "platform/tTrace.h"

#include <algorithm>
#include <chrono>
#include <cstdarg>
#include <cstdio>
#include <cstring>

#include "platform/CurrentThread.h"

namespace nQVTARN000 {

namespace {

constexpr char kOverflowNotice[] = "!!Formatted string exceeds kMaxTraceLine characters!!";

const char* fileNameOnly(const char* path) {
    const char* name = path;
    for (const char* p = path; *p != '\0'; ++p) {
        if (*p == '/' || *p == '\\') {
            name = p + 1;
        }
    }
    return name;
}

}  // namespace

tTrace::tTrace(iTraceDestination* destination)
    : destination_(destination),
      flags_(bit(Flag::enabled) | bit(Flag::showComponent) | bit(Flag::showLine) |
             bit(Flag::showFile) | bit(Flag::indent) | bit(Flag::limitHeader)) {}

tTrace::~tTrace() {
    flags_ &= ~bit(Flag::enabled);
    if (lineLocked_) {
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

void tTrace::appendUnsigned(std::uint32_t value, unsigned radix, bool negative) {
    if (radix < 2 || radix > 36) {
        radix = 10;
    }
    char digits[34];
    std::size_t count = 0;
    do {
        digits[count++] = "0123456789abcdefghijklmnopqrstuvwxyz"[value % radix];
        value /= radix;
    } while (value != 0);
    if (negative) {
        digits[count++] = '-';
    }
    while (count > 0) {
        append(digits[--count]);
    }
}

tTrace& tTrace::append(std::uint8_t value, unsigned radix) {
    return append(static_cast<std::uint32_t>(value), radix);
}
tTrace& tTrace::append(std::uint16_t value, unsigned radix) {
    return append(static_cast<std::uint32_t>(value), radix);
}
tTrace& tTrace::append(std::uint32_t value, unsigned radix) {
    appendUnsigned(value, radix, false);
    return *this;
}
tTrace& tTrace::append(std::int8_t value, unsigned radix) {
    return append(static_cast<std::int32_t>(value), radix);
}
tTrace& tTrace::append(std::int16_t value, unsigned radix) {
    return append(static_cast<std::int32_t>(value), radix);
}
tTrace& tTrace::append(std::int32_t value, unsigned radix) {
    // The magnitude of the smallest value does not fit an int32_t, but does fit a uint32_t.
    const std::uint32_t magnitude =
        value < 0 ? 0U - static_cast<std::uint32_t>(value) : static_cast<std::uint32_t>(value);
    appendUnsigned(magnitude, radix, value < 0);
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
    if (lineLocked_) {
        lineLocked_ = false;
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
        field(file != nullptr ? fileNameOnly(file) : "");
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
        lineLocked_ = true;
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
