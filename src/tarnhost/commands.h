// The bodies of tarnhost's commands: each runs one administration call on
// its parsed arguments (see table.cc) and returns the exit status. Bad
// usage throws UsageError; the host's refusals throw
// HostCtl::Lib::HostCtlException.
#pragma once

#include "tarnhost/args.h"

namespace TarnHost {

int Init(const Args& args);
int Show(const Args& args);
int Dump(const Args& args);
int Load(const Args& args);
int Reboot(const Args& args);
int Path(const Args& args);
int AddPnic(const Args& args);
int AddClient(const Args& args);
int AddSystemSwitch(const Args& args);
int AddDVSwitch(const Args& args);
int AddDVPort(const Args& args);
int AddOpaque(const Args& args);
int AddUplinkTimeout(const Args& args);
int AddLagTimeout(const Args& args);
int AddFault(const Args& args);
int ClearFaults(const Args& args);

// Writes `text` to standard output and returns 0; a failed write throws.
int Print(const std::string& text);

}  // namespace TarnHost
