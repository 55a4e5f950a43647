#ifndef QV_PTP_CODECTRACE_H
#define QV_PTP_CODECTRACE_H

#include "platform/tTrace.h"

namespace nQVPTP000 {

// The codec's process-wide trace, writing to the debug output with the default settings.
nQVTARN000::tTrace& codecTrace();

}  // namespace nQVPTP000

#endif
