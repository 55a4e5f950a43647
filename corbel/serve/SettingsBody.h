#ifndef QV_CORBEL_SERVE_SETTINGSBODY_H
#define QV_CORBEL_SERVE_SETTINGSBODY_H

#include <string>
#include <string_view>
#include <vector>

#include "corbel/serve/ClockSource.h"

namespace corbel {

// The body of a write, {NAME: VALUE, ...}: NAME a settable tag's symbolic name (any case)
// and VALUE a JSON number, boolean or string as the tag's type needs (a time as ISO 8601
// UTC text). `error` says what is wrong otherwise, and `settings` is then empty.
struct SettingsBody {
    std::vector<Setting> settings;
    std::string error;

    static SettingsBody parse(std::string_view body);
};

}  // namespace corbel

#endif
