#include "tests/bench/BurstResponder.h"

#include <arpa/inet.h>
#include <netinet/in.h>
#include <poll.h>
#include <pthread.h>
#include <sys/socket.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <chrono>
#include <cstring>
#include <fstream>
#include <sstream>

#include "tests/support/Hex.h"
#include "tests/support/NetworkNamespaceEntry.h"

namespace qvtest {

namespace {

// Octet offsets in a management message (common header, then the management body).
constexpr std::size_t kDomain = 4;
constexpr std::size_t kSourcePort = 20;  // 8 octets clock identity, 2 octets port number
constexpr std::size_t kSequenceId = 30;
constexpr std::size_t kTargetPort = 34;
constexpr std::size_t kAction = 46;  // low nibble
constexpr std::size_t kManagementId = 52;
constexpr std::size_t kMinimumRequest = 54;
constexpr std::uint16_t kGeneralPort = 320;
constexpr const char* kGroup = "224.0.1.129";

std::vector<std::uint8_t> corpusAnswer(const std::string& name = "clock_description") {
    std::ifstream in(std::string(QV_SOURCE_DIR) + "/tests/data/corpus/ptp4l-mgmt-" + name + ".hex");
    std::stringstream text;
    text << in.rdbuf();
    return hexOctets(text.str());
}

// ptp4l's answers to the GETs of a read of every group, by the management id they answer:
// that of the management TLV, or the one an error status TLV names two octets later.
std::map<std::uint16_t, std::vector<std::uint8_t>> corpusReads() {
    std::map<std::uint16_t, std::vector<std::uint8_t>> answers;
    for (const char* name :
         {"clock_description", "default_data_set", "current_data_set", "parent_data_set",
          "time_properties_data_set", "port_data_set", "time-error", "utc_properties-error"}) {
        std::vector<std::uint8_t> answer = corpusAnswer(name);
        if (answer.size() >= kMinimumRequest + 2) {
            const std::size_t id =
                answer[kManagementId - 3] == 0x02 ? kManagementId + 2 : kManagementId;
            answers[static_cast<std::uint16_t>(answer[id] << 8 | answer[id + 1])] =
                std::move(answer);
        }
    }
    return answers;
}

bool isDiscovery(const std::uint8_t* m, std::size_t length) {
    if (length < kMinimumRequest || (m[0] & 0x0F) != 0x0D || (m[kAction] & 0x0F) != 0) {
        return false;
    }
    for (std::size_t i = 0; i < 10; ++i) {
        if (m[kTargetPort + i] != 0xFF) {
            return false;
        }
    }
    return m[kManagementId] == 0x00 && m[kManagementId + 1] == 0x01;
}

}  // namespace

BurstResponder::BurstResponder(std::string nameSpace, std::uint16_t clocks, std::uint16_t ports,
                               bool answerReads)
    : nameSpace_(std::move(nameSpace)), clocks_(clocks), ports_(ports), template_(corpusAnswer()) {
    if (answerReads) {
        reads_ = corpusReads();
    }
}

BurstResponder::~BurstResponder() {
    stop();
}

std::array<std::uint8_t, 8> BurstResponder::identityOf(std::uint16_t clock) {
    return {0x02,
            0x5C,
            0x00,
            0xFF,
            0xFE,
            0x00,
            static_cast<std::uint8_t>(clock >> 8),
            static_cast<std::uint8_t>(clock & 0xFF)};
}

bool BurstResponder::start(std::string& failure) {
    if (template_.size() < kMinimumRequest) {
        failure = "no clock description in the corpus";
        return false;
    }
    thread_ = std::thread([this] { run(); });
    while (ready_.load() == 0) {
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
    failure = failure_;
    return ready_.load() == 1;
}

double BurstResponder::cpuSeconds() const {
    clockid_t clock{};
    timespec used{};
    if (pthread_getcpuclockid(const_cast<std::thread&>(thread_).native_handle(), &clock) != 0 ||
        clock_gettime(clock, &used) != 0) {
        return 0;
    }
    return static_cast<double>(used.tv_sec) + static_cast<double>(used.tv_nsec) / 1e9;
}

void BurstResponder::stop() {
    stopping_.store(true);
    if (thread_.joinable()) {
        thread_.join();
    }
}

void BurstResponder::run() {
    NetworkNamespaceEntry entry(nameSpace_);
    socket_ = entry.entered() ? ::socket(AF_INET, SOCK_DGRAM, 0) : -1;
    int yes = 1;
    unsigned char no = 0;
    sockaddr_in local{};
    local.sin_family = AF_INET;
    local.sin_port = htons(kGeneralPort);
    local.sin_addr.s_addr = htonl(INADDR_ANY);
    ip_mreq group{};
    group.imr_multiaddr.s_addr = inet_addr(kGroup);
    if (socket_ < 0 || setsockopt(socket_, SOL_SOCKET, SO_REUSEADDR, &yes, sizeof yes) != 0 ||
        bind(socket_, reinterpret_cast<sockaddr*>(&local), sizeof local) != 0 ||
        setsockopt(socket_, IPPROTO_IP, IP_ADD_MEMBERSHIP, &group, sizeof group) != 0 ||
        setsockopt(socket_, IPPROTO_IP, IP_MULTICAST_LOOP, &no, sizeof no) != 0) {
        failure_ =
            "cannot listen in " + nameSpace_ + ": " + std::strerror(errno) + " " + entry.failure();
        ready_.store(-1);
        if (socket_ >= 0) {
            ::close(socket_);
        }
        return;
    }
    ready_.store(1);
    std::uint8_t datagram[1500];
    while (!stopping_.load()) {
        pollfd waiting{socket_, POLLIN, 0};
        if (poll(&waiting, 1, 100) <= 0) {
            continue;
        }
        const ssize_t length = recv(socket_, datagram, sizeof datagram, 0);
        if (length > 0 && isDiscovery(datagram, static_cast<std::size_t>(length))) {
            answer(datagram, static_cast<std::size_t>(length));
        } else if (length > 0 && !reads_.empty()) {
            answerRead(datagram, static_cast<std::size_t>(length));
        }
    }
    ::close(socket_);
}

void BurstResponder::answerRead(const std::uint8_t* request, std::size_t length) {
    const auto identity = identityOf(0);
    const auto clock =
        static_cast<std::uint16_t>(request[kTargetPort + 6] << 8 | request[kTargetPort + 7]);
    const auto port =
        static_cast<std::uint16_t>(request[kTargetPort + 8] << 8 | request[kTargetPort + 9]);
    const auto answer = reads_.find(
        static_cast<std::uint16_t>(request[kManagementId] << 8 | request[kManagementId + 1]));
    if (length < kMinimumRequest || (request[0] & 0x0F) != 0x0D || (request[kAction] & 0x0F) != 0 ||
        std::memcmp(&request[kTargetPort], identity.data(), 6) != 0 || clock >= clocks_ ||
        port == 0 || port > ports_ || request[kDomain] != clock % 4 || answer == reads_.end()) {
        return;
    }
    std::vector<std::uint8_t> reply = answer->second;
    std::memcpy(&reply[kSourcePort], &request[kTargetPort], 10);
    send(reply, request);
}

void BurstResponder::send(std::vector<std::uint8_t>& reply, const std::uint8_t* request) {
    sockaddr_in destination{};
    destination.sin_family = AF_INET;
    destination.sin_port = htons(kGeneralPort);
    destination.sin_addr.s_addr = inet_addr(kGroup);
    reply[kDomain] = request[kDomain];
    std::memcpy(&reply[kSequenceId], &request[kSequenceId], 2);
    std::memcpy(&reply[kTargetPort], &request[kSourcePort], 10);
    while (sendto(socket_, reply.data(), reply.size(), 0,
                  reinterpret_cast<const sockaddr*>(&destination), sizeof destination) < 0 &&
           (errno == ENOBUFS || errno == EAGAIN) && !stopping_.load()) {
        std::this_thread::sleep_for(std::chrono::microseconds(100));
    }
    sent_.fetch_add(1);
}

void BurstResponder::answer(const std::uint8_t* request, std::size_t /*length*/) {
    sockaddr_in destination{};
    destination.sin_family = AF_INET;
    destination.sin_port = htons(kGeneralPort);
    destination.sin_addr.s_addr = inet_addr(kGroup);
    std::vector<std::uint8_t> reply = template_;
    const std::uint8_t domain = request[kDomain];
    reply[kDomain] = domain;
    std::memcpy(&reply[kSequenceId], &request[kSequenceId], 2);
    std::memcpy(&reply[kTargetPort], &request[kSourcePort], 10);
    reply[kAction] = static_cast<std::uint8_t>((reply[kAction] & 0xF0) | 2);  // RESPONSE
    for (std::uint16_t clock = domain; clock < clocks_;
         clock = static_cast<std::uint16_t>(clock + 4)) {
        const auto identity = identityOf(clock);
        std::memcpy(&reply[kSourcePort], identity.data(), identity.size());
        for (std::uint16_t port = 1; port <= ports_; ++port) {
            reply[kSourcePort + 8] = static_cast<std::uint8_t>(port >> 8);
            reply[kSourcePort + 9] = static_cast<std::uint8_t>(port & 0xFF);
            // A full send queue is waited out rather than losing the answer.
            while (sendto(socket_, reply.data(), reply.size(), 0,
                          reinterpret_cast<const sockaddr*>(&destination),
                          sizeof destination) < 0 &&
                   (errno == ENOBUFS || errno == EAGAIN) && !stopping_.load()) {
                std::this_thread::sleep_for(std::chrono::microseconds(100));
            }
            sent_.fetch_add(1);
        }
    }
}

}  // namespace qvtest
