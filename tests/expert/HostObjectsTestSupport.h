#ifndef QV_TESTS_EXPERT_HOSTOBJECTSTESTSUPPORT_H
#define QV_TESTS_EXPERT_HOSTOBJECTSTESTSUPPORT_H

#include <gtest/gtest.h>

#include <vector>

#include "expert/CQVComObject.h"
#include "expert/CQVComPtr.h"
#include "expert/CkxDynamicPropertyBag.h"

namespace qvtest {

using BagPtr = CQVComPtr<IkxSysPropertyBag2>;

inline BagPtr newBag() {
    CQVComObject<CkxDynamicPropertyBag>* created = nullptr;
    EXPECT_EQ(CQVComObject<CkxDynamicPropertyBag>::CreateInstance(&created), S_OK);
    return BagPtr(created);
}

// Every tag that the enumerator still has, one Next at a time.
inline std::vector<kxSysAttributeTagID> remainingTags(IkxSysEnumPropertyTag* tags) {
    std::vector<kxSysAttributeTagID> found;
    kxSysAttributeTagID tag = 0;
    while (tags != nullptr && tags->Next(1, &tag, nullptr) == S_OK) {
        found.push_back(tag);
    }
    return found;
}

}  // namespace qvtest

#endif
