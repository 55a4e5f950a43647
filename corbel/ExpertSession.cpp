#include "corbel/ExpertSession.h"

#include <filesystem>
#include <vector>

#include "corbel/ExitCode.h"
#include "corbel/SharedLibrary.h"

namespace corbel {

namespace {

std::vector<std::string> defaultCandidates() {
    const std::string folder = SharedLibrary::programFolder();
    std::vector<std::string> candidates;
    if (!folder.empty()) {
        candidates.push_back((std::filesystem::path(folder) / QV_CORBEL_EXPERT_FROM_BINDIR)
                                 .lexically_normal()
                                 .string());
    }
#ifdef QV_CORBEL_EXPERT_BUILT
    // The build tree's library, for the program in the build tree only: an installed copy
    // never names it.
    std::error_code error;
    if (!folder.empty() && std::filesystem::equivalent(folder, QV_CORBEL_BUILD_FOLDER, error)) {
        candidates.emplace_back(QV_CORBEL_EXPERT_BUILT);
    }
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
        if (SharedLibrary::exists(candidate)) {
            load(candidate);
            return;
        }
    }
    failure_ = "no expert library at " + defaultLibraryPaths() + " (choose one with --expert PATH)";
}

void ExpertSession::load(const std::string& path) {
    path_ = path;
    std::string error;
    library_ = SharedLibrary::load(path, error);
    if (library_ == nullptr) {
        failure_ = "cannot load the expert library: " + error;
        return;
    }
    auto* create = reinterpret_cast<createCorbelExpertFunction>(
        SharedLibrary::find(library_, "createCorbelExpert"));
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
        failure_ = "the expert cannot open the PTP ports";
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
        SharedLibrary::release(library_);
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
