#ifndef QV_PLATFORM_ITHREAD_H
#define QV_PLATFORM_ITHREAD_H

#include "platform/tStatus.h"

namespace nQVPTPMGMT000::nQVTARN000 {

// Something that runs on a thread of its own, started by a tThreadController.
class iThread {
  public:
    virtual ~iThread() = default;
    // The thread's body; it reports through `status`.
    virtual void run(tStatus& status) = 0;
};

}  // namespace nQVPTPMGMT000::nQVTARN000

#endif
