#include "corbel/ExpertSession.h"

// Windows backend: the library beside the program, loaded by the system's loader.

#include <filesystem>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/WindowsLibrary.h"

namespace corbel {

namespace {

std::vector<std::string> defaultCandidates() {
    std::vector<std::string> candidates{WindowsLibrary::programFolder() +
                                        QV_CORBEL_EXPERT_FROM_BINDIR};
#ifdef QV_CORBEL_EXPERT_BUILT
    candidates.emplace_back(QV_CORBEL_EXPERT_BUILT);
#endif
    return candidates;
}

}  // namespace

ExpertSession::ExpertSession(const std::string& libraryPath) {
    if (!libraryPath.empty()) {
        load(libraryPath);
        return;
    }
    for (const std::string& candidate : defaultCandidates()) {
        std::error_code error;
        if (std::filesystem::exists(candidate, error)) {
            load(candidate);
            return;
        }
    }
    failure_ = "no expert library at " + defaultLibraryPaths() + " (choose one with --expert PATH)";
}

void ExpertSession::load(const std::string& path) {
    path_ = path;
    std::string error;
    library_ = WindowsLibrary::load(path, error);
    if (library_ == nullptr) {
        failure_ = "cannot load the expert library: " + error;
        return;
    }
    auto* create = reinterpret_cast<createCorbelExpertFunction>(
        WindowsLibrary::find(library_, "createCorbelExpert"));
    if (create == nullptr) {
        failure_ = path + " exports no createCorbelExpert";
        return;
    }
    const HRESULT result = create(&expert_);
    if (FAILED(result) || expert_ == nullptr) {
        expert_ = nullptr;
        failure_ = "createCorbelExpert failed with " + hresultText(result);
    }
}

bool ExpertSession::initialize() {
    const HRESULT result = expert_->Initialize();
    initialized_ = SUCCEEDED(result);
    if (!initialized_) {
        failure_ = "the expert cannot open its network side (" + hresultText(result) +
                   "): it needs the UDP ports 319 and 320 and Windows Sockets";
    }
    return initialized_;
}

ExpertSession::~ExpertSession() {
    if (initialized_) {
        expert_->Shutdown();
    }
    if (expert_ != nullptr) {
        expert_->Release();
    }
    if (library_ != nullptr) {
        WindowsLibrary::release(library_);
    }
}

std::string ExpertSession::defaultLibraryPaths() {
    std::string paths;
    for (const std::string& candidate : defaultCandidates()) {
        paths += (paths.empty() ? "" : " or ") + candidate;
    }
    return paths;
}

}  // namespace corbel
