#ifndef QV_CORBEL_SERVE_SERVECOMMAND_H
#define QV_CORBEL_SERVE_SERVECOMMAND_H

#include "corbel/ExitCode.h"
#include "corbel/serve/ServeOptions.h"

namespace corbel {

// corbel serve: runs until SIGTERM or SIGINT, then stops the server and the poller and
// shuts the expert down (exit 0). Refuses to start (exit 2) on a bad option, or on an
// address other than loopback without a configured token while writes are enabled.
ExitCode runServe(const ServeOptions& options);

}  // namespace corbel

#endif
