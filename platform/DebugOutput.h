#ifndef QV_PLATFORM_DEBUGOUTPUT_H
#define QV_PLATFORM_DEBUGOUTPUT_H

namespace nQVTARN000 {

// Where trace lines end up: never the host's standard output. Silent by default; the
// environment variable QV_TRACE routes lines to standard error ("stderr") or appends them to
// the file it names. A program (a test) may install its own sink instead. On Windows
// (DebugOutputWin32.cpp) lines go to the debugger output (OutputDebugStringA).
using tDebugOutputSink = void (*)(const char* text, void* context);

void outputDebugString(const char* text);

// Installs `sink` (null restores the environment's choice) and returns the previous one.
struct tDebugOutputTarget {
    tDebugOutputSink sink;
    void* context;
};
tDebugOutputTarget setDebugOutputSink(tDebugOutputTarget target);

}  // namespace nQVTARN000

#endif
