#ifndef QV_CORBEL_CLI_STOPSIGNAL_H
#define QV_CORBEL_CLI_STOPSIGNAL_H

namespace corbel {

// Ctrl-C (SIGINT) and SIGTERM as a request to stop, so that a long-running command ends
// its current step and leaves cleanly instead of being killed in the middle of it.
class StopSignal {
  public:
    static void install();
    static bool requested();
};

}  // namespace corbel

#endif
