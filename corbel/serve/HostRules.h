#ifndef QV_CORBEL_SERVE_HOSTRULES_H
#define QV_CORBEL_SERVE_HOSTRULES_H

#include <string>
#include <string_view>
#include <vector>

#include "corbel/serve/ListenAddress.h"

namespace corbel {

// Which Host headers and Origins the server answers. A page of another site that has a
// name of its own resolve to this machine (DNS rebinding) sends that name as Host: only
// the listen address, the loopback names when listening on loopback, and the names given
// with --allow-host are accepted, with the listen port or none.
class HostRules {
  public:
    HostRules(const ListenAddress& listen, const std::vector<std::string>& allowHosts);

    bool allowsHost(std::string_view host) const;
    // An Origin header: "http://" and an allowed host.
    bool allowsOrigin(std::string_view origin) const;

  private:
    std::vector<std::string> names_;  // lower case; "name" or "name:port"
    std::string port_;
};

}  // namespace corbel

#endif
