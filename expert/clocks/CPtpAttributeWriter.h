#ifndef QV_EXPERT_CLOCKS_CPTPATTRIBUTEWRITER_H
#define QV_EXPERT_CLOCKS_CPTPATTRIBUTEWRITER_H

#include <functional>
#include <set>
#include <string>

#include "platform/tStatus.h"
#include "ptpmgmt/iPTPClockProxy.h"
#include "qv1588/qv1588.h"

// Checks and writes the settable attributes (kxQvAttribute::settable) of a clock port.
class CPtpAttributeWriter {
  public:
    using tTagSet = std::set<kxSysAttributeTagID>;
    // The clock to write to, looked up only once a settable tag needs it; null for none.
    using tClockLookup = std::function<nQVPTPMGMT000::iPTPClockProxy*()>;

    // Runs through the changed tags in the bag's order: settable ones whose value is valid
    // go into `accepted`; each rejected one appends its sentence to `message`. Returns
    // CORBEL_E_INVALID_VALUE when one was rejected, S_FALSE when nothing settable changed.
    static HRESULT validate(IkxSysPropertyBag& bag, tTagSet& accepted, std::u16string& message);

    // Sends one SET or COMMAND per changed settable tag in the bag's order and stops at the
    // first that fails (E_FAIL, its status in `failure`); a tag whose value cannot be read
    // in its type is skipped.
    static HRESULT apply(IkxSysPropertyBag& bag, const tClockLookup& lookup, tStatus& failure);
};

#endif
