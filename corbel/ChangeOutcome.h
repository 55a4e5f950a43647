#ifndef QV_CORBEL_CHANGEOUTCOME_H
#define QV_CORBEL_CHANGEOUTCOME_H

#include <qv1588/qv1588.h>

#include <optional>
#include <vector>

#include "corbel/FailureCause.h"

namespace corbel {

// What became of each changed tag after ApplyChanges, which sends one request per tag in
// ascending tag order and stops at the first that fails: the tags before it were written,
// it was refused (or not answered), the ones after it were not sent.
struct ChangeOutcome {
    std::vector<kxSysAttributeTagID> written;
    std::optional<kxSysAttributeTagID> failed;
    std::vector<kxSysAttributeTagID> notSent;
    // When the expert does not say where it stopped: any of these may have been written.
    std::vector<kxSysAttributeTagID> unknown;

    // `changed` in any order; `cause` is the failure of ApplyChanges (result S_OK: all
    // were written).
    static ChangeOutcome of(std::vector<kxSysAttributeTagID> changed, const FailureCause& cause);
};

}  // namespace corbel

#endif
