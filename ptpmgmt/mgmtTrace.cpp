#include "ptpmgmt/mgmtTrace.h"

#include "platform/tConsoleTraceDestination.h"

namespace nQVPTPMGMT000 {

::nQVTARN000::tTrace& mgmtTrace() {
    static ::nQVTARN000::tConsoleTraceDestination destination;
    static ::nQVTARN000::tTrace trace(&destination);
    return trace;
}

}  // namespace nQVPTPMGMT000
