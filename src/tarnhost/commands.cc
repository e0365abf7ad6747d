#include "tarnhost/commands.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <sstream>

#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "tarnctl/admin/host.h"
#include "tarnhost/args.h"

namespace TarnHost {
namespace {

using TarnCtl::Admin::Host;

// Writes `text` to standard output; a failed write is the host tool's own
// failure (exit status 1), reported like a refusal.
int Print(const std::string& text) {
  std::fwrite(text.data(), 1, text.size(), stdout);
  if (std::fflush(stdout) != 0 || std::ferror(stdout)) {
    throw HostCtl::Lib::HostCtlException(
        std::string("cannot write to standard output: ") + std::strerror(errno), "");
  }
  return 0;
}

std::string ReadFile(const std::string& path) {
  auto fail = [&](const char* why) {
    return HostCtl::Lib::HostCtlException("cannot read " + path + ": " + why, "");
  };
  if (path == "-") {
    std::ostringstream text;
    text << std::cin.rdbuf();
    if (std::cin.bad()) throw fail(std::strerror(errno));
    return text.str();
  }
  std::ifstream in(path, std::ios::binary);
  if (!in) throw fail(std::strerror(errno));
  std::string text((std::istreambuf_iterator<char>(in)), std::istreambuf_iterator<char>());
  if (in.bad()) throw fail(std::strerror(errno));
  return text;
}

}  // namespace

int Init(const Words& words) {
  Args args(words, {{"empty", false}}, 0, 0);
  Host().Init(args.Has("empty"));
  return 0;
}

int Show(const Words& words) {
  Args(words, {}, 0, 0);
  return Print(Host().Show());
}

int Dump(const Words& words) {
  Args(words, {}, 0, 0);
  return Print(Host().Dump());
}

int Load(const Words& words) {
  Args args(words, {}, 1, 1);
  const std::string text = ReadFile(args.Positional(0));
  Host().Load(text);
  return 0;
}

int Reboot(const Words& words) {
  Args(words, {}, 0, 0);
  Host().Reboot();
  return 0;
}

int AddPnic(const Words& words) {
  Args args(words, {}, 1, 1);
  Host().AddPnic(args.Positional(0));
  return 0;
}

int AddClient(const Words& words) {
  Args args(words, {}, 2, 2);
  Host().AddClient(args.Positional(0), args.Positional(1));
  return 0;
}

int AddSystemSwitch(const Words& words) {
  Args args(words, {{"ports", true}}, 1, 1);
  int32_t ports = HostCtl::Network::Portset::DEF_NUM_PORTS;
  if (auto v = args.Value("ports")) ports = ParseInt32(*v, "--ports");
  Host().AddSystemSwitch(args.Positional(0), ports);
  return 0;
}

int AddDVSwitch(const Words& words) {
  Args args(words,
            {{"portset", true}, {"id", true}, {"ports", true}, {"mtu", true}, {"uplinks", true}}, 1,
            1);
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

int AddDVPort(const Words& words) {
  Args args(words, {{"client", true, true}, {"connection-id", true}}, 2, 2);
  TarnCtl::Admin::DVPortSeed seed;
  seed.dvs = args.Positional(0);
  seed.portId = args.Positional(1);
  seed.clients = args.Values("client");
  if (auto v = args.Value("connection-id")) seed.connectionId = ParseUint32(*v, "--connection-id");
  Host().AddDVPort(seed);
  return 0;
}

int AddOpaque(const Words& words) {
  Args args(words, {{"portset", true}, {"ports", true}, {"used", true}, {"uplinks", true}}, 1, 1);
  TarnCtl::Admin::OpaqueSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("used")) seed.used = ParseInt32(*v, "--used");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  Host().AddOpaqueSwitch(seed);
  return 0;
}

int AddUplinkTimeout(const Words& words) {
  Args args(words, {}, 4, 4);
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(3), "TIMEOUT");
  Host().AddUplinkTimeout(args.Positional(0), args.Positional(1), lagId, timeout);
  return 0;
}

int AddLagTimeout(const Words& words) {
  Args args(words, {}, 3, 3);
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(2), "TIMEOUT");
  Host().AddLagTimeout(args.Positional(0), lagId, timeout);
  return 0;
}

int AddFault(const Words& words) {
  Args args(words,
            {{"on", true}, {"message", true}, {"detail", true}, {"skip", true}, {"times", true}}, 1,
            1);
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

int ClearFaults(const Words& words) {
  Args(words, {}, 0, 0);
  Host().ClearFaults();
  return 0;
}

}  // namespace TarnHost
