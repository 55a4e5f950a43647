#ifndef QV_EXPERT_CQVBSTR_H
#define QV_EXPERT_CQVBSTR_H

#include <type_traits>

#include "platform/BStr.h"
#include "qv1588/corbel.h"

// The library's boundary strings are the header's: one character type, one allocator.
static_assert(std::is_same_v<OLECHAR, qv::dsc::OleChar> && std::is_same_v<BSTR, qv::dsc::BSTR>);

// An owned BSTR, freed with the object; null is the empty text. Copies allocate (and throw
// std::bad_alloc when memory runs out); moves hand the string over.
class CqvBStr {
  public:
    CqvBStr() = default;
    // A copy of a NUL-terminated text; null stays null.
    static CqvBStr copyOf(const OLECHAR* text);

    CqvBStr(const CqvBStr& other);
    CqvBStr(CqvBStr&& other) noexcept;
    CqvBStr& operator=(CqvBStr other) noexcept;
    ~CqvBStr();

    const OLECHAR* get() const noexcept { return text_; }
    // A new BSTR with the same code units (embedded NULs included), for the caller to free.
    BSTR copy() const;

  private:
    BSTR text_ = nullptr;
};

#endif
