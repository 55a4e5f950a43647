#include <windows.h>
// After windows.h, which it needs.
#include <io.h>

#include "corbel/cli/Terminal.h"

namespace corbel {

bool Terminal::isStandardOutput() {
    if (_isatty(_fileno(stdout)) == 0) {
        return false;
    }
    // The console interprets escape sequences once asked to (Windows 10 and later).
    const HANDLE console = GetStdHandle(STD_OUTPUT_HANDLE);
    DWORD mode = 0;
    return GetConsoleMode(console, &mode) != 0 &&
           SetConsoleMode(console, mode | ENABLE_VIRTUAL_TERMINAL_PROCESSING) != 0;
}

}  // namespace corbel
