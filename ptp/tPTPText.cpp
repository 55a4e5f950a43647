#include "ptp/tPTPText.h"

#include <cstring>
#include <new>

#include "platform/tTrace.h"

namespace nQVPTP000 {

std::unique_ptr<std::uint8_t[]> tPTPText::allocate(std::size_t length, tStatus& status) {
    try {
        return std::unique_ptr<std::uint8_t[]>(new std::uint8_t[length]);
    } catch (const std::bad_alloc&) {
        QV_STATUS_SET(status, kStatusNoMemory, kComponentCodec);
        return nullptr;
    }
}

tPTPText::tPTPText(const char* text, tStatus& status) {
    if (status.failed() || text == nullptr) {
        return;
    }
    const std::size_t length = std::strlen(text);
    if (length > kMaxLength) {
        QV_STATUS_SET(status, kStatusUnsupported, kComponentCodec);
        return;
    }
    setText(reinterpret_cast<const std::uint8_t*>(text), static_cast<std::uint8_t>(length), status);
}

tPTPText::tPTPText(const tPTPText& other) {
    *this = other;
}

tPTPText& tPTPText::operator=(const tPTPText& other) {
    if (this != &other) {
        tStatus status;
        setText(other.textField_.get(), other.lengthField_, status);
        if (status.failed()) {
            throw std::bad_alloc();  // this text is unchanged
        }
    }
    return *this;
}

void tPTPText::setText(const std::uint8_t* text, std::uint8_t length, tStatus& status) {
    if (status.failed()) {
        return;
    }
    if (length == 0) {
        lengthField_ = 0;
        textField_.reset();
        return;
    }
    if (length != lengthField_) {
        auto replacement = allocate(length, status);
        if (!replacement) {
            return;
        }
        textField_ = std::move(replacement);
        lengthField_ = length;
    }
    std::memmove(textField_.get(), text, length);
}

std::string_view tPTPText::view() const {
    return lengthField_ == 0
               ? std::string_view()
               : std::string_view(reinterpret_cast<const char*>(textField_.get()), lengthField_);
}

void tPTPText::trace(nQVTARN000::tTrace& trace) const {
    trace.append(reinterpret_cast<const char*>(textField_.get()), lengthField_);
}

void tPTPText::serialize(iSerializableTarget& target, tStatus& status) const {
    target.writeUInteger8(lengthField_, status);
    if (lengthField_ != 0) {
        target.writeOctets(textField_.get(), lengthField_, status);
    }
}

void tPTPText::deserialize(iSerializableTarget& source, tStatus& status) {
    std::uint8_t length = 0;
    source.readUInteger8(length, status);
    if (status.failed()) {
        return;
    }
    if (length == 0) {
        lengthField_ = 0;
        textField_.reset();
        return;
    }
    auto text = allocate(length, status);
    if (!text) {
        return;
    }
    source.readOctets(text.get(), length, status);
    if (status.succeeded()) {
        textField_ = std::move(text);
        lengthField_ = length;
    }
}

}  // namespace nQVPTP000
