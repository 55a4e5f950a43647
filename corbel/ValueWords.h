#ifndef QV_CORBEL_VALUEWORDS_H
#define QV_CORBEL_VALUEWORDS_H

#include <qv1588/corbel.h>

#include <string>

#include "corbel/PropertyValue.h"

namespace corbel {

// What a value means to a person, beside the number the clock sent: the IEEE 1588 word of
// an enumeration ("MASTER", "GPS", "E2E", "within 100 ns", "default") or the period of a
// log2 interval ("500 ms"), and the unit of a quantity ("ns", "log2 s", "s").
struct ValueWords {
    std::string word;  // empty where none exists
    std::string unit;  // empty where none applies
};

ValueWords wordsOf(kxSysAttributeTagID tag, const PropertyValue& value);

// The value as every view of this program shows it: the word of an enumeration ("MASTER";
// the number where no word exists), a class or an accuracy with its meaning ("248
// (default)", "0xFE (unknown)"), a quantity with its unit ("-12 ns"), an interval with its
// period ("-1 (500 ms)"), a time in ISO 8601 UTC, text as it is ("" when empty).
std::string valueText(kxSysAttributeTagID tag, const PropertyValue& value);

// 2^log2 seconds in the unit that suits it: "1 s", "500 ms", "7.812 ms", "1024 s".
std::string periodText(int log2);

}  // namespace corbel

#endif
