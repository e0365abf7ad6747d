// A fresh host database per test: TARN_HOST_DB points into a temporary
// directory of the test's own, and tracing is off unless a test turns it on.
#pragma once

#include <gtest/gtest.h>
#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>
#include <sstream>
#include <string>
#include <utility>
#include <vector>

#include "hostctl/exception.h"
#include "hostctl/tarnctl.h"
#include "tarnctl/admin/host.h"

class HostTest : public ::testing::Test {
 protected:
  void SetUp() override {
    char pattern[] = "/tmp/tarnctl-test-XXXXXX";
    ASSERT_NE(mkdtemp(pattern), nullptr);
    dir_ = pattern;
    path_ = dir_ + "/host.db";
    setenv("TARN_HOST_DB", path_.c_str(), 1);
    unsetenv("TARN_TRACE");
    unsetenv("TARN_LOCK_TIMEOUT");
  }

  void TearDown() override {
    unsetenv("TARN_HOST_DB");
    unsetenv("TARN_TRACE");
    unsetenv("TARN_LOCK_TIMEOUT");
    std::filesystem::remove_all(dir_);
  }

  // Turns the trace on into a file of the test's directory.
  void StartTrace() { setenv("TARN_TRACE", TracePath().c_str(), 1); }
  std::string TracePath() const { return dir_ + "/trace"; }
  std::vector<std::string> TraceLines() const {
    std::ifstream in(TracePath());
    std::vector<std::string> lines;
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }

  static std::string ReadFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::stringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
  }
  static void WriteFile(const std::string& path, const std::string& bytes) {
    std::ofstream(path, std::ios::binary) << bytes;
  }

  // Runs `body` in a child process; its exit status (or -1 on a signal).
  static int InChild(const std::function<int()>& body) {
    const pid_t pid = fork();
    if (pid == 0) {
      int status = 1;
      try {
        status = body();
      } catch (...) {
        status = 99;
      }
      _exit(status);
    }
    int status = 0;
    waitpid(pid, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  }

  // The message and the detailed message of the HostCtlException that
  // `body` throws (both "" when none).
  template <typename Body>
  static std::pair<std::string, std::string> Refused(Body body) {
    try {
      body();
    } catch (const HostCtl::Lib::HostCtlException& e) {
      return {e.GetMessage(), e.GetDetailedMessage()};
    }
    return {};
  }
  template <typename Body>
  static std::string Refusal(Body body) {
    return Refused(body).first;
  }

  static std::unique_ptr<HostCtl::Network::VirtualSwitch> Switch(const std::string& name) {
    return HostCtl::Network::NetworkFactory::GetVirtualSwitchById(
        name, HostCtl::Network::PORTSET_GET_DEFAULT);
  }
  static std::unique_ptr<HostCtl::Network::DVSwitch> Dvs(const std::string& name) {
    return HostCtl::Network::NetworkFactory::GetDVSwitchByName(name);
  }
  static void Reboot() { TarnCtl::Admin::Host().Reboot(); }

  // The sample host: the default host (vswitch0 on pnic0, port group
  // Management) plus
  //  - vs1 (64 ports) on pnic1 with port groups pg1 (clients vm-a, vm-b)
  //    and pg2;
  //  - dvs0 (portset dvs0-ps, id dvs-dvs0) on pnic2 with DVPorts 100
  //    (client vm-c, connection id 5) and 101;
  //  - the opaque switch op0 (portset op0-ps) holding pnic3;
  //  - pnic4, free.
  static void SeedSampleHost() {
    namespace HN = HostCtl::Network;
    TarnCtl::Admin::Host host;
    host.AddPnic("pnic4");
    TarnCtl::Network::VirtualSwitchInfoImpl info;
    auto vs1 = info.AddVirtualSwitch(
        HN::NicTeamingPolicy::GetDefaultPolicy(), HN::PortSecurityPolicy::GetDefaultPolicy(),
        HN::ShapingPolicy::GetDefaultPolicy(), HN::NicCapabilities::GetDefaultPolicy(), "vs1", 64);
    vs1->AddUplink("pnic1", true);
    vs1->AddPortGroup("pg1");
    vs1->AddPortGroup("pg2");
    host.AddClient("pg1", "vm-a");
    host.AddClient("pg1", "vm-b");
    TarnCtl::Admin::DVSwitchSeed dvs;
    dvs.name = "dvs0";
    dvs.portset = "dvs0-ps";
    dvs.switchId = "dvs-dvs0";
    dvs.uplinks = {"pnic2"};
    host.AddDVSwitch(dvs);
    host.AddDVPort({"dvs0", "100", {"vm-c"}, 5});
    host.AddDVPort({"dvs0", "101", {}, 0});
    TarnCtl::Admin::OpaqueSeed opaque;
    opaque.name = "op0";
    opaque.portset = "op0-ps";
    opaque.uplinks = {"pnic3"};
    host.AddOpaqueSwitch(opaque);
  }

  std::string dir_;
  std::string path_;
};
