#ifndef QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDCLOCK_H
#define QV_TESTS_SUPPORT_PTPMGMT_SIMULATEDCLOCK_H

#include <chrono>
#include <cstdint>
#include <mutex>
#include <optional>
#include <vector>

#include "ptp/tClockIdentity.h"
#include "ptp/tManagementMessage.h"
#include "tests/support/ptp/InMemoryManagedClock.h"

namespace qvtest {

// One datagram that a simulated clock sends back, and how long after the request.
struct SimulatedAnswer {
    std::vector<std::uint8_t> octets;
    std::chrono::milliseconds delay{0};
};

// A PTP clock with ports 1 to N that answers management requests from an in-memory managed
// clock, as a real clock would, or in one of the faulty ways that the client must survive.
//
// It answers only management requests (GET, SET, COMMAND) in its domain (the managed
// clock's domainNumber, so that a SET of DOMAIN moves it) whose target names one of its
// ports or the wildcard (all-ones clock identity and/or port 0xFFFF; port 0xFFFF makes
// every port answer). Each answer goes to the request's source port identity from the
// answering port, with the request's sequenceId and domain, RESPONSE to GET and SET and
// ACKNOWLEDGE to COMMAND, and the payload that the request's TLV responds with.
//
// Thread-safe: every operation takes the clock's lock, so a responder thread may answer
// while a test changes the clock through `update`.
class SimulatedClock {
  public:
    enum class Fault {
        none,
        silent,             // never answers
        errorStatus,        // answers with a MANAGEMENT_ERROR_STATUS (GENERAL_ERROR)
        wrongAction,        // RESPONSE and ACKNOWLEDGE swapped
        wrongManagementId,  // a payload of another management id
        twice,              // every answer sent two times
        wrongTargetPort,    // addressed to the requester's port number + 1
        garbage,            // octets cut inside the message body: they do not decode
    };

    // The managed clock takes the identity and the domain; ports are numbered 1 to
    // `numberPorts`.
    explicit SimulatedClock(const nQVPTP000::tClockIdentity& identity,
                            std::uint16_t numberPorts = 1, std::uint8_t domainNumber = 0);
    SimulatedClock(const SimulatedClock&) = delete;
    SimulatedClock& operator=(const SimulatedClock&) = delete;

    // The answers to one received datagram (none for anything but a request to this clock).
    std::vector<SimulatedAnswer> answer(const std::uint8_t* octets, std::size_t length);

    void setFault(Fault fault) {
        std::lock_guard<std::mutex> guard(lock_);
        fault_ = fault;
    }
    // Requests of this management id are answered with MANAGEMENT_ERROR_STATUS
    // NOT_SUPPORTED, as ptp4l refuses TIME; the others as usual.
    void refuse(std::uint16_t managementId) {
        std::lock_guard<std::mutex> guard(lock_);
        refused_ = managementId;
    }
    // Every answer goes out this long after the request.
    void setDelay(std::chrono::milliseconds delay) {
        std::lock_guard<std::mutex> guard(lock_);
        delay_ = delay;
    }

    // Runs `change` on the managed clock under the clock's lock.
    template <typename Change>
    void update(Change&& change) {
        std::lock_guard<std::mutex> guard(lock_);
        change(managed_);
    }
    // Reads the managed clock under the clock's lock.
    template <typename Read>
    auto read(Read&& reader) const {
        std::lock_guard<std::mutex> guard(lock_);
        return reader(managed_);
    }

    // The managed clock without the lock: for tests whose answers come on their own thread
    // (SimulatedNetwork answers on the sending thread), between exchanges.
    InMemoryManagedClock& managed() { return managed_; }

    const nQVPTP000::tClockIdentity& identity() const { return identity_; }

  private:
    bool addressedToUs(const nQVPTP000::tManagementMessage& request) const;
    void answerAsPort(nQVPTP000::tManagementMessage& request, std::uint16_t port,
                      std::vector<SimulatedAnswer>& answers);
    std::unique_ptr<nQVPTP000::tManagementMessagePayload> payloadFor(
        nQVPTP000::tManagementMessage& request, std::uint16_t port, tStatus& status);

    const nQVPTP000::tClockIdentity identity_;
    const std::uint16_t numberPorts_;
    mutable std::mutex lock_;
    InMemoryManagedClock managed_;          // guarded by lock_
    Fault fault_ = Fault::none;             // guarded by lock_
    std::optional<std::uint16_t> refused_;  // guarded by lock_
    std::chrono::milliseconds delay_{0};
};

// The octets of a message as it goes on the wire (empty when it cannot be encoded).
std::vector<std::uint8_t> encodeMessage(const nQVPTP000::tPTPMessage& message);

// The message decoded from `octets`, or null.
std::unique_ptr<nQVPTP000::tManagementMessage> decodeManagement(
    const std::vector<std::uint8_t>& octets);

}  // namespace qvtest

#endif
