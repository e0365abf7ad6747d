#include "tarnctl/trace.h"

#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

#include "tarnctl/nodi_list.h"

namespace TarnCtl::Detail {

void AppendArg(std::string& line, const std::string& value) {
  line += '"';
  for (const char c : value) {
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      line += '\\';
      line += c;
    } else if (c == '\n') {
      line += "\\n";
    } else if (c == '\t') {
      line += "\\t";
    } else if (byte < 0x20 || byte == 0x7f) {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\x%02x", byte);
      line += escaped;
    } else {
      line += c;
    }
  }
  line += '"';
}

void AppendArg(std::string& line, const char* value) {
  AppendArg(line, std::string(value != nullptr ? value : ""));
}

void AppendArg(std::string& line, bool value) {
  line += value ? "true" : "false";
}

void AppendArg(std::string& line, int64_t value) {
  line += std::to_string(value);
}

void AppendArg(std::string& line, uint64_t value) {
  line += std::to_string(value);
}

void AppendArg(std::string& line, Out) {
  line += "out";
}

void AppendArg(std::string& line, const NODI_ParamList* list) {
  if (list == nullptr) {
    line += "null";
    return;
  }
  line += '[';
  for (size_t i = 0; i < list->values.size(); ++i) {
    if (i > 0) line += ", ";
    AppendArg(line, list->values[i]);
  }
  line += ']';
}

void AppendArg(std::string& line, const std::vector<std::string>& values) {
  line += '[';
  for (size_t i = 0; i < values.size(); ++i) {
    if (i > 0) line += ", ";
    AppendArg(line, values[i]);
  }
  line += ']';
}

void AppendArg(std::string& line, const HostCtl::Network::NicTeamingPolicy& policy) {
  const auto& criteria = policy.linkCriteria;
  line += '{' + FormatArgs(policy.flags, policy.balancing, policy.failback) + ", {" +
          FormatArgs(criteria.checkMask, criteria.minSpeed, criteria.errorPercent,
                     criteria.fullDuplex) +
          "}, " + FormatArgs(policy.uplinkOrder, policy.maxActive) + '}';
}

void AppendArg(std::string& line, const HostCtl::Network::DVPortParam& param) {
  line += '{' + FormatArgs(param.switchId, param.portId, param.connectionId) + '}';
}

void AppendArg(std::string& line, const HostCtl::Network::PortSecurityPolicy& policy) {
  line += '{' +
          FormatArgs(policy.allowPromiscuous, policy.allowMacChanges, policy.allowForgedTransmits) +
          '}';
}

void AppendArg(std::string& line, const HostCtl::Network::ShapingPolicy& policy) {
  line +=
      '{' +
      FormatArgs(policy.enabled, policy.averageBandwidth, policy.peakBandwidth, policy.burstSize) +
      '}';
}

void AppendArg(std::string& line, const HostCtl::Network::NicCapabilities& capabilities) {
  line += '{' + FormatArgs(capabilities.offloadBits, capabilities.reserved) + '}';
}

void WriteTraceLine(const std::string& line) {
  static std::string openPath;
  static int fd = -1;
  const char* path = std::getenv("TARN_TRACE");
  if (path == nullptr || *path == '\0') return;
  if (fd < 0 || openPath != path) {
    if (fd >= 0) close(fd);
    openPath = path;
    fd = open(path, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC, 0644);
    if (fd < 0) return;
  }
  const std::string whole = line + '\n';
  // One write keeps the line whole among concurrent writers; a short or
  // failed write only loses trace text.
  [[maybe_unused]] const ssize_t written = write(fd, whole.data(), whole.size());
}

}  // namespace TarnCtl::Detail
