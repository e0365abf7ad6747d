// The bodies of tarnhost's commands: each takes the words after the
// command's own words, runs one administration call, and returns the exit
// status. Bad usage throws UsageError; the host's refusals throw
// HostCtl::Lib::HostCtlException.
#pragma once

#include <string>
#include <vector>

namespace TarnHost {

using Words = std::vector<std::string>;

int Init(const Words& words);
int Show(const Words& words);
int Dump(const Words& words);
int Load(const Words& words);
int Reboot(const Words& words);
int AddPnic(const Words& words);
int AddClient(const Words& words);
int AddSystemSwitch(const Words& words);
int AddDVSwitch(const Words& words);
int AddDVPort(const Words& words);
int AddOpaque(const Words& words);
int AddUplinkTimeout(const Words& words);
int AddLagTimeout(const Words& words);
int AddFault(const Words& words);
int ClearFaults(const Words& words);

}  // namespace TarnHost
