#ifndef QV_PTPMGMT_MGMTTRACE_H
#define QV_PTPMGMT_MGMTTRACE_H

#include "platform/tTrace.h"

namespace nQVPTPMGMT000 {

// The management client's process-wide trace, writing to the debug output with the default
// settings.
::nQVTARN000::tTrace& mgmtTrace();

}  // namespace nQVPTPMGMT000

#endif
