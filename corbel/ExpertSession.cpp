#include "corbel/ExpertSession.h"

#include <dlfcn.h>
#include <unistd.h>

#include <filesystem>
#include <vector>

#include "corbel/ExitCode.h"

namespace corbel {

namespace {

std::vector<std::string> defaultCandidates() {
    std::error_code error;
    const auto program = std::filesystem::read_symlink("/proc/self/exe", error);
    std::vector<std::string> candidates;
    if (!error) {
        candidates.push_back(
            (program.parent_path() / QV_CORBEL_EXPERT_FROM_BINDIR).lexically_normal().string());
    }
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
        if (access(candidate.c_str(), F_OK) == 0) {
            load(candidate);
            return;
        }
    }
    failure_ = "no expert library at " + defaultLibraryPaths() + " (choose one with --expert PATH)";
}

void ExpertSession::load(const std::string& path) {
    path_ = path;
    library_ = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (library_ == nullptr) {
        failure_ = std::string("cannot load the expert library: ") + dlerror();
        return;
    }
    auto* create =
        reinterpret_cast<createCorbelExpertFunction>(dlsym(library_, "createCorbelExpert"));
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
        failure_ =
            "the expert cannot open the PTP ports (UDP 319 and 320 need root or "
            "CAP_NET_BIND_SERVICE; " +
            hresultText(result) + ")";
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
        dlclose(library_);
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
