#ifndef QV_PLATFORM_STRINGBASE_H
#define QV_PLATFORM_STRINGBASE_H

#include <cstdint>
#include <cstring>
#include <string_view>
#include <type_traits>
#include <utility>

#include "platform/BStr.h"
#include "platform/CodePage.h"
#include "platform/NumericCast.h"
#include "platform/SafeInteger.h"
#include "platform/TaskMemory.h"

namespace qv::dsc {

// A growable text of `char` (narrow, in the current locale's set) or WideChar (UTF-16) in a
// buffer from TaskMemory, always followed by a NUL. Lengths are limited to 32 bits: a
// longer text throws qv::dsc::exception::OutOfRange, a failed allocation std::bad_alloc.
//
// Assignment keeps the buffer when the new text fits and fills at least half of it;
// otherwise the buffer is replaced by one of exactly the new length, so a string that
// once held a long text does not keep its memory for ever.
template <typename Char>
class StringBase {
    static_assert(std::is_same_v<Char, char> || std::is_same_v<Char, WideChar>);
    using OtherChar = std::conditional_t<std::is_same_v<Char, char>, WideChar, char>;

  public:
    StringBase() = default;
    // Null counts as the empty text.
    StringBase(const Char* text) { assign(text, text != nullptr ? lengthOf(text) : 0); }
    StringBase(const Char* first, const Char* last) {
        assign(first, static_cast<std::size_t>(last - first));
    }
    explicit StringBase(std::basic_string_view<Char> text) { assign(text.data(), text.size()); }
    // From the other width, converted through the current locale's character set.
    explicit StringBase(const StringBase<OtherChar>& other) { assignConverted(other.view()); }
    StringBase(const StringBase& other) { assign(other.begin_, other.length()); }
    StringBase(StringBase&& other) noexcept
        : begin_(std::exchange(other.begin_, nullptr)),
          end_(std::exchange(other.end_, nullptr)),
          capacityEnd_(std::exchange(other.capacityEnd_, nullptr)) {}
    ~StringBase() { TaskMemory::release(begin_); }

    StringBase& operator=(const StringBase& other) {
        assign(other.begin_, other.length());
        return *this;
    }
    StringBase& operator=(StringBase&& other) noexcept {
        StringBase moved(std::move(other));
        swap(moved);
        return *this;
    }
    StringBase& operator=(const Char* text) {
        assign(text, text != nullptr ? lengthOf(text) : 0);
        return *this;
    }

    void assign(const Char* text, std::size_t count) {
        const std::uint32_t newLength = NumericCast::toU32(count);
        if (begin_ != nullptr && newLength <= capacity() &&
            std::uint64_t{newLength} * 2 >= capacity()) {
            // The source may lie inside this buffer.
            if (count != 0) {
                std::memmove(begin_, text, newLength * sizeof(Char));
            }
            end_ = begin_ + newLength;
            *end_ = Char{};
            return;
        }
        std::uint32_t bufferLength = newLength;
        SafeInteger::addAssign(bufferLength, 1);
        auto* buffer = static_cast<Char*>(TaskMemory::allocate(bufferLength * sizeof(Char)));
        if (count != 0) {
            std::memcpy(buffer, text, newLength * sizeof(Char));
        }
        buffer[newLength] = Char{};
        TaskMemory::release(begin_);
        begin_ = buffer;
        end_ = buffer + newLength;
        capacityEnd_ = end_;
    }

    // Never null: an empty string that owns no buffer answers a static empty text.
    const Char* c_str() const { return begin_ != nullptr ? begin_ : kEmpty; }
    std::uint32_t length() const { return static_cast<std::uint32_t>(end_ - begin_); }
    // Characters the buffer holds without growing, the NUL not counted.
    std::uint32_t capacity() const { return static_cast<std::uint32_t>(capacityEnd_ - begin_); }
    bool empty() const { return end_ == begin_; }
    std::basic_string_view<Char> view() const { return {c_str(), length()}; }

    void swap(StringBase& other) noexcept {
        std::swap(begin_, other.begin_);
        std::swap(end_, other.end_);
        std::swap(capacityEnd_, other.capacityEnd_);
    }

    friend bool operator==(const StringBase& a, const StringBase& b) {
        return a.view() == b.view();
    }

  private:
    static constexpr Char kEmpty[1] = {};

    static std::size_t lengthOf(const Char* text) {
        return std::basic_string_view<Char>(text).size();
    }

    void assignConverted(std::basic_string_view<OtherChar> text) {
        if constexpr (std::is_same_v<Char, char>) {
            const std::string converted = CodePage::wideToAnsi(text, "");
            assign(converted.data(), converted.size());
        } else {
            const std::u16string converted = CodePage::ansiToWide(text, "");
            assign(converted.data(), converted.size());
        }
    }

    Char* begin_ = nullptr;
    Char* end_ = nullptr;          // the NUL after the text
    Char* capacityEnd_ = nullptr;  // the last slot, kept for the NUL of a full buffer
};

using String = StringBase<char>;
using WString = StringBase<WideChar>;

}  // namespace qv::dsc

#endif
