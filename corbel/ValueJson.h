#ifndef QV_CORBEL_VALUEJSON_H
#define QV_CORBEL_VALUEJSON_H

#include <qv1588/qv1588.h>

#include <nlohmann/json.hpp>
#include <string>

#include "corbel/ChangeOutcome.h"
#include "corbel/FailureCause.h"
#include "corbel/ItemReader.h"
#include "corbel/PropertyValue.h"

namespace corbel {

// Keys keep the order in which they are written (tag order, "tag" before "value"), so
// that JSON reads like the tables.
//
// The JSON of values, one shape for every command and view:
//
//   item:   {"<name>": <entry>, ...}, keyed by the tags' symbolic names
//   entry:  {"tag": "0xE001000", "type": "i32", "value": 6, "word": "MASTER",
//            "settable": false}; "word" and "unit" only where they apply (ValueWords)
//   unread: {"tag", "type", "settable", "value": null, "error": "not supported by this
//            clock", "reason": "NOT_SUPPORTED"}; "reason" only when the clock refused
//
// A value is a JSON number, boolean or string as its type is; a time is its ISO 8601 UTC
// text, a GUID its registry text.

nlohmann::ordered_json valueJson(const PropertyValue& value);
nlohmann::ordered_json entryJson(kxSysAttributeTagID tag, const PropertyValue& value);
nlohmann::ordered_json unreadJson(kxSysAttributeTagID tag, const FailureCause& cause);
// The values and the unread tags of a reading.
nlohmann::ordered_json itemJson(const ItemReading& reading);

// What a change did: {"item", "written": [names], "refused": null or {"name", "error",
// "reason"}, "notSent": [names], "unknown": [names]}.
nlohmann::ordered_json changeJson(const std::string& item, const ChangeOutcome& outcome,
                                  const FailureCause& cause);

}  // namespace corbel

#endif
