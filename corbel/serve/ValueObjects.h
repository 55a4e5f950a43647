#ifndef QV_CORBEL_SERVE_VALUEOBJECTS_H
#define QV_CORBEL_SERVE_VALUEOBJECTS_H

#include <qv1588/qv1588.h>

#include <cstdint>
#include <nlohmann/json.hpp>
#include <string>

#include "corbel/PropertyValue.h"
#include "corbel/serve/ClockSource.h"

namespace corbel {

// One tag's value as JSON: {"tag": "0xE006000", "type": "u32", "value": 60, "settable":
// true}.
nlohmann::ordered_json valueObject(kxSysAttributeTagID tag, const PropertyValue& value);
// A tag that was not read: the same without a value, with why instead ("error", and
// "reason" when the clock refused).
nlohmann::ordered_json unreadObject(kxSysAttributeTagID tag, const ReadFailure& failure);

// IEEE 1588 port states: "MASTER" for 6; the number where the standard has no word.
std::string portStateWord(std::int32_t state);

// Why an exchange failed, in words: "not supported by this clock", "no answer from the
// clock", ...
std::string failureWords(const ReadFailure& failure);

}  // namespace corbel

#endif
