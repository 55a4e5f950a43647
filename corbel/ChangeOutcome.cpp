#include "corbel/ChangeOutcome.h"

#include <algorithm>

namespace corbel {

ChangeOutcome ChangeOutcome::of(std::vector<kxSysAttributeTagID> changed,
                                const FailureCause& cause) {
    std::ranges::sort(changed);
    ChangeOutcome outcome;
    if (SUCCEEDED(cause.result)) {
        outcome.written = std::move(changed);
        return outcome;
    }
    const auto stop = std::ranges::find(changed, cause.tag);
    if (cause.tag == 0 || stop == changed.end()) {
        outcome.unknown = std::move(changed);
        return outcome;
    }
    outcome.written.assign(changed.begin(), stop);
    outcome.failed = *stop;
    outcome.notSent.assign(stop + 1, changed.end());
    return outcome;
}

}  // namespace corbel
