#ifndef QV_CORBEL_SERVE_BOUNDEDSOCKETSTREAM_H
#define QV_CORBEL_SERVE_BOUNDEDSOCKETSTREAM_H

#include <httplib.h>
#include <poll.h>

#include <array>
#include <chrono>
#include <cstddef>

namespace corbel {

// One accepted connection as the HTTP library reads and writes it, with the bounds that the
// library (0.11 as Debian ships it) does not keep by itself: it would read a header line of
// any length and any number of header lines into memory. Here the request line and the
// headers together end after kHeadBytes or kHeadLines lines (the library then sees the end
// of the stream and answers 400), each wait for data is bounded, and a whole request must
// arrive within kRequestTime.
class BoundedSocketStream final : public httplib::Stream {
  public:
    static constexpr std::size_t kHeadBytes = 8192;
    static constexpr std::size_t kHeadLines = 65;  // the request line and 64 headers
    static constexpr std::chrono::seconds kWait{5};
    static constexpr std::chrono::seconds kRequestTime{10};

    explicit BoundedSocketStream(int socket) : socket_(socket) {}

    // Waits up to `idle` for the first octet of the next request; false when none comes or
    // `running` turns false.
    template <typename Running>
    bool awaitRequest(std::chrono::milliseconds idle, Running running);
    // Starts the bounds of the next request.
    void beginRequest();
    // Reads and drops what the peer still sends, up to 64 KiB within 100 ms.
    void drain();
    // Whether a bound was hit or the peer went away: the connection must not be used again.
    bool spent() const { return spent_; }
    // The status of the last response written (from its status line).
    int lastStatus() const { return lastStatus_; }

    bool is_readable() const override { return begin_ < end_; }
    bool is_writable() const override;
    ssize_t read(char* data, size_t size) override;
    ssize_t write(const char* data, size_t size) override;
    void get_remote_ip_and_port(std::string& ip, int& port) const override;
    void get_local_ip_and_port(std::string& ip, int& port) const override;
    socket_t socket() const override { return socket_; }

  private:
    bool waitFor(short events, std::chrono::milliseconds limit) const;
    bool fill();
    void countHead(const char* data, std::size_t size);

    int socket_;
    std::array<char, 4096> buffer_{};
    std::size_t begin_ = 0, end_ = 0;
    std::chrono::steady_clock::time_point deadline_{};
    std::size_t headBytes_ = 0, headLines_ = 0;
    int headEnd_ = 0;  // how much of "\r\n\r\n" was seen last
    bool inHead_ = true, spent_ = false, statusPending_ = true;
    int lastStatus_ = 0;
};

template <typename Running>
bool BoundedSocketStream::awaitRequest(std::chrono::milliseconds idle, Running running) {
    const auto until = std::chrono::steady_clock::now() + idle;
    constexpr std::chrono::milliseconds kStep{200};  // how soon a stopping server is noticed
    while (begin_ == end_ && running()) {
        const auto left = std::chrono::duration_cast<std::chrono::milliseconds>(
            until - std::chrono::steady_clock::now());
        if (left.count() <= 0) {
            return false;
        }
        if (waitFor(POLLIN, std::min(left, kStep))) {
            return fill();
        }
    }
    return begin_ < end_;
}

}  // namespace corbel

#endif
