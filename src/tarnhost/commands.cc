#include "tarnhost/commands.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <optional>
#include <string>

#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "tarnctl/admin/host.h"
#include "tarnhost/args.h"

namespace TarnHost {
namespace {

using TarnCtl::Admin::Host;

// The whole file, or standard input for "-"; any failure names the file.
std::string ReadFile(const std::string& path) {
  const bool standardInput = path == "-";
  std::FILE* file = standardInput ? stdin : std::fopen(path.c_str(), "rb");
  auto fail = [&] {
    const int error = errno;
    if (file && !standardInput) std::fclose(file);
    return HostCtl::Lib::HostCtlException(
        "cannot read " + (standardInput ? std::string("standard input") : path) + ": " +
            std::strerror(error),
        "");
  };
  if (!file) throw fail();
  std::string text;
  char buffer[65536];
  size_t n;
  while ((n = std::fread(buffer, 1, sizeof buffer, file)) > 0) text.append(buffer, n);
  if (std::ferror(file)) throw fail();
  if (!standardInput) std::fclose(file);
  return text;
}

}  // namespace

// A failed write is the host tool's own failure (exit status 1), reported
// like a refusal.
int Print(const std::string& text) {
  std::fwrite(text.data(), 1, text.size(), stdout);
  if (std::fflush(stdout) != 0 || std::ferror(stdout)) {
    throw HostCtl::Lib::HostCtlException(
        std::string("cannot write to standard output: ") + std::strerror(errno), "");
  }
  return 0;
}

int Init(const Args& args) {
  Host().Init(args.Has("empty"));
  return 0;
}

int Show(const Args& args) {
  const bool json = args.Has("json"), dot = args.Has("dot");
  if (json && dot) throw UsageError("--json and --dot exclude each other");
  std::optional<std::string> name;
  if (!args.Positionals().empty()) name = args.Positional(0);
  if (name && !json) throw UsageError("NAME is shown with --json only");
  Host host;
  return Print(json ? host.ShowJson(name) : dot ? host.ShowDot() : host.Show());
}

int Dump(const Args&) {
  return Print(Host().Dump());
}

int Load(const Args& args) {
  const std::string text = ReadFile(args.Positional(0));
  Host().Load(text);
  return 0;
}

int Reboot(const Args&) {
  Host().Reboot();
  return 0;
}

int Path(const Args&) {
  return Print(TarnCtl::Admin::HostPath() + "\n");
}

int AddPnic(const Args& args) {
  Host().AddPnic(args.Positional(0));
  return 0;
}

int AddClient(const Args& args) {
  Host().AddClient(args.Positional(0), args.Positional(1));
  return 0;
}

int AddSystemSwitch(const Args& args) {
  int32_t ports = HostCtl::Network::Portset::DEF_NUM_PORTS;
  if (auto v = args.Value("ports")) ports = ParseInt32(*v, "--ports");
  Host().AddSystemSwitch(args.Positional(0), ports);
  return 0;
}

int AddDVSwitch(const Args& args) {
  TarnCtl::Admin::DVSwitchSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  seed.switchId = args.Value("id");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("mtu")) seed.mtu = ParseUint32(*v, "--mtu");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  Host().AddDVSwitch(seed);
  return 0;
}

int AddDVPort(const Args& args) {
  TarnCtl::Admin::DVPortSeed seed;
  seed.dvs = args.Positional(0);
  seed.portId = args.Positional(1);
  seed.clients = args.Values("client");
  if (auto v = args.Value("connection-id")) seed.connectionId = ParseUint32(*v, "--connection-id");
  Host().AddDVPort(seed);
  return 0;
}

int AddOpaque(const Args& args) {
  TarnCtl::Admin::OpaqueSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("used")) seed.used = ParseInt32(*v, "--used");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  Host().AddOpaqueSwitch(seed);
  return 0;
}

int AddUplinkTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(3), "TIMEOUT");
  Host().AddUplinkTimeout(args.Positional(0), args.Positional(1), lagId, timeout);
  return 0;
}

int AddLagTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(2), "TIMEOUT");
  Host().AddLagTimeout(args.Positional(0), lagId, timeout);
  return 0;
}

int AddFault(const Args& args) {
  TarnCtl::Admin::FaultSeed seed;
  seed.operation = args.Positional(0);
  seed.on = args.Value("on");
  seed.message = args.Value("message");
  seed.detail = args.Value("detail");
  if (auto v = args.Value("skip")) seed.skip = ParseInt64(*v, "--skip");
  if (auto v = args.Value("times")) seed.times = ParseInt64(*v, "--times");
  Host().AddFault(seed);
  return 0;
}

int ClearFaults(const Args&) {
  Host().ClearFaults();
  return 0;
}

}  // namespace TarnHost
