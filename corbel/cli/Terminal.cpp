#include "corbel/cli/Terminal.h"

#include <unistd.h>

namespace corbel {

bool Terminal::isStandardOutput() {
    return isatty(STDOUT_FILENO) != 0;
}

}  // namespace corbel
