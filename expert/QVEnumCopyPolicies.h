#ifndef QV_EXPERT_QVENUMCOPYPOLICIES_H
#define QV_EXPERT_QVENUMCOPYPOLICIES_H

#include <string>
#include <utility>

#include "platform/BStr.h"
#include "qv1588/corbel.h"

// How an enumerator hands one container element to its caller (`copy`, which may throw)
// and takes it back when a call fails half-way (`destroy`).

// Tags are delivered by value; from a map, the key.
struct QVCopyTagPolicy {
    static void copy(kxSysAttributeTagID* to, const kxSysAttributeTagID& from) { *to = from; }
    template <class Value>
    static void copy(kxSysAttributeTagID* to,
                     const std::pair<const kxSysAttributeTagID, Value>& from) {
        *to = from.first;
    }
    static void destroy(kxSysAttributeTagID*) noexcept {}
};

// Names are delivered as new BSTRs that the caller frees.
struct QVCopyNamePolicy {
    static void copy(BSTR* to, const std::u16string& from) { *to = qv::dsc::BStr::allocate(from); }
    static void destroy(BSTR* name) noexcept {
        qv::dsc::BStr::release(*name);
        *name = nullptr;
    }
};

#endif
