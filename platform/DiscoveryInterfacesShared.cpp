#include <algorithm>
#include <cstdlib>

#include "platform/DiscoveryInterfaces.h"

// What both backends share: the variable before the stored value, and the choice. The stored
// value is read by DiscoveryInterfaces.cpp (settings file) or DiscoveryInterfacesWin32.cpp
// (registry).
namespace qv::dsc::osdep {

namespace {

constexpr std::string_view kSeparators = ", \t\r\n";

bool names(const std::string& word, const MulticastInterface& candidate) {
    return word == candidate.name || (word.find_first_not_of("0123456789") == std::string::npos &&
                                      word.size() < 10 && std::stoul(word) == candidate.index);
}

}  // namespace

std::string DiscoveryInterfaces::read() {
    const char* variable = std::getenv(kVariable);
    return variable != nullptr && *variable != '\0' ? std::string(variable) : readStored();
}

std::vector<MulticastInterface> DiscoveryInterfaces::choose(
    std::string_view setting, const std::vector<MulticastInterface>& available,
    std::string& unknown) {
    std::vector<std::string> words;
    for (std::size_t start = setting.find_first_not_of(kSeparators); start != setting.npos;) {
        const std::size_t end = setting.find_first_of(kSeparators, start);
        words.emplace_back(setting.substr(start, end - start));
        start = setting.find_first_not_of(kSeparators, end);
    }
    if (std::ranges::find(words, kAll) != words.end()) {
        return available;
    }
    std::vector<MulticastInterface> chosen;
    for (const std::string& word : words) {
        const auto match = [&word](const MulticastInterface& i) { return names(word, i); };
        if (std::ranges::none_of(available, match)) {
            unknown = word;
            return {};
        }
    }
    std::ranges::copy_if(available, std::back_inserter(chosen), [&words](const auto& i) {
        return std::ranges::any_of(words, [&i](const std::string& word) { return names(word, i); });
    });
    return chosen;
}

}  // namespace qv::dsc::osdep
