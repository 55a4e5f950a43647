#ifndef QV_CORBEL_DISCOVERY_H
#define QV_CORBEL_DISCOVERY_H

#include <qv1588/qv1588.h>

#include <string>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/FailureCause.h"

namespace corbel {

// One discovery through the expert (GetItemNames): the item names of the clock ports that
// answered, or why there are none. With no item, the expert's record tells a discovery
// that failed (a send failed: kind network) from one that no clock answered.
struct Discovery {
    std::vector<std::string> items;
    FailureCause failure;  // result S_OK when items were found

    static Discovery run(IkxSysExpert2& expert);

    bool failed() const { return items.empty() && failure.kind != kxQvFailureKind::none; }
    ExitCode outcome() const { return exitCodeOf(failure.result, failure.kind); }
};

}  // namespace corbel

#endif
