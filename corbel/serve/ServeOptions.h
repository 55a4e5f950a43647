#ifndef QV_CORBEL_SERVE_SERVEOPTIONS_H
#define QV_CORBEL_SERVE_SERVEOPTIONS_H

#include <string>
#include <vector>

namespace corbel {

// What `corbel serve` is started with (corbel serve --help), besides the options of every
// command that talks to clocks (--expert, --wait, --interface, --verbose).
struct ServeOptions {
    std::string listen = "127.0.0.1:8588";  // --listen ADDR:PORT
    unsigned interval = 1;                  // --interval S
    unsigned rediscover = 30;               // --rediscover S
    bool readOnly = false;                  // --read-only
    std::string tokenFile;                  // --token-file FILE
    std::vector<std::string> allowHosts;    // --allow-host NAME, any number
};

}  // namespace corbel

#endif
