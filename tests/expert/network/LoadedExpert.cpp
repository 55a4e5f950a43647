#include "tests/expert/network/LoadedExpert.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <sstream>
#include <thread>

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
    const CommandResult result =
        network.runInClient("pmc -4 -i " + clock.bridge + " -b 0 -d " +
                            std::to_string(clock.domain) + " 'GET " + managementId + "'");
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

std::vector<std::u16string> itemNames(IkxSysExpert2& expert) {
    std::vector<std::u16string> found;
    IkxSysEnumStringList* names = nullptr;
    if (expert.GetItemNames(&names) == S_OK) {
        for (BSTR name = nullptr; names->Next(1, &name, nullptr) == S_OK; SysFreeString(name)) {
            found.emplace_back(name);
        }
        names->Release();
    }
    return found;
}

HRESULT writeChanges(IkxSysExpert2& expert, const std::u16string& item, const tChange& change) {
    IkxSysPropertyBag* bag = nullptr;
    IkxSysPropertyBag2* changes = nullptr;
    const HRESULT found = expert.GetItem(item.c_str(), &bag);
    if (found != S_OK) {
        return found;
    }
    bag->QueryInterface(IID_IkxSysPropertyBag2, reinterpret_cast<void**>(&changes));
    changes->ClearChangedTags();
    change(*changes);
    IkxSysEnumPropertyTag* accepted = nullptr;
    BSTR message = nullptr;
    EXPECT_EQ(expert.ValidateChanges(nullptr, bag, &accepted, &message), S_OK);
    SysFreeString(message);
    if (accepted != nullptr) {
        accepted->Release();
    }
    const HRESULT result = expert.ApplyChanges(item.c_str(), bag, nullptr);
    changes->Release();
    bag->Release();
    return result;
}

std::vector<std::string> requestsSentDuring(const TestNetwork& network,
                                            const std::vector<std::string>& bridges,
                                            const std::function<void()>& action) {
    const std::string file = "/tmp/qv-expert-" + network.prefix() + "-";
    std::vector<std::thread> captures;
    for (const std::string& bridge : bridges) {
        captures.emplace_back([&network, &file, bridge] {
            network.runInClient("timeout 3 tcpdump -U -i " + bridge + " -w " + file + bridge +
                                " udp port 320");
        });
        for (int i = 0; i < 100 && runCommand("test -s " + file + bridge).exitStatus != 0; ++i) {
            std::this_thread::sleep_for(std::chrono::milliseconds(20));
        }
    }
    action();
    std::vector<std::string> requests;
    for (std::size_t i = 0; i < bridges.size(); ++i) {
        captures[i].join();
        requests.push_back(runCommand("tshark -r " + file + bridges[i] +
                                      " -Y 'ptp.v2.mm.action == 1 || ptp.v2.mm.action == 3' -T "
                                      "fields -e ptp.v2.mm.managementId 2>/dev/null; rm -f " +
                                      file + bridges[i])
                               .output);
    }
    return requests;
}

std::u16string itemNameOf(const TestClock& clock) {
    char text[40];
    const auto& id = clock.identity;
    std::snprintf(text, sizeof text, "%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X-%.2X:%u", id[0], id[1],
                  id[2], id[3], id[4], id[5], id[6], id[7], clock.portNumber);
    return std::u16string(text, text + std::char_traits<char>::length(text));
}

}  // namespace qvtest
