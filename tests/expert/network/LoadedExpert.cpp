#include "tests/expert/network/LoadedExpert.h"

#include <dlfcn.h>

#include <cstdio>
#include <sstream>

namespace qvtest {

LoadedExpert::LoadedExpert() {
    library_ = ::dlopen(QV_EXPERT_LIBRARY, RTLD_NOW | RTLD_LOCAL);
    if (library_ == nullptr) {
        failure_ = ::dlerror();
        return;
    }
    create_ = reinterpret_cast<createCorbelExpertFunction>(::dlsym(library_, "createCorbelExpert"));
    if (create_ == nullptr) {
        failure_ = "no createCorbelExpert";
    }
}

LoadedExpert::~LoadedExpert() {
    if (library_ != nullptr) {
        ::dlclose(library_);
    }
}

std::map<std::string, std::string> pmcValues(const TestNetwork& network, const TestClock& clock,
                                             const std::string& managementId) {
    const CommandResult result = network.runInClient(
        "pmc -4 -i br0 -b 0 -d " + std::to_string(clock.domain) + " 'GET " + managementId + "'");
    std::map<std::string, std::string> values;
    std::istringstream lines(result.output);
    for (std::string line; std::getline(lines, line);) {
        std::istringstream words(line);
        std::string name;
        std::string value;
        if (line.starts_with("\t\t") && words >> name && std::getline(words >> std::ws, value)) {
            values[name] = value.substr(0, value.find_last_not_of(' ') + 1);
        }
    }
    return values;
}

std::u16string itemNameOf(const TestClock& clock) {
    char text[40];
    const auto& id = clock.identity;
    std::snprintf(text, sizeof text, "%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X:%u", id[0], id[1],
                  id[2], id[3], id[4], id[5], id[6], id[7], clock.portNumber);
    return std::u16string(text, text + std::char_traits<char>::length(text));
}

}  // namespace qvtest
