#include "corbel/serve/ClockSource.h"

namespace corbel {

bool ReadFailure::notSupported() const {
    // IEEE 1588-2008 Table 72: NO_SUCH_ID 0x0002, NOT_SUPPORTED 0x0006.
    return kind == kxQvFailureKind::refusedByClock &&
           (managementErrorId == 0x0002 || managementErrorId == 0x0006);
}

}  // namespace corbel
