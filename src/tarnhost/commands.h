// The bodies of tarnhost's commands: each runs one administration call on
// its parsed arguments (see table.cc), commits it, and returns the exit
// status. Bad usage throws UsageError; the host's refusals (and a failed
// commit) throw HostCtl::Lib::HostCtlException.
#pragma once

#include "tarnctl/admin/listing.h"
#include "tarnhost/args.h"

namespace TarnHost {

int Init(const Args& args);
int Show(const Args& args);
int Dump(const Args& args);
int Load(const Args& args);
int Reboot(const Args& args);
int Diff(const Args& args);
int SaveSnapshot(const Args& args);
int RestoreSnapshot(const Args& args);
int ListSnapshots(const Args& args);
int RemoveSnapshot(const Args& args);
int Try(const Args& args);
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
int RemovePnic(const Args& args);
int RemoveClient(const Args& args);
int RemoveSystemSwitch(const Args& args);
int RemoveDVSwitch(const Args& args);
int RemoveDVPort(const Args& args);
int RemoveOpaque(const Args& args);
int RemoveUplinkTimeout(const Args& args);
int RemoveLagTimeout(const Args& args);
int RemoveFault(const Args& args);
int ListOperations(const Args& args);

// Prints the rows of a list, a line each with its fields separated by tabs;
// given an argument, only the rows whose first field it is.
int PrintList(TarnCtl::Admin::Listing what, const Args& args);
template <TarnCtl::Admin::Listing what>
int List(const Args& args) {
  return PrintList(what, args);
}

// Writes `text` to standard output and returns 0; a failed write throws.
int Print(const std::string& text);

}  // namespace TarnHost
