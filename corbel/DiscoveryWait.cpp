#include "corbel/DiscoveryWait.h"

#include <unistd.h>

#include <cstdio>
#include <string>

#include "platform/EnvironmentVariable.h"
#include "platform/FindClocksTimeout.h"

namespace corbel {

using qv::dsc::osdep::EnvironmentVariable;
using qv::dsc::osdep::FindClocksTimeout;

DiscoveryWait::DiscoveryWait(std::optional<std::uint32_t> milliseconds) {
    if (milliseconds && !EnvironmentVariable::set(FindClocksTimeout::kOverrideVariable,
                                                  std::to_string(*milliseconds).c_str())) {
        std::fprintf(stderr, "corbel: cannot set %s for --wait; using the stored wait\n",
                     FindClocksTimeout::kOverrideVariable);
    }
}

void DiscoveryWait::announce(const char* purpose) const {
    if (isatty(fileno(stderr)) != 0) {
        // Read as the expert reads it, the override of --wait included.
        std::fprintf(stderr,
                     "corbel: %s: waiting %u ms for PTP clocks in domains 0 to 3 to answer\n",
                     purpose, FindClocksTimeout::read());
    }
}

}  // namespace corbel
