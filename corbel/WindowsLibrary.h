#ifndef QV_CORBEL_WINDOWSLIBRARY_H
#define QV_CORBEL_WINDOWSLIBRARY_H

#include <string>

namespace corbel {

// The system's library loader, behind a header without the system's types: those clash
// with the host header's own, so the code that speaks to the expert never sees them.
class WindowsLibrary {
  public:
    // Null on failure, with the system's text in `error`.
    static void* load(const std::string& path, std::string& error);
    static void* find(void* library, const char* name);
    static void release(void* library);
    // The folder of the running program, ending in a separator.
    static std::string programFolder();
};

}  // namespace corbel

#endif
