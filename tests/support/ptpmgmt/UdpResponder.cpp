#include "tests/support/ptpmgmt/UdpResponder.h"

using nQVPTP000::tProtocolDataUnit;

namespace qvtest {

UdpResponder::UdpResponder(std::vector<SimulatedClock*> clocks) : clocks_(std::move(clocks)) {}

UdpResponder::~UdpResponder() {
    stop();
}

void UdpResponder::start(tStatus& status) {
    if (receiver_.joinable() || status.failed()) {
        return;
    }
    stopping_.store(false);
    transport_.open(status);
    if (status.failed()) {
        tStatus scratch;
        transport_.close(scratch);
        return;
    }
    receiver_ = std::thread([this] { receiveLoop(); });
    sender_ = std::thread([this] { sendLoop(); });
}

void UdpResponder::stop() {
    if (!receiver_.joinable()) {
        return;
    }
    stopping_.store(true);
    tStatus scratch;
    transport_.abortReceive(scratch);
    late_.wake();
    receiver_.join();
    sender_.join();
    transport_.close(scratch);
    late_.clear();
}

void UdpResponder::receiveLoop() {
    tStatus status;
    tProtocolDataUnit unit(status);
    while (!stopping_.load()) {
        status.reset();
        transport_.receive(unit, status);
        if (status.failed()) {
            continue;  // an abort (stopping) or an oversized datagram: go on or leave
        }
        received_.fetch_add(1);
        const auto now = TimedDatagramQueue::tClock::now();
        for (SimulatedClock* clock : clocks_) {
            for (SimulatedAnswer& answer :
                 clock->answer(unit.getBuffer(), static_cast<std::size_t>(unit.getLength()))) {
                if (answer.delay.count() == 0) {
                    send(answer.octets);
                } else {
                    late_.push(std::move(answer.octets), now + answer.delay);
                }
            }
        }
    }
}

void UdpResponder::sendLoop() {
    std::vector<std::uint8_t> octets;
    while (late_.pop(octets, [this] { return stopping_.load(); })) {
        send(octets);
    }
}

void UdpResponder::send(std::vector<std::uint8_t>& octets) {
    tStatus status;
    tProtocolDataUnit unit(status);
    unit.writeOctets(octets.data(), octets.size(), status);
    transport_.sendGeneralMessage(unit, status);
    if (status.succeeded()) {
        sent_.fetch_add(1);
    }
}

}  // namespace qvtest
