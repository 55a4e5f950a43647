#include "expert/CqvBStr.h"

#include <utility>

#include "platform/BStr.h"

using qv::dsc::BStr;

CqvBStr CqvBStr::copyOf(const OLECHAR* text) {
    CqvBStr result;
    result.text_ = BStr::copy(text);
    return result;
}

CqvBStr::CqvBStr(const CqvBStr& other) : text_(other.copy()) {}

CqvBStr::CqvBStr(CqvBStr&& other) noexcept : text_(std::exchange(other.text_, nullptr)) {}

CqvBStr& CqvBStr::operator=(CqvBStr other) noexcept {
    std::swap(text_, other.text_);
    return *this;
}

CqvBStr::~CqvBStr() {
    BStr::release(text_);
}

BSTR CqvBStr::copy() const {
    return text_ == nullptr ? nullptr : BStr::copy(text_, BStr::length(text_));
}
