#include "tests/support/ptpmgmt/SimulatedNetwork.h"

#include "tests/support/FailingAllocation.h"

#include <new>

using nQVPTP000::tProtocolDataUnit;

namespace qvtest {

namespace {
constexpr const char* kComponent = "simnet";
constexpr const char* kFile = "SimulatedNetwork";
}  // namespace

void SimulatedNetwork::attach(SimulatedClock& clock) {
    std::lock_guard<std::mutex> guard(lock_);
    clocks_.push_back(&clock);
}

void SimulatedNetwork::open(tStatus& status) {
    if (status.failed()) {
        return;
    }
    abortRequested_.store(false);
    open_.store(true);
}

void SimulatedNetwork::close(tStatus&) {
    open_.store(false);
    arrivals_.wake();
}

void SimulatedNetwork::sendEventMessage(tProtocolDataUnit& unit, tStatus& status) {
    send(unit, status);
}

void SimulatedNetwork::sendGeneralMessage(tProtocolDataUnit& unit, tStatus& status) {
    send(unit, status);
}

// The clocks answer on the sending thread, outside the network's lock (each clock has its
// own), so that exchanges with different clocks run side by side. Running out of memory is
// reported as a transport would, with -52000.
void SimulatedNetwork::send(tProtocolDataUnit& unit, tStatus& status) {
    if (status.failed()) {
        return;
    }
    // The network and the clocks stand for other machines: a test that makes the client's
    // allocations fail does not reach theirs.
    const AllocationFailurePause otherMachines;
    try {
        std::vector<SimulatedClock*> clocks;
        {
            std::lock_guard<std::mutex> guard(lock_);
            if (!open_.load() || failNextSend_) {
                failNextSend_ = false;
                status.set(kStatusSocketError, kComponent, kFile, __LINE__);
                return;
            }
            sent_.emplace_back(unit.getBuffer(), unit.getBuffer() + unit.getLength());
            clocks = clocks_;
        }
        const auto sentAt = TimedDatagramQueue::tClock::now();
        for (SimulatedClock* clock : clocks) {
            for (SimulatedAnswer& answer :
                 clock->answer(unit.getBuffer(), static_cast<std::size_t>(unit.getLength()))) {
                arrivals_.push(std::move(answer.octets), sentAt + answer.delay);
            }
        }
    } catch (const std::bad_alloc&) {
        status.set(kStatusNoMemory, kComponent, kFile, __LINE__);
    }
}

void SimulatedNetwork::receive(tProtocolDataUnit& unit, tStatus& status) {
    unit.reset();
    if (status.failed()) {
        return;
    }
    std::vector<std::uint8_t> octets;
    const bool arrived =
        arrivals_.pop(octets, [this] { return abortRequested_.load() || !open_.load(); });
    if (!arrived) {
        if (abortRequested_.exchange(false)) {
            status.set(kStatusAborted, kComponent, kFile, __LINE__);
        } else {
            status.set(kStatusOsObjectError, kComponent, kFile, __LINE__);
        }
        return;
    }
    if (octets.size() > kMaxDatagram) {
        status.set(kStatusSocketError, kComponent, kFile, __LINE__);
        return;
    }
    unit.writeOctets(octets.data(), octets.size(), status);
}

void SimulatedNetwork::abortReceive(tStatus&) {
    abortRequested_.store(true);
    arrivals_.wake();
}

void SimulatedNetwork::inject(std::vector<std::uint8_t> octets, std::chrono::milliseconds delay) {
    arrivals_.push(std::move(octets), TimedDatagramQueue::tClock::now() + delay);
}

void SimulatedNetwork::failNextReceive() {
    inject(std::vector<std::uint8_t>(kMaxDatagram + 1, 0));
}

void SimulatedNetwork::failNextSend() {
    std::lock_guard<std::mutex> guard(lock_);
    failNextSend_ = true;
}

std::vector<std::vector<std::uint8_t>> SimulatedNetwork::sentDatagrams() const {
    std::lock_guard<std::mutex> guard(lock_);
    return sent_;
}

std::size_t SimulatedNetwork::sentCount() const {
    std::lock_guard<std::mutex> guard(lock_);
    return sent_.size();
}

}  // namespace qvtest
