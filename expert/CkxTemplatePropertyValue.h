#ifndef QV_EXPERT_CKXTEMPLATEPROPERTYVALUE_H
#define QV_EXPERT_CKXTEMPLATEPROPERTYVALUE_H

#include <cstddef>
#include <tuple>
#include <type_traits>
#include <utility>

#include "expert/CkxPropertyValue.h"
#include "expert/CqvBStr.h"
#include "qv1588/corbel.h"

// The seven value types in type-code order: a type's code is its position plus one.
using CkxPropertyValueTypes =
    std::tuple<bool, LONG, ULONG, double, GUID, CqvBStr, kxSysAttrTimestampUTC>;

template <class T, std::size_t... positions>
constexpr ULONG CkxPropertyTypeCodeAt(std::index_sequence<positions...>) {
    constexpr bool kMatches[] = {
        std::is_same_v<T, std::tuple_element_t<positions, CkxPropertyValueTypes>>...};
    for (std::size_t position = 0; position < sizeof...(positions); ++position) {
        if (kMatches[position]) {
            return static_cast<ULONG>(position + 1);
        }
    }
    return 0;
}

template <class T>
inline constexpr ULONG CkxPropertyTypeCode =
    CkxPropertyTypeCodeAt<T>(std::make_index_sequence<std::tuple_size_v<CkxPropertyValueTypes>>());

static_assert(CkxPropertyTypeCode<bool> == kxSysPropertyTypeBool);
static_assert(CkxPropertyTypeCode<CqvBStr> == kxSysPropertyTypeString);
static_assert(CkxPropertyTypeCode<kxSysAttrTimestampUTC> == kxSysPropertyTypeTimestamp);

// A bag value of type T.
template <class T>
class CkxTemplatePropertyValue final : public CkxPropertyValue {
    static_assert(CkxPropertyTypeCode<T> != 0, "not a property value type");

  public:
    static constexpr ULONG kTypeCode = CkxPropertyTypeCode<T>;

    explicit CkxTemplatePropertyValue(T value)
        : CkxPropertyValue(kTypeCode), value_(std::move(value)) {}

    const T& value() const noexcept { return value_; }
    // A string value frees its old text here.
    void assign(T value) noexcept { value_ = std::move(value); }

  private:
    T value_;
};

#endif
