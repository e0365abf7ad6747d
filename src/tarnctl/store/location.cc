#include "tarnctl/store/location.h"

#include <unistd.h>

#include <cstdlib>

#include "hostctl/exception.h"

namespace TarnCtl::Store {

namespace {

bool Set(const char* value) {
  return value != nullptr && *value != '\0';
}

}  // namespace

Location ResolveLocation(const Environment& environment) {
  if (Set(environment.hostDb)) {
    const std::string path = environment.hostDb;
    if (path[0] == '~') {
      const std::string text =
          "TARN_HOST_DB=" + path +
          " starts with \"~\", which only a shell expands; write the full"
          " path (for example TARN_HOST_DB=$HOME" +
          path.substr(path.find('/') == std::string::npos ? path.size() : path.find('/')) + ")";
      throw HostCtl::Lib::HostCtlException(text, text);
    }
    return Location::File(path);
  }
  if (environment.root) return Location::File("/var/lib/tarnhost/host.db");
  if (Set(environment.stateHome) && environment.stateHome[0] == '/') {
    return Location::File(std::string(environment.stateHome) + "/tarnhost/host.db");
  }
  return Location::File(std::string(Set(environment.home) ? environment.home : ".") +
                        "/.local/state/tarnhost/host.db");
}

Environment ProcessEnvironment() {
  return {std::getenv("TARN_HOST_DB"), std::getenv("XDG_STATE_HOME"), std::getenv("HOME"),
          geteuid() == 0};
}

}  // namespace TarnCtl::Store
