#ifndef QV_CORBEL_CLI_TERMINAL_H
#define QV_CORBEL_CLI_TERMINAL_H

#include <cstdio>
#include <string>

namespace corbel {

// Standard output when it is a terminal: where a live view may redraw itself in place.
// isatty on POSIX (Terminal.cpp); _isatty and the console's escape sequences on Windows
// (TerminalWin32.cpp).
class Terminal {
  public:
    // Whether standard output is a terminal that takes the escape sequences of redraw.
    static bool isStandardOutput();
    // Writes `frame` over the previous one: home, clear, then the frame.
    static void redraw(const std::string& frame) {
        std::fputs(("\x1b[H\x1b[2J" + frame).c_str(), stdout);
        std::fflush(stdout);
    }
};

}  // namespace corbel

#endif
