#include <gtest/gtest.h>

#include "platform/tTrace.h"
#include "tests/support/TraceCapture.h"

using nQVTARN000::tTrace;

namespace {

// An object whose description traces a line of its own.
struct SelfTracing : nQVTARN000::iTraceable {
    void trace(tTrace& trace) const override {
        trace.beginLine("inner", 2, "b.cpp", 0, 0).append("inner").endLine();
    }
};

TEST(NestedTrace, ALineBegunInsideALockedLineCompletes) {
    qvtest::RecordingDestination destination;
    tTrace trace(&destination);
    trace.setFlag(tTrace::Flag::lockLines, true).setHeaderWidth(0);
    trace.beginLine("outer", 1, "a.cpp", 0, 0).append(SelfTracing()).append("after").endLine();
    EXPECT_EQ(destination.text(), "inner\nafter\n");
}

}  // namespace
