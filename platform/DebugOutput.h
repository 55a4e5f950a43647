#ifndef QV_PLATFORM_DEBUGOUTPUT_H
#define QV_PLATFORM_DEBUGOUTPUT_H

namespace nQVTARN000 {

// Where trace lines end up: never the host's standard output. Silent by default; the
// environment variable QV_TRACE routes lines to standard error ("stderr") or appends them to
// the file it names. A program (a test) may install its own sink instead. On Windows
// (DebugOutputWin32.cpp) lines go to the debugger output (OutputDebugStringA).
using tDebugOutputSink = void (*)(const char* text, void* context);

void outputDebugString(const char* text);

// Whether a line written now would reach anyone: a sink is installed or QV_TRACE names a
// destination. On Windows always: a debugger or a monitor may take the debugger output at
// any time. Cheap, so that a trace can ask before it assembles a line.
bool debugOutputListens();

// Installs `sink` (null restores the environment's choice) and returns the previous one.
struct tDebugOutputTarget {
    tDebugOutputSink sink;
    void* context;
};
tDebugOutputTarget setDebugOutputSink(tDebugOutputTarget target);

}  // namespace nQVTARN000

#endif
