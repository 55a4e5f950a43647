#ifndef QV_CORBEL_SERVE_EXPERTCLOCKSOURCE_H
#define QV_CORBEL_SERVE_EXPERTCLOCKSOURCE_H

#include <qv1588/qv1588.h>

#include "corbel/ComPtr.h"
#include "corbel/serve/ClockSource.h"

namespace corbel {

// The clocks through the loaded expert, as every corbel face reads them: a discovery is
// Discovery::run, a read ItemReader's (one GetItemProperties per dataset), a write
// ValidateChanges then ApplyChanges on the item's own bag; why a call failed is its
// FailureCause.
class ExpertClockSource final : public ClockSource {
  public:
    explicit ExpertClockSource(IkxSysExpert2& expert) : expert_(expert) {}

    DiscoveryOutcome discover() override;
    ClockReading read(const std::string& item, const std::vector<std::size_t>& skipGroups,
                      bool withBase) override;
    WriteOutcome write(const std::string& item, const std::vector<Setting>& settings) override;

  private:
    // The item's own bag with `settings` as its changed tags; empty with `failure` set when
    // the item or a value cannot be had.
    ComPtr<IkxSysPropertyBag2> changeBag(const std::basic_string<OLECHAR>& item,
                                         const std::vector<Setting>& settings,
                                         FailureCause& failure) const;
    void reject(const std::basic_string<OLECHAR>& item, const std::vector<Setting>& settings,
                WriteOutcome& outcome) const;
    void apply(const std::basic_string<OLECHAR>& item, const std::vector<Setting>& settings,
               IkxSysPropertyBag2& bag, WriteOutcome& outcome) const;

    IkxSysExpert2& expert_;
};

}  // namespace corbel

#endif
