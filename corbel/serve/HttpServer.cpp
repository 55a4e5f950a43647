#include "corbel/serve/HttpServer.h"

#include <netinet/in.h>
#include <netinet/tcp.h>
#include <sys/socket.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "corbel/serve/BoundedSocketStream.h"
#include "corbel/serve/WorkerPool.h"

namespace corbel {

namespace {

HttpRequest requestOf(const httplib::Request& request) {
    HttpRequest ours{request.method, request.path, {}, {}, request.body};
    ours.query.insert(request.params.begin(), request.params.end());
    for (const auto& [name, value] : request.headers) {
        // The library adds these of its own; they are not the client's.
        if (name != "REMOTE_ADDR" && name != "REMOTE_PORT" && name != "LOCAL_ADDR" &&
            name != "LOCAL_PORT") {
            ours.headers.emplace_back(name, value);
        }
    }
    return ours;
}

void answer(const HttpResponse& ours, httplib::Response& response) {
    response.status = ours.status;
    for (const auto& [name, value] : ours.headers) {
        response.set_header(name, value);
    }
    response.set_header("X-Content-Type-Options", "nosniff");
    response.set_content(ours.body, ours.contentType);
}

}  // namespace

HttpServer::HttpServer(const Api& api, ServiceCounters& counters) : api_(api), counters_(counters) {
    new_task_queue = [] { return new WorkerPool(kWorkers, kQueued); };
    set_payload_max_length(kMaxBody);
    set_read_timeout(BoundedSocketStream::kWait);
    set_write_timeout(BoundedSocketStream::kWait);
    const auto handler = [this](const httplib::Request& request, httplib::Response& response) {
        answer(api_.handle(requestOf(request)), response);
    };
    // Every method and path goes to the Api, which knows the routes (404) and methods (405).
    Get(".*", handler);
    Post(".*", handler);
    Put(".*", handler);
    Patch(".*", handler);
    Delete(".*", handler);
    Options(".*", handler);
    // What the library answers by itself (400, 413, 414 ...) gets the API's JSON error.
    set_error_handler(HandlerWithResponse([](const httplib::Request&, httplib::Response& response) {
        if (!response.body.empty()) {
            return httplib::Server::HandlerResponse::Unhandled;  // the API's own answer
        }
        const int status = response.status;
        answer(Api::error(status, status == 413 ? "a request body may hold at most 16 KiB"
                                                : "malformed request, or its request line and "
                                                  "headers exceed 8 KiB or 64 fields"),
               response);
        return httplib::Server::HandlerResponse::Handled;
    }));
    set_exception_handler(
        [](const httplib::Request&, httplib::Response& response, std::exception_ptr) {
            answer(Api::error(500, "the request could not be answered"), response);
        });
    set_logger([this](const httplib::Request&, const httplib::Response& response) {
        counters_.countResponse(response.status);
    });
}

bool HttpServer::bind(const std::string& host, int port, std::string& failure) {
    port_ = port == 0 ? bind_to_any_port(host) : (bind_to_port(host, port) ? port : -1);
    if (port_ <= 0) {
        failure =
            "cannot listen on " + host + ":" + std::to_string(port) + ": " + std::strerror(errno);
        return false;
    }
    return true;
}

// The library's own loop would read without bounds: this one serves up to
// kRequestsPerConnection requests through a bounded stream, and ends the connection after
// an answer to a malformed request, whose rest cannot be trusted.
bool HttpServer::process_and_close_socket(socket_t socket) {
    // The library writes the status line and headers apart from the body: without this the
    // body would wait for the client's delayed acknowledgement (40 ms).
    const int noDelay = 1;
    ::setsockopt(socket, IPPROTO_TCP, TCP_NODELAY, &noDelay, sizeof noDelay);
    BoundedSocketStream stream(socket);
    bool served = true;
    for (int count = 0; count < kRequestsPerConnection; ++count) {
        const auto idle =
            std::chrono::duration_cast<std::chrono::milliseconds>(BoundedSocketStream::kWait);
        if (!stream.awaitRequest(idle, [this] { return is_running(); })) {
            break;
        }
        stream.beginRequest();
        bool closed = false;
        served = process_request(stream, count + 1 == kRequestsPerConnection, closed,
                                 [](httplib::Request&) {});
        const int status = stream.lastStatus();
        if (!served || closed || stream.spent() || status == 400 || status == 413 ||
            status == 414) {
            break;
        }
    }
    // What the client still sends is read and dropped for a moment: closing with unread
    // data would reset the connection and could lose the answer on its way.
    ::shutdown(socket, SHUT_WR);
    stream.drain();
    ::close(socket);
    return served;
}

}  // namespace corbel
