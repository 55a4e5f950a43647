#ifndef QV_CORBEL_PROCESSENVIRONMENT_H
#define QV_CORBEL_PROCESSENVIRONMENT_H

#include <string>

namespace corbel {

// This process's environment, through which a run's choices reach the expert library
// (QV_TRACE, QV_INTERFACES): set before the library is loaded and initialised, which is
// when it reads them. setenv on POSIX, _putenv_s on Windows.
class ProcessEnvironment {
  public:
    static void set(const char* name, const std::string& value);
};

}  // namespace corbel

#endif
