#ifndef QV_CORBEL_SERVE_SERVECOMMAND_H
#define QV_CORBEL_SERVE_SERVECOMMAND_H

#include <qv1588/corbel.h>

#include <functional>

#include "corbel/ExitCode.h"
#include "corbel/serve/ServeOptions.h"

namespace corbel {

// Loads the expert and opens its network side with the run's options; null, with the
// reason reported and `failed` set, when it cannot. What it opened stays open until the
// caller ends it, after runServe.
using ExpertOpener = std::function<IkxSysExpert2*(ExitCode& failed)>;

// corbel serve: runs until SIGTERM or SIGINT, then stops the server and the poller (exit
// 0); the caller then shuts the expert down. Refuses to start (exit 2) on a bad option, or
// on an address other than loopback without a configured token while writes are enabled,
// before it opens the expert.
ExitCode runServe(const ServeOptions& options, const ExpertOpener& openExpert);

}  // namespace corbel

#endif
