#include "corbel/serve/ServeCommand.h"

#include <csignal>
#include <cstdio>
#include <thread>

#include "corbel/serve/ExpertClockSource.h"
#include "corbel/serve/HttpServer.h"
#include "corbel/serve/Poller.h"

namespace corbel {

namespace {

ExitCode refuse(const std::string& message, ExitCode code = ExitCode::kBadUsage) {
    std::fprintf(stderr, "corbel serve: %s\n", message.c_str());
    return code;
}

// SIGINT and SIGTERM go to sigwait only: blocked here, before any thread starts, every
// thread inherits the mask.
sigset_t endSignals() {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGINT);
    sigaddset(&signals, SIGTERM);
    return signals;
}

std::string writesText(const ServeOptions& options, const AccessToken& token) {
    if (options.readOnly) {
        return "writes disabled (--read-only)";
    }
    switch (token.source()) {
        case AccessToken::Source::file:
            return "writes need the token of " + options.tokenFile;
        case AccessToken::Source::environment:
            return "writes need the token of CORBEL_SERVE_TOKEN";
        default:
            return "writes need the token " + token.value();
    }
}

}  // namespace

ExitCode runServe(const ServeOptions& options, const ExpertOpener& openExpert) {
    const auto listen = ListenAddress::parse(options.listen);
    if (!listen) {
        return refuse("--listen takes ADDR:PORT, e.g. 127.0.0.1:8588 or [::1]:8588, not '" +
                      options.listen + "'");
    }
    std::string failure;
    const auto token = AccessToken::load(options.tokenFile, failure);
    if (!token) {
        return refuse(failure);
    }
    if (!listen->isLoopback() && !token->configured() && !options.readOnly) {
        return refuse("listening on " + listen->text() +
                      ", which is not loopback, needs a token: --token-file FILE or the "
                      "environment variable CORBEL_SERVE_TOKEN (or --read-only)");
    }
    // Before the expert's receive thread starts, which inherits the mask.
    const sigset_t signals = endSignals();
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    std::signal(SIGPIPE, SIG_IGN);  // a client gone mid-answer is an error, not an end
    ExitCode failed = ExitCode::kNoExpert;
    IkxSysExpert2* expert = openExpert(failed);
    if (expert == nullptr) {
        pthread_sigmask(SIG_UNBLOCK, &signals, nullptr);
        return failed;
    }
    ServiceState state;
    ExpertClockSource source(*expert);
    Poller poller(
        source, state,
        {std::chrono::seconds(options.interval), std::chrono::seconds(options.rediscover)});
    const ServiceSettings settings{*listen, options.readOnly, static_cast<long>(options.interval),
                                   static_cast<long>(options.rediscover),
                                   std::chrono::system_clock::now()};
    const Api api(settings, *token, state, poller, options.allowHosts);
    HttpServer server(api, state.counters());
    if (!server.bind(listen->host, listen->port, failure)) {
        return refuse(failure, ExitCode::kFailed);
    }
    std::fprintf(stderr, "corbel serve: listening on http://%s, %s\n", listen->text().c_str(),
                 writesText(options, *token).c_str());
    if ((listen->host == "0.0.0.0" || listen->host == "::") && options.allowHosts.empty()) {
        std::fprintf(stderr,
                     "corbel serve: requests must name the server as %s; give the names that "
                     "clients use with --allow-host\n",
                     listen->text().c_str());
    }
    poller.start();
    std::thread http([&server] { server.serve(); });
    // A stop before the server runs would be lost.
    for (int i = 0; i < 500 && !server.is_running(); ++i) {
        std::this_thread::sleep_for(std::chrono::milliseconds(10));
    }
    int received = 0;
    sigwait(&signals, &received);
    std::fprintf(stderr, "corbel serve: stopping (%s)\n",
                 received == SIGINT ? "SIGINT" : "SIGTERM");
    server.stop();
    http.join();
    poller.stop();
    return ExitCode::kSuccess;
}

}  // namespace corbel
