#include <gtest/gtest.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>
#include <string>
#include <thread>

#include "platform/CodePage.h"
#include "platform/LocalDateTime.h"
#include "platform/Mutex.h"
#include "platform/OutOfRange.h"
#include "platform/tTrace.h"
#include "tests/support/TraceCapture.h"

namespace {

TEST(EdgeCases, ThreadsSharingOneNamedMutexAreNeverInsideTogether) {
    qv::dsc::osdep::Mutex mutex("threads-" + std::to_string(getpid()));
    std::atomic<int> inside{0};
    std::atomic<int> overlaps{0};
    const auto work = [&] {
        for (int i = 0; i < 1000; ++i) {
            const qv::dsc::osdep::Mutex::Holder holder(mutex);
            overlaps += inside++ != 0 ? 1 : 0;
            std::this_thread::yield();
            --inside;
        }
    };
    { std::jthread first(work), second(work), third(work); }
    EXPECT_EQ(overlaps.load(), 0);
    std::filesystem::remove(mutex.path());
}

// Texts from clocks never fail a read. The program never calls setlocale: "" is ASCII here.
TEST(EdgeCases, InvalidNarrowTextBecomesReplacementCharacters) {
    EXPECT_EQ(qv::dsc::AnsiToWide("caf\xC3\xA9", ""), u"caf\uFFFD\uFFFD");
    // 0x81 0x20 is no double-byte code; the last 0x81 is cut short by the end.
    EXPECT_EQ(qv::dsc::AnsiToWide("a\x81 b\x81", "cp932"), u"a\uFFFD b\uFFFD");
}

// An object whose description traces a line of its own, inside a locked line.
struct SelfTracing : nQVTARN000::iTraceable {
    void trace(nQVTARN000::tTrace& trace) const override {
        trace.beginLine("inner", 2, "b.cpp", 0, 0).append("inner").endLine();
    }
};

TEST(EdgeCases, ATraceLineBegunInsideALockedLineCompletes) {
    qvtest::RecordingDestination destination;
    nQVTARN000::tTrace trace(&destination);
    trace.setFlag(nQVTARN000::tTrace::Flag::lockLines, true).setHeaderWidth(0);
    trace.beginLine("outer", 1, "a.cpp", 0, 0).append(SelfTracing()).append("after").endLine();
    EXPECT_EQ(destination.text(), "inner\nafter\n");
}

TEST(EdgeCases, YearTenThousandIsOutOfRange) {
    constexpr std::int64_t kYear10000 = 253402300800;  // 10000-01-01 00:00:00 UTC
    constexpr std::int64_t kDay = 86400;               // past any time zone's offset
    using qv::dsc::AbsTime;
    EXPECT_EQ(
        qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000 - kDay)).yearsSince1900,
        9999 - 1900);
    EXPECT_THROW(qv::dsc::AbsTimeToLocalDateTime(AbsTime::fromUnixSeconds(kYear10000 + kDay)),
                 qv::dsc::exception::OutOfRange);
}

}  // namespace
