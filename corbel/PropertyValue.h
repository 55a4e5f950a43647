#ifndef QV_CORBEL_PROPERTYVALUE_H
#define QV_CORBEL_PROPERTYVALUE_H

#include <qv1588/corbel.h>

#include <cstdint>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

namespace corbel {

// One typed value of a property bag. The alternatives stand in the order of the type codes
// (kxSysPropertyTypeBool is index 0); strings are held in UTF-8.
using PropertyValue = std::variant<bool, std::int32_t, std::uint32_t, double, GUID, std::string,
                                   kxSysAttrTimestampUTC>;

// Every value a bag holds, by tag.
using PropertyValues = std::map<kxSysAttributeTagID, PropertyValue>;

// Reads every tag of `bag`; a tag whose value cannot be read is left out.
PropertyValues readBag(IkxSysPropertyBag& bag);

// "{7B913AC1-977C-404B-9313-1778C1DCA6BA}".
std::string guidText(const GUID& guid);

// The value's type code (kxSysPropertyTypeBool ...).
inline ULONG typeOf(const PropertyValue& value) {
    return static_cast<ULONG>(value.index() + 1);
}

// A value read from text, or what a value of that type looks like ("takes true, false, 1
// or 0").
struct ParsedValue {
    std::optional<PropertyValue> value;
    std::string expected;
};

// A value of `type` from text as a user types it: integers, doubles, "true"/"false"/"1"/
// "0", strings, ISO 8601 UTC times within what PTP carries.
ParsedValue parseValue(std::string_view text, kxSysPropertyType type);

// Stores `value` under `tag` with the setter of its type.
HRESULT storeValue(IkxSysPropertyBag2& bag, kxSysAttributeTagID tag, const PropertyValue& value);

}  // namespace corbel

#endif
