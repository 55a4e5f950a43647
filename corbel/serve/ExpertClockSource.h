#ifndef QV_CORBEL_SERVE_EXPERTCLOCKSOURCE_H
#define QV_CORBEL_SERVE_EXPERTCLOCKSOURCE_H

#include <qv1588/qv1588.h>

#include "corbel/ComPtr.h"
#include "corbel/serve/ClockSource.h"

namespace corbel {

// The clocks through the loaded expert: a discovery is GetItemNames, a read one
// GetItemProperties per group of tags (as corbel show reads), a write ValidateChanges then
// ApplyChanges on the item's own bag. Why a call failed comes from IkxQvLastFailure2.
class ExpertClockSource final : public ClockSource {
  public:
    explicit ExpertClockSource(IkxSysExpert2& expert) : expert_(expert) {}

    DiscoveryOutcome discover() override;
    ClockReading read(const std::string& item, const std::vector<std::size_t>& skipGroups,
                      bool withBase) override;
    WriteOutcome write(const std::string& item, const std::vector<Setting>& settings) override;

  private:
    // What the expert recorded for this thread's last call; `tag` where ApplyChanges stopped.
    ReadFailure lastFailure(kxSysAttributeTagID* tag = nullptr) const;
    // The item's own bag with its changed tags cleared; empty with `failure` set otherwise.
    ComPtr<IkxSysPropertyBag2> changeBag(const std::u16string& item, ReadFailure& failure) const;
    void reject(const std::u16string& item, const std::vector<Setting>& settings,
                WriteOutcome& outcome) const;
    void apply(const std::u16string& item, const std::vector<Setting>& settings,
               IkxSysPropertyBag2& bag, WriteOutcome& outcome) const;

    IkxSysExpert2& expert_;
};

}  // namespace corbel

#endif
