#ifndef QV_CORBEL_COMMANDCONTEXT_H
#define QV_CORBEL_COMMANDCONTEXT_H

#include <qv1588/qv1588.h>

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "corbel/ComPtr.h"
#include "corbel/DiscoveryWait.h"
#include "corbel/ExitCode.h"
#include "corbel/ExpertSession.h"
#include "corbel/Output.h"

namespace corbel {

// The options that every command takes.
struct Options {
    std::string expertPath;                         // --expert
    std::optional<std::uint32_t> waitMilliseconds;  // --wait
    bool json = false;                              // --json
};

// What one command needs: the output channels, the discovery wait of the run and the
// loaded expert (created on open, released when the context ends).
class CommandContext {
  public:
    explicit CommandContext(const Options& options);

    const Output& out() const { return output_; }
    IkxSysExpert2& expert() const { return session_->expert(); }
    const std::string& libraryPath() const { return session_->libraryPath(); }

    // Loads the expert and, for commands that talk to clocks, opens its network side. On
    // failure it has reported why and `failed` is the exit code.
    bool open(bool network, ExitCode& failed);

    void announce(const char* purpose) const { wait_.announce(purpose); }

    // The item's base bag through GetItem, which runs a discovery for a name it does not
    // know; empty when there is none, with the reason reported and its exit code in `failed`.
    ComPtr<IkxSysPropertyBag> getItem(const std::string& item, ExitCode& failed) const;

    // Reports a failed item operation with the expert's reason for it (and `details` in
    // JSON); returns its exit code. Call it before the next expert operation.
    ExitCode reportFailure(HRESULT result, const std::string& what,
                           nlohmann::json details = nlohmann::json::object()) const;

  private:
    // Why the expert's last operation on this thread failed, when it says.
    std::string lastFailure() const;

    Output output_;
    DiscoveryWait wait_;
    std::unique_ptr<ExpertSession> session_;
    std::string expertPath_;
};

}  // namespace corbel

#endif
