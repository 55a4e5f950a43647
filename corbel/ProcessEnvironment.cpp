#include "corbel/ProcessEnvironment.h"

#include <cstdlib>

namespace corbel {

void ProcessEnvironment::set(const char* name, const std::string& value) {
    setenv(name, value.c_str(), 1);
}

}  // namespace corbel
