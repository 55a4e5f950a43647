#include "platform/tTrace.h"

#include <gtest/gtest.h>

#include <latch>
#include <map>
#include <string>
#include <thread>
#include <vector>

#include "tests/support/TraceCapture.h"

using nQVTARN000::tTrace;

namespace {

class tTraceTest : public ::testing::Test {
  protected:
    qvtest::RecordingDestination destination;
    tTrace trace{&destination};
};

std::string padded(const std::string& fields) {
    return fields + std::string(49 - fields.size(), '-') + "] ";
}

// The default header names component, line and file (without folders), padded with dashes
// to 49 characters or cut there; version and code follow when asked for; with no field at
// all the header is blank.
TEST_F(tTraceTest, HeaderFieldsAreJoinedPaddedAndCut) {
    trace.beginLine("qvptp3u", 105, "C:\\src/ptp\\factory.cpp", 105, 0).append("hello").endLine();
    EXPECT_EQ(destination.text(), padded("[qvptp3u--105--factory.cpp") + "hello\n");
    ASSERT_EQ(destination.pieces().size(), 1U);

    destination.clear();
    const std::string file = "tOrganizationExtensionTLVFactory.cpp";
    trace.beginLine("qvptp3u", 105, file.c_str(), 105, 0).endLine();
    EXPECT_EQ(destination.text(), ("[qvptp3u--105--" + file).substr(0, 49) + "] \n");

    destination.clear();
    trace.setFlag(tTrace::Flag::showVersion, true).setFlag(tTrace::Flag::showCode, true);
    trace.beginLine("c", 7, "f.cpp", -3, 0).endLine();
    EXPECT_EQ(destination.text(), padded("[c--v1.0--7--f.cpp---3") + "\n");

    destination.clear();
    for (auto flag : {tTrace::Flag::showComponent, tTrace::Flag::showLine, tTrace::Flag::showFile,
                      tTrace::Flag::showVersion, tTrace::Flag::showCode}) {
        trace.setFlag(flag, false);
    }
    trace.beginLine("c", 1, "f", 0, 0).append("x").endLine();
    EXPECT_EQ(destination.text(), std::string(49, ' ') + "x\n");
}

TEST_F(tTraceTest, OverlongFormattedTextIsAnnouncedAndCut) {
    const std::string big(2000, 'z');
    trace.appendFormatted("%s", big.c_str());
    trace.endLine();
    const std::string text = destination.text();
    const std::string notice = "!!Formatted string exceeds kMaxTraceLine characters!!";
    EXPECT_EQ(text, notice + std::string(1023, 'z') + "\n");
}

TEST_F(tTraceTest, NestingIndentsLinesBetweenOpenAndClose) {
    trace.setFlag(tTrace::Flag::showComponent, false)
        .setFlag(tTrace::Flag::showLine, false)
        .setFlag(tTrace::Flag::showFile, false)
        .setHeaderWidth(1);
    trace.beginLine("", 0, "", 0, tTrace::kOpenLevel).append("a").endLine();
    trace.beginLine("", 0, "", 0, tTrace::kNoNesting).append("b").endLine();
    trace.beginLine("", 0, "", 0, tTrace::kCloseLevel).append("c").endLine();
    trace.beginLine("", 0, "", 0, tTrace::kCloseLevel).append("d").endLine();
    EXPECT_EQ(destination.text(), "a\n  b\nc\nd\n");
}

// An object whose description traces a line of its own, inside a locked line.
struct SelfTracing : nQVTARN000::iTraceable {
    void trace(tTrace& trace) const override {
        trace.beginLine("inner", 2, "b.cpp", 0, 0).append("inner").endLine();
    }
};

TEST_F(tTraceTest, ALineBegunInsideALockedLineCompletes) {
    trace.setFlag(tTrace::Flag::lockLines, true).setHeaderWidth(0);
    trace.beginLine("outer", 1, "a.cpp", 0, 0).append(SelfTracing()).append("after").endLine();
    EXPECT_EQ(destination.text(), "inner\nafter\n");
}

// Keeps every piece and yields after each, so that other threads run between the pieces of
// a line, where a line shared between threads would be torn.
struct YieldingDestination final : nQVTARN000::iTraceDestination {
    void write(const char* text, std::size_t length) override { keep({text, length}); }
    void write(const char* text) override { keep(text); }
    bool isAvailable() const override { return listening; }
    void keep(std::string piece) {
        pieces.push_back(std::move(piece));
        std::this_thread::yield();
    }
    std::vector<std::string> pieces;
    bool listening = true;
};

// Lines that several threads write at once each arrive whole: a 352-character line as its
// two pieces, 253 characters and the rest, one right after the other.
TEST(tTraceThreadsTest, LinesOfSeveralThreadsArriveWhole) {
    constexpr int kThreads = 4;
    constexpr int kLines = 200;
    YieldingDestination destination;
    tTrace trace(&destination);
    {
        std::latch start(kThreads);
        std::vector<std::jthread> threads;  // joined as the block ends
        for (int t = 0; t < kThreads; ++t) {
            threads.emplace_back([&trace, &start, t] {
                const std::string body(300, static_cast<char>('a' + t));
                start.arrive_and_wait();
                for (int i = 0; i < kLines; ++i) {
                    trace.beginLine("qvptp3u", 1, "f.cpp", 0, 0).append(body.c_str()).endLine();
                }
            });
        }
    }
    ASSERT_EQ(destination.pieces.size(), 2U * kThreads * kLines);
    std::map<std::string, int> lines;
    for (std::size_t i = 0; i < destination.pieces.size(); i += 2) {
        EXPECT_EQ(destination.pieces[i].size(), tTrace::kMaxPiece);
        ++lines[destination.pieces[i] + destination.pieces[i + 1]];
    }
    for (int t = 0; t < kThreads; ++t) {
        const std::string body(300, static_cast<char>('a' + t));
        EXPECT_EQ(lines[padded("[qvptp3u--1--f.cpp") + body + "\n"], kLines) << body[0];
    }
}

// A destination that nobody reads gets nothing, and no line is even assembled for it.
TEST(tTraceThreadsTest, NothingIsAssembledWhenTheDestinationDoesNotListen) {
    struct Described : nQVTARN000::iTraceable {
        void trace(tTrace&) const override { ++descriptions; }
        mutable int descriptions = 0;
    } object;
    YieldingDestination deaf;
    deaf.listening = false;
    tTrace(&deaf).beginLine("c", 1, "f", 0, 0).append(object).appendFormatted("%d", 1).endLine();
    EXPECT_EQ(object.descriptions, 0);
    EXPECT_TRUE(deaf.pieces.empty());
}

}  // namespace
