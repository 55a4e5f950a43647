#ifndef QV_CORBEL_CLI_COMMANDCONTEXT_H
#define QV_CORBEL_CLI_COMMANDCONTEXT_H

#include <qv1588/qv1588.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "corbel/DiscoveryWait.h"
#include "corbel/ExitCode.h"
#include "corbel/ExpertSession.h"
#include "corbel/FailureCause.h"
#include "corbel/ItemReader.h"
#include "corbel/cli/CommandLine.h"
#include "corbel/cli/Output.h"

namespace corbel {

// A clock port that discovery found, with its PTP domain when the clock told it.
struct ClockPort {
    std::string item;
    std::optional<std::uint32_t> domain;
};

// What one command needs: its options, the output channels, the discovery wait of the
// run and the loaded expert (created on open, released when the context ends).
class CommandContext {
  public:
    explicit CommandContext(const Options& options);

    const Options& options() const { return options_; }
    const Output& out() const { return output_; }
    IkxSysExpert2& expert() const { return session_->expert(); }
    const std::string& libraryPath() const { return session_->libraryPath(); }
    ItemReader reader() const { return ItemReader(expert()); }

    // Passes the run's choices to the expert (trace, interfaces), loads it and, for
    // commands that talk to clocks, opens its network side. On failure it has reported
    // why and `failed` is the exit code.
    bool open(bool network, ExitCode& failed);

    // Discovers the clock ports and reads each one's domain, keeping those of --domain.
    // With none, it has reported why and `failed` is the exit code; a clock that does not
    // tell its domain is reported and makes `failed` kFailed, and is kept without --domain.
    std::vector<ClockPort> discover(const std::string& purpose, ExitCode& failed) const;

    // Reports a failure of the expert, `what` first, then the reason in words (with the
    // internal numbers under --verbose); returns its exit code.
    ExitCode report(const std::string& what, const FailureCause& cause,
                    nlohmann::ordered_json details = nlohmann::ordered_json::object()) const;

    // Reports what of a reading counts as a failure (ItemReading::outcome): the item that
    // cannot be had, or each reason for which tags were not read; returns the exit code.
    ExitCode reportReading(const ItemReading& reading, bool tagsNamed) const;

    // The word for an error kind in JSON ("not-found", "failed", ...).
    static const char* errorKind(ExitCode code);

  private:
    // Tells a user at a terminal that a discovery is coming and how long it waits. A named
    // item needs none: the expert asks for it by name.
    void announce(const std::string& purpose) const { wait_.announce(purpose.c_str()); }
    bool chooseInterfaces(ExitCode& failed) const;
    ExitCode reportNothingFound(const FailureCause& cause) const;

    Options options_;
    Output output_;
    DiscoveryWait wait_;
    std::unique_ptr<ExpertSession> session_;
};

}  // namespace corbel

#endif
