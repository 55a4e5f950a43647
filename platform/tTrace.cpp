#include "platform/tTrace.h"

#include <algorithm>
#include <charconv>
#include <chrono>
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <new>

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
    flags_.fetch_and(~bit(Flag::enabled));
    for (; linesHeld_ > 0; --linesHeld_) {
        lock_.unlock();
    }
}

tTrace& tTrace::setFlag(Flag flag, bool enable) {
    if (enable) {
        flags_.fetch_or(bit(flag));
    } else {
        flags_.fetch_and(~bit(flag));
    }
    return *this;
}

tTrace& tTrace::setHeaderWidth(std::uint32_t width) {
    headerWidth_.store(width);
    return *this;
}

bool tTrace::listening() const {
    return on(Flag::enabled) && destination_ != nullptr && destination_->isAvailable();
}

tTrace::tLine* tTrace::threadLine() {
    if (!listening()) {
        return nullptr;
    }
    try {
        std::lock_guard<std::mutex> guard(linesLock_);
        return &lines_[std::this_thread::get_id()];
    } catch (const std::bad_alloc&) {
        return nullptr;  // a diagnostic line is not worth a failure of its caller
    }
}

tTrace::tLine* tTrace::appendingLine() {
    tLine* line = threadLine();
    return line != nullptr && !line->suppressed ? line : nullptr;
}

void tTrace::forgetIfIdle(const tLine& line) {
    if (line.text.empty() && !line.suppressed && line.depth == 0) {
        std::lock_guard<std::mutex> guard(linesLock_);
        lines_.erase(std::this_thread::get_id());
    }
}

tTrace& tTrace::suppress() {
    if (tLine* line = threadLine()) {
        line->suppressed = true;
    }
    return *this;
}

// Whole lines out, each in pieces of at most kMaxPiece characters: a line is never split
// between two deliveries.
void tTrace::deliver(std::string_view lines) {
    char piece[kMaxPiece + 1];
    std::lock_guard<std::mutex> guard(deliveryLock_);
    while (!lines.empty()) {
        const std::size_t size = std::min(lines.find('\n') + 1, kMaxPiece);
        std::memcpy(piece, lines.data(), size);
        piece[size] = '\0';
        destination_->write(piece);
        lines.remove_prefix(size);
    }
}

void tTrace::put(tLine& line, const char* text, std::size_t length) {
    try {
        line.text.append(text, length);
    } catch (const std::bad_alloc&) {
        line.text.clear();
        line.suppressed = true;  // the rest of this line is lost, not the caller's work
        return;
    }
    const std::size_t end = line.text.rfind('\n');
    if (end != std::string::npos) {
        deliver(std::string_view(line.text).substr(0, end + 1));
        line.text.erase(0, end + 1);
    }
}

tTrace& tTrace::append(const char* text, std::size_t length) {
    if (text != nullptr && length != 0) {
        if (tLine* line = appendingLine()) {
            put(*line, text, length);
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
    if (appendingLine() == nullptr) {
        return;
    }
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
    if (appendingLine() != nullptr) {
        object.trace(*this);
    }
    return *this;
}

tTrace& tTrace::appendFormatted(const char* format, ...) {
    if (appendingLine() == nullptr) {
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
    if (tLine* line = threadLine()) {
        line->suppressed = false;
        put(*line, "\n", 1);
        forgetIfIdle(*line);
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
    const std::uint32_t headerWidth = headerWidth_.load();
    const std::size_t width = headerWidth == 0 ? 0 : headerWidth - 1;
    if (on(Flag::limitHeader) && length > width) {
        length = width;
    }
    append(header, length);
    for (std::size_t i = length; i < width; ++i) {
        append(anyField ? '-' : ' ');
    }
    if (anyField && !(on(Flag::limitHeader) && headerWidth == 0)) {
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
    tLine* current = threadLine();
    if (current == nullptr) {
        return *this;  // nobody listens: no header, no nesting to keep
    }
    writeHeader(component, line, file, code);
    if (nesting == kCloseLevel && current->depth > 0) {
        --current->depth;
    }
    if (on(Flag::indent)) {
        for (std::int32_t i = 0; i < current->depth; ++i) {
            append("  ");
        }
    }
    if (nesting == kOpenLevel) {
        ++current->depth;
    }
    return *this;
}

}  // namespace nQVTARN000
