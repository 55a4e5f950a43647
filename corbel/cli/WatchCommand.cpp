#include "corbel/ItemName.h"
#include "corbel/cli/CommandContext.h"
#include "corbel/cli/Commands.h"
#include "corbel/cli/StopSignal.h"
#include "corbel/cli/Watch.h"

// corbel watch [ITEM...]: the items named, or every clock, sampled until Ctrl-C or --count.

namespace corbel {

ExitCode runWatch(const Options& options, const std::vector<std::string>& items) {
    for (const std::string& item : items) {
        if (!isItemName(item)) {
            Output(options.json)
                .error("usage", "'" + item + "' is not an item name (such as " + kItemNameExample +
                                    "; corbel list shows them)");
            return ExitCode::kBadUsage;
        }
    }
    StopSignal::install();  // first: Ctrl-C during the discovery also ends cleanly
    CommandContext context(options);
    ExitCode failed = ExitCode::kSuccess;
    if (!context.open(true, failed)) {
        return failed;
    }
    Watch watch(context, options);
    if (const ExitCode started = watch.start(items); started != ExitCode::kSuccess) {
        return StopSignal::requested() ? ExitCode::kSuccess : started;
    }
    return watch.run();
}

}  // namespace corbel
