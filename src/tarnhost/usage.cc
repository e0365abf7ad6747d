#include "tarnhost/usage.h"

namespace TarnHost {

void PrintUsage(std::FILE* stream) {
  std::fputs(
      "usage: tarnhost COMMAND [ARGUMENTS]\n"
      "Administers the simulated host kept in $TARN_HOST_DB (see docs/host.md).\n"
      "\n"
      "  init [--empty]        reset: the default host, or a host with nothing at all\n"
      "  show                  the host in readable form: running state and stored configuration\n"
      "  dump                  the whole host as JSON on standard output\n"
      "  load FILE             replace the host with a dump (FILE - : standard input)\n"
      "  reboot                drop the running state, keep the stored configuration\n"
      "  pnic add NAME\n"
      "  client add PORTGROUP CLIENT\n"
      "  system-switch add NAME [--ports N]\n"
      "  dvs add NAME [--portset NAME] [--id ID] [--ports N] [--mtu N] [--uplinks A,B,...]\n"
      "  dvport add DVS PORTID [--client NAME]... [--connection-id N]\n"
      "  opaque add NAME [--portset NAME] [--ports N] [--used N] [--uplinks A,B,...]\n"
      "  timeout uplink PORTSET UPLINK LAGID TIMEOUT\n"
      "  timeout lag PORTSET LAGID TIMEOUT\n"
      "  fault add OPERATION [--on NAME] [--message TEXT] [--detail TEXT] [--skip K] [--times N]\n"
      "  fault clear\n"
      "  -h, --help            this text\n"
      "\n"
      "Numbers are decimal. Options take their value as --opt VALUE or --opt=VALUE;\n"
      "\"--\" ends the options. Exit status: 0 success, 1 refused by the host, 2 bad usage.\n",
      stream);
}

}  // namespace TarnHost
