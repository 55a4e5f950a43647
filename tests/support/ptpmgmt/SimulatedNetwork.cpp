#include "tests/support/ptpmgmt/SimulatedNetwork.h"

#include <cerrno>
#include <new>

#include "platform/tStatusReason.h"
#include "tests/support/FailingAllocation.h"

using nQVPTP000::tProtocolDataUnit;

namespace qvtest {

void SimulatedNetwork::open(tStatus& status) {
    if (status.succeeded()) {
        abortRequested_.store(false);
        open_.store(true);
    }
}

// The clocks answer on the sending thread, outside the network's lock (each clock has its
// own), so that exchanges with different clocks run side by side. Running out of memory is
// reported as a transport would, with -52000.
void SimulatedNetwork::send(tProtocolDataUnit& unit, tStatus& status, tIndex via) {
    if (status.failed()) {
        return;
    }
    // The network and the clocks stand for other machines: a test that makes the client's
    // allocations fail does not reach theirs.
    const AllocationFailurePause otherMachines;
    try {
        std::vector<std::pair<SimulatedClock*, tIndex>> clocks;
        {
            std::lock_guard<std::mutex> guard(lock_);
            const bool fails = failingSends_ > 0 && sendsBeforeFailure_ == 0;
            if (!open_.load() || fails) {
                failingSends_ -= fails ? 1 : 0;
                status.set(kStatusSocketError, "simnet", "SimulatedNetwork", __LINE__);
                tStatusReason::systemCall(status, "sendto", ENETUNREACH);
                return;
            }
            sendsBeforeFailure_ -= sendsBeforeFailure_ > 0 ? 1 : 0;
            sent_.emplace_back(unit.getBuffer(), unit.getBuffer() + unit.getLength());
            sentVia_.push_back(via);
            clocks = clocks_;
        }
        const auto sentAt = tClock::now();
        for (const auto& [clock, on] : clocks) {
            if (via != nQVPTP000::kEveryInterface && on != nQVPTP000::kEveryInterface &&
                on != via) {
                continue;
            }
            for (SimulatedAnswer& answer :
                 clock->answer(unit.getBuffer(), static_cast<std::size_t>(unit.getLength()))) {
                push({std::move(answer.octets), on}, sentAt + answer.delay);
            }
        }
    } catch (const std::bad_alloc&) {
        status.set(kStatusNoMemory, "simnet", "SimulatedNetwork", __LINE__);
    }
}

void SimulatedNetwork::receive(tProtocolDataUnit& unit, tStatus& status) {
    unit.reset();
    if (status.failed()) {
        return;
    }
    tArrival arrival;
    if (!pop(arrival)) {
        status.set(abortRequested_.exchange(false) ? kStatusAborted : kStatusOsObjectError,
                   "simnet", "SimulatedNetwork", __LINE__);
    } else if (arrival.first.size() > kMaxDatagram) {
        status.set(kStatusSocketError, "simnet", "SimulatedNetwork", __LINE__);
    } else {
        lastInterface_ = arrival.second;
        unit.writeOctets(arrival.first.data(), arrival.first.size(), status);
    }
}

void SimulatedNetwork::inject(std::vector<std::uint8_t> octets, std::chrono::milliseconds delay) {
    push({std::move(octets), nQVPTP000::kEveryInterface}, tClock::now() + delay);
}

void SimulatedNetwork::failSends(std::size_t successes, std::size_t count) {
    std::lock_guard<std::mutex> guard(lock_);
    sendsBeforeFailure_ = successes;
    failingSends_ = count;
}

std::vector<std::vector<std::uint8_t>> SimulatedNetwork::sentDatagrams() const {
    std::lock_guard<std::mutex> guard(lock_);
    return sent_;
}

std::vector<SimulatedNetwork::tIndex> SimulatedNetwork::sentVia() const {
    std::lock_guard<std::mutex> guard(lock_);
    return sentVia_;
}

std::size_t SimulatedNetwork::queuedCount() const {
    std::lock_guard<std::mutex> guard(lock_);
    return arrivals_.size();
}

void SimulatedNetwork::push(tArrival arrival, tClock::time_point due) {
    {
        std::lock_guard<std::mutex> guard(lock_);
        arrivals_.emplace(due, std::move(arrival));  // after others due at the same time
    }
    changed_.notify_all();
}

bool SimulatedNetwork::pop(tArrival& arrival) {
    std::unique_lock<std::mutex> guard(lock_);
    while (!abortRequested_.load() && open_.load()) {
        if (arrivals_.empty()) {
            changed_.wait(guard);
        } else if (arrivals_.begin()->first > tClock::now()) {
            changed_.wait_until(guard, arrivals_.begin()->first);
        } else {
            arrival = std::move(arrivals_.begin()->second);
            arrivals_.erase(arrivals_.begin());
            return true;
        }
    }
    return false;
}

// Taking the lock first: a receive that has just seen the flags unchanged is waiting by
// the time the notification comes.
void SimulatedNetwork::wake() {
    { std::lock_guard<std::mutex> guard(lock_); }
    changed_.notify_all();
}

}  // namespace qvtest
