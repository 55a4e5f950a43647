#include "ptp/codecTrace.h"

#include "platform/tConsoleTraceDestination.h"

namespace nQVPTP000 {

nQVTARN000::tTrace& codecTrace() {
    static nQVTARN000::tConsoleTraceDestination destination;
    static nQVTARN000::tTrace trace(&destination);
    return trace;
}

}  // namespace nQVPTP000
