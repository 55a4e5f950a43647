#ifndef QV_CORBEL_SHAREDLIBRARY_H
#define QV_CORBEL_SHAREDLIBRARY_H

#include <string>

namespace corbel {

// The system's library loader: dlopen on POSIX (SharedLibrary.cpp), LoadLibrary on Windows
// (SharedLibraryWin32.cpp). The header has none of the system's types: on Windows those
// clash with the host header's own.
class SharedLibrary {
  public:
    // Null on failure, with the system's text in `error`.
    static void* load(const std::string& path, std::string& error);
    static void* find(void* library, const char* name);
    static void release(void* library);
    // The folder of the running program; empty when it cannot be told.
    static std::string programFolder();
    static bool exists(const std::string& path);
};

}  // namespace corbel

#endif
