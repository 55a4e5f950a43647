#include "platform/OverridableSetting.h"

#include "platform/EnvironmentVariable.h"
#include "platform/SettingsStore.h"

namespace qv::dsc::osdep {

std::optional<std::uint32_t> OverridableSetting::readNumber() const {
    if (const std::optional<std::string> text = EnvironmentVariable::read(variable)) {
        if (const std::optional<std::uint32_t> number = SettingsStore::parseNumber(*text)) {
            return number;
        }
    }
    return SettingsStore(keyPath).readNumber(valueName);
}

std::optional<std::string> OverridableSetting::readText() const {
    if (std::optional<std::string> text = EnvironmentVariable::read(variable)) {
        return text;
    }
    return SettingsStore(keyPath).readText(valueName);
}

}  // namespace qv::dsc::osdep
