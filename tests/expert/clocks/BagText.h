#ifndef QV_TESTS_EXPERT_CLOCKS_BAGTEXT_H
#define QV_TESTS_EXPERT_CLOCKS_BAGTEXT_H

#include <string>
#include <vector>

#include "qv1588/qv1588.h"

namespace qvtest {

// A bag's value as text: numbers in decimal, doubles with one decimal ("-1.0", "inf"),
// strings in ASCII with "\\uXXXX" for other code units, timestamps as "seconds+fraction"; "(none)"
// when the tag is missing.
std::string textOf(IkxSysPropertyBag& bag, kxSysAttributeTagID tag);

// Every tag that GetItemProperties reads.
std::vector<kxSysAttributeTagID> readableTags();

}  // namespace qvtest

#endif
