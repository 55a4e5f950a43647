#include "corbel/serve/BoundedSocketStream.h"

#include <arpa/inet.h>
#include <poll.h>
#include <sys/socket.h>

#include <algorithm>
#include <cstring>

namespace corbel {

namespace {

using Clock = std::chrono::steady_clock;

void addressOf(const sockaddr_storage& address, std::string& ip, int& port) {
    char text[INET6_ADDRSTRLEN] = {};
    if (address.ss_family == AF_INET) {
        sockaddr_in v4{};
        std::memcpy(&v4, &address, sizeof v4);
        inet_ntop(AF_INET, &v4.sin_addr, text, sizeof text);
        port = ntohs(v4.sin_port);
    } else if (address.ss_family == AF_INET6) {
        sockaddr_in6 v6{};
        std::memcpy(&v6, &address, sizeof v6);
        inet_ntop(AF_INET6, &v6.sin6_addr, text, sizeof text);
        port = ntohs(v6.sin6_port);
    }
    ip = text;
}

}  // namespace

void BoundedSocketStream::beginRequest() {
    deadline_ = Clock::now() + kRequestTime;
    headBytes_ = headLines_ = 0;
    headEnd_ = 0;
    inHead_ = true;
    statusPending_ = true;
}

bool BoundedSocketStream::waitFor(short events, std::chrono::milliseconds limit) const {
    pollfd waiting{socket_, events, 0};
    return ::poll(&waiting, 1, static_cast<int>(std::max<long>(limit.count(), 0))) > 0;
}

bool BoundedSocketStream::fill() {
    const ssize_t received = ::recv(socket_, buffer_.data(), buffer_.size(), 0);
    if (received <= 0) {
        spent_ = true;
        return false;
    }
    begin_ = 0;
    end_ = static_cast<std::size_t>(received);
    return true;
}

void BoundedSocketStream::drain() {
    const auto until = Clock::now() + std::chrono::milliseconds(100);
    std::size_t dropped = 0;
    while (dropped < 64 * 1024) {
        const auto left =
            std::chrono::duration_cast<std::chrono::milliseconds>(until - Clock::now());
        if (left.count() <= 0 || !waitFor(POLLIN, left)) {
            return;
        }
        const ssize_t received = ::recv(socket_, buffer_.data(), buffer_.size(), 0);
        if (received <= 0) {
            return;
        }
        dropped += static_cast<std::size_t>(received);
    }
}

bool BoundedSocketStream::is_writable() const {
    return !spent_ &&
           waitFor(POLLOUT, std::chrono::duration_cast<std::chrono::milliseconds>(kWait));
}

// The head ends with the first empty line; until then every octet and line counts.
void BoundedSocketStream::countHead(const char* data, std::size_t size) {
    static constexpr char kEnd[] = "\r\n\r\n";
    for (std::size_t i = 0; i < size && inHead_; ++i) {
        ++headBytes_;
        headLines_ += data[i] == '\n' ? 1 : 0;
        headEnd_ = data[i] == kEnd[headEnd_] ? headEnd_ + 1 : (data[i] == '\r' ? 1 : 0);
        inHead_ = headEnd_ < 4;
    }
}

ssize_t BoundedSocketStream::read(char* data, size_t size) {
    if (spent_ || (inHead_ && (headBytes_ >= kHeadBytes || headLines_ > kHeadLines))) {
        spent_ = true;
        return 0;  // the library takes the cut head for a malformed request: 400
    }
    if (begin_ == end_) {
        const auto left =
            std::chrono::duration_cast<std::chrono::milliseconds>(deadline_ - Clock::now());
        const auto limit =
            std::min(left, std::chrono::duration_cast<std::chrono::milliseconds>(kWait));
        if (limit.count() <= 0 || !waitFor(POLLIN, limit) || !fill()) {
            spent_ = true;
            return -1;
        }
    }
    std::size_t count = std::min(size, end_ - begin_);
    if (inHead_) {
        count = std::min(count, kHeadBytes - headBytes_);
        countHead(buffer_.data() + begin_, count);
    }
    std::memcpy(data, buffer_.data() + begin_, count);
    begin_ += count;
    return static_cast<ssize_t>(count);
}

ssize_t BoundedSocketStream::write(const char* data, size_t size) {
    if (statusPending_ && size >= 12 && std::strncmp(data, "HTTP/1.", 7) == 0) {
        lastStatus_ = std::atoi(std::string(data + 9, 3).c_str());
        statusPending_ = false;
    }
    std::size_t sent = 0;
    while (sent < size) {
        if (!waitFor(POLLOUT, std::chrono::duration_cast<std::chrono::milliseconds>(kWait))) {
            spent_ = true;
            return -1;
        }
        const ssize_t count = ::send(socket_, data + sent, size - sent, MSG_NOSIGNAL);
        if (count <= 0) {
            spent_ = true;
            return -1;
        }
        sent += static_cast<std::size_t>(count);
    }
    return static_cast<ssize_t>(size);
}

void BoundedSocketStream::get_remote_ip_and_port(std::string& ip, int& port) const {
    sockaddr_storage address{};
    socklen_t length = sizeof address;
    if (::getpeername(socket_, reinterpret_cast<sockaddr*>(&address), &length) == 0) {
        addressOf(address, ip, port);
    }
}

void BoundedSocketStream::get_local_ip_and_port(std::string& ip, int& port) const {
    sockaddr_storage address{};
    socklen_t length = sizeof address;
    if (::getsockname(socket_, reinterpret_cast<sockaddr*>(&address), &length) == 0) {
        addressOf(address, ip, port);
    }
}

}  // namespace corbel
