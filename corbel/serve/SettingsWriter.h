#ifndef QV_CORBEL_SERVE_SETTINGSWRITER_H
#define QV_CORBEL_SERVE_SETTINGSWRITER_H

#include <string>
#include <vector>

#include "corbel/serve/ClockSource.h"

namespace corbel {

// Who carries out a write for the API: the poller, which owns the expert.
class SettingsWriter {
  public:
    virtual ~SettingsWriter() = default;
    // Waits until the write is done.
    virtual WriteOutcome write(const std::string& item, std::vector<Setting> settings) = 0;
};

}  // namespace corbel

#endif
