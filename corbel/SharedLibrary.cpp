#include "corbel/SharedLibrary.h"

#include <dlfcn.h>
#include <unistd.h>

#include <filesystem>

namespace corbel {

void* SharedLibrary::load(const std::string& path, std::string& error) {
    void* library = dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL);
    if (library == nullptr) {
        error = dlerror();
    }
    return library;
}

void* SharedLibrary::find(void* library, const char* name) {
    return dlsym(library, name);
}

void SharedLibrary::release(void* library) {
    dlclose(library);
}

std::string SharedLibrary::programFolder() {
    std::error_code error;
    const auto program = std::filesystem::read_symlink("/proc/self/exe", error);
    return error ? std::string() : program.parent_path().string();
}

bool SharedLibrary::exists(const std::string& path) {
    return access(path.c_str(), F_OK) == 0;
}

}  // namespace corbel
