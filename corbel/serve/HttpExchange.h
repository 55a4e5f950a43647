#ifndef QV_CORBEL_SERVE_HTTPEXCHANGE_H
#define QV_CORBEL_SERVE_HTTPEXCHANGE_H

#include <map>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace corbel {

// A request as the API sees it, whatever HTTP library read it.
struct HttpRequest {
    std::string method;  // "GET", "POST", ...
    std::string path;    // decoded, without the query
    std::multimap<std::string, std::string> query;
    std::vector<std::pair<std::string, std::string>> headers;
    std::string body;

    // The first header of that name in any case; empty when there is none.
    std::string header(std::string_view name) const;
    bool hasHeader(std::string_view name) const;
};

struct HttpResponse {
    int status = 200;
    std::string contentType;
    std::string body;
    std::vector<std::pair<std::string, std::string>> headers;  // besides Content-Type
};

}  // namespace corbel

#endif
