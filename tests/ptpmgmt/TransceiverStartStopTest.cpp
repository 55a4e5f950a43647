#include <gtest/gtest.h>

// The address-space limit that keeps a thread from starting exists on POSIX only.
#if !defined(_WIN32) && !defined(__SANITIZE_ADDRESS__) && !defined(__SANITIZE_THREAD__)
#define QV_THREAD_START_CAN_FAIL 1
#else
#define QV_THREAD_START_CAN_FAIL 0
#endif
#if QV_THREAD_START_CAN_FAIL
#include <sys/resource.h>
#include <unistd.h>
#endif

#include <atomic>
#include <chrono>
#include <condition_variable>
#include <cstdlib>
#include <fstream>
#include <mutex>
#include <thread>
#include <vector>

#include "ptp/transport/iPTPPortMessaging.h"
#include "ptpmgmt/tMgmtMsgTransceiver.h"
#include "tests/ptpmgmt/ClientTestSupport.h"
#include "tests/support/ptpmgmt/SimulatedNetwork.h"

using nQVPTP000::tManagementMessagePayload;
using nQVPTP000::tProtocolDataUnit;
using nQVPTPMGMT000::tMgmtMsgTransceiver;
using namespace std::chrono_literals;

namespace {

// A transport whose send blocks until released, and which notes whether it was closed while
// a send was still inside it (a socket closed under sendto).
class HeldSendTransport final : public nQVPTP000::iPTPPortMessaging {
  public:
    void open(tStatus&) override { aborted_ = false; }
    void close(tStatus&) override {
        ++closes_;
        if (sending_) {
            closedDuringSend_ = true;
        }
    }
    void sendEventMessage(tProtocolDataUnit&, tStatus&) override {}
    void sendGeneralMessage(tProtocolDataUnit&, tStatus&) override {
        sending_ = true;
        std::unique_lock<std::mutex> guard(lock_);
        released_.wait(guard, [this] { return release_; });
        sending_ = false;
    }
    void receive(tProtocolDataUnit&, tStatus& status) override {
        while (!aborted_) {
            std::this_thread::sleep_for(1ms);
        }
        QV_STATUS_SET(status, kStatusAborted, kComponentCodec);
    }
    void abortReceive(tStatus&) override { aborted_ = true; }
    nQVPTP000::tPortAddress getPortAddress() override { return {}; }

    void releaseSend() {
        {
            const std::lock_guard<std::mutex> guard(lock_);
            release_ = true;
        }
        released_.notify_all();
    }

    std::atomic<bool> sending_{false};
    std::atomic<int> closes_{0};
    std::atomic<bool> closedDuringSend_{false};

  private:
    std::atomic<bool> aborted_{false};
    std::mutex lock_;
    std::condition_variable released_;
    bool release_ = false;
};

// Starts the transceiver, holds a send inside the transport and runs `stoppers` stops at
// once; the send is released while they wait for it.
void stopDuringASend(int stoppers) {
    HeldSendTransport transport;
    tStatus status;
    tMgmtMsgTransceiver transceiver(&transport, qvtest::clientIdentity(), qvtest::kClientPort,
                                    status);
    transceiver.start(status);
    ASSERT_TRUE(status.succeeded());

    std::thread sender([&] {
        tStatus sendStatus;
        auto request = qvtest::nullRequest(tManagementMessagePayload::kGet);
        transceiver.sendRequest(*request, sendStatus);
    });
    while (!transport.sending_) {
        std::this_thread::sleep_for(1ms);
    }
    std::vector<std::thread> stops;
    for (int i = 0; i < stoppers; ++i) {
        stops.emplace_back([&] {
            tStatus stopStatus;
            transceiver.stop(stopStatus);
            EXPECT_TRUE(stopStatus.succeeded());
        });
    }
    // Long enough for an unguarded stop to reach close while the send is held.
    std::this_thread::sleep_for(100ms);
    EXPECT_EQ(transport.closes_, 0);
    transport.releaseSend();
    sender.join();
    for (std::thread& stop : stops) {
        stop.join();
    }
    EXPECT_EQ(transport.closes_, 1);
    EXPECT_FALSE(transport.closedDuringSend_);
    EXPECT_FALSE(transceiver.isRunning());
}

TEST(TransceiverShutdownTest, StopClosesTheTransportOnlyAfterASendInProgressHasFinished) {
    stopDuringASend(1);
}

TEST(TransceiverShutdownTest, TwoStopsAtOnceCloseTheTransportOnce) {
    stopDuringASend(2);
}

// Without room for a thread's stack the receive thread cannot start: start reports it and
// leaves the transport closed. The address space limit is set in a child process only.
#if QV_THREAD_START_CAN_FAIL
bool startFailsWithoutRoomForAThread() {
    qvtest::SimulatedNetwork network;
    tStatus status;
    tMgmtMsgTransceiver transceiver(&network, qvtest::clientIdentity(), qvtest::kClientPort,
                                    status);
    long pages = 0;
    std::ifstream("/proc/self/statm") >> pages;
    const rlimit tight{static_cast<rlim_t>(pages * sysconf(_SC_PAGESIZE)) + (1U << 20),
                       RLIM_INFINITY};
    setrlimit(RLIMIT_AS, &tight);
    transceiver.start(status);
    return status.code == kStatusOsObjectError && !network.isOpen() && !transceiver.isRunning();
}

TEST(TransceiverStartTest, AReceiveThreadThatCannotStartFailsStart) {
    // A fresh process: one that has run threads keeps their stacks for new ones.
    GTEST_FLAG_SET(death_test_style, "threadsafe");
    EXPECT_EXIT(std::_Exit(startFailsWithoutRoomForAThread() ? 0 : 1), ::testing::ExitedWithCode(0),
                "");
}
#endif

}  // namespace
