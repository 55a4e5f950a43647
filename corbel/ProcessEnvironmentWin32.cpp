#include <cstdlib>

#include "corbel/ProcessEnvironment.h"

namespace corbel {

void ProcessEnvironment::set(const char* name, const std::string& value) {
    _putenv_s(name, value.c_str());
}

}  // namespace corbel
