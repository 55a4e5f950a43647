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

    // Where and why a write stopped.
    struct tApplyFailure {
        kxSysAttributeTagID tag = 0;  // the tag it stopped at
        tStatus status;               // the request's failure, when one was sent
        std::u16string sentence;      // validation's sentence, for a value it rejects
    };

    // Sends one SET or COMMAND per changed settable tag in the bag's order and stops at the
    // first that fails: E_FAIL when the clock is unknown or the request fails,
    // CORBEL_E_INVALID_VALUE (nothing sent for it) when validation would reject the value or
    // it cannot be read in its tag's type. Earlier tags stay written.
    static HRESULT apply(IkxSysPropertyBag& bag, const tClockLookup& lookup,
                         tApplyFailure& failure);
};

#endif
