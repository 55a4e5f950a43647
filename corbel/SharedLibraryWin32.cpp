#include <windows.h>

#include <filesystem>

#include "corbel/SharedLibrary.h"
#include "platform/WinError.h"

namespace corbel {

void* SharedLibrary::load(const std::string& path, std::string& error) {
    HMODULE library = LoadLibraryA(path.c_str());
    if (library == nullptr) {
        error = qv::dsc::osdep::WinError::messageOf(static_cast<int>(GetLastError()));
    }
    return reinterpret_cast<void*>(library);
}

void* SharedLibrary::find(void* library, const char* name) {
    return reinterpret_cast<void*>(GetProcAddress(static_cast<HMODULE>(library), name));
}

void SharedLibrary::release(void* library) {
    FreeLibrary(static_cast<HMODULE>(library));
}

std::string SharedLibrary::programFolder() {
    char path[MAX_PATH] = {};
    const DWORD length = GetModuleFileNameA(nullptr, path, MAX_PATH);
    const std::string program(path, length);
    const std::size_t separator = program.find_last_of("\\/");
    return separator == program.npos ? std::string() : program.substr(0, separator);
}

bool SharedLibrary::exists(const std::string& path) {
    std::error_code error;
    return std::filesystem::exists(path, error);
}

}  // namespace corbel
