// The option loop. One table drives it: for every option its letter, long
// name, argument, checks, bit and argument handling. The long option list
// given to getopt_long and the letter-to-name map of the companion message
// are built from the same table.
#include "cli/options.h"

#include <getopt.h>

#include <cstdint>
#include <cstdlib>
#include <iostream>
#include <map>
#include <string>
#include <vector>

#include "cli/usage.h"
#include "hostctl/network.h"
#include "hostctl/uuid_text.h"

namespace Cli {

CommandOptions::CommandOptions() : numPorts(HostCtl::Network::Portset::DEF_NUM_PORTS) {}

namespace {

// 't' is accepted here but has no row: it ends in the usage text.
constexpr const char kShortOptions[] =
    "aWu:I:n:dlU:L:P:Q:V:rcp:v:hA:D:C:tTB:bM:N:m:X:xRyYfzZioOs:j:k:gGFS";

constexpr uint32_t kMaxVlanId = 4095;

// The text whose UUID form shows the expected format in the --uuid message.
constexpr const char kUuidFormatSample[] = "abcdefghijklmnop";

// An option that must have been read before the one being parsed.
struct Companion {
  CommandMask bits;
  const char* name;  // null: no companion
};

using ArgumentHandler = void (*)(CommandOptions& options, const char* argument);

struct OptionRow {
  char letter;
  const char* longName;
  int argument;                          // no_argument or required_argument
  bool oneCommand;                       // only allowed while the mask is empty
  Companion companions[2];               // checked in this order
  CommandMask bit;                       // kNoBit for -p, -V and -h
  std::string CommandOptions::*storeIn;  // keeps the argument as given, when set
  ArgumentHandler handle;                // runs after the store, when set
};

constexpr int kArg = required_argument;
constexpr int kNoArg = no_argument;
constexpr bool kCommand = true;
constexpr bool kModifier = false;
constexpr CommandMask kNoBit = 0;

void ConvertVlan(CommandOptions& options, const char* argument) {
  char* end = nullptr;
  options.vlanId = static_cast<uint32_t>(std::strtoul(argument, &end, 0));
  if (*end == '\0' && options.vlanId <= kMaxVlanId) return;
  std::cerr << "Invalid vlan id.  Vlan must be between 0-4095: " << argument << std::endl;
  std::exit(1);
}

void ConvertMaxActive(CommandOptions& options, const char* argument) {
  char* end = nullptr;
  options.maxActive = static_cast<int32_t>(std::strtol(argument, &end, 0));
  if (*end == '\0') return;
  std::cerr << "Invalid max active:" << argument << std::endl;
  std::exit(1);
}

void ConvertMtu(CommandOptions& options, const char* argument) {
  options.mtu = static_cast<uint16_t>(std::strtoul(argument, nullptr, 0));
}

void ConvertLagId(CommandOptions& options, const char* argument) {
  options.lagId = static_cast<uint32_t>(std::strtoul(argument, nullptr, 0));
}

void CheckUuid(CommandOptions&, const char* argument) {
  if (HostCtl::Text::IsValidUuidString(argument)) return;
  std::cerr << "Invalid UUID:" << argument << ". Should be of format "
            << HostCtl::Text::UuidToString(kUuidFormatSample) << std::endl;
  std::exit(1);
}

void AskForCdp(CommandOptions& options, const char*) {
  options.cdpStatus = "print";
}

[[noreturn]] void ShowHelp(CommandOptions&, const char*) {
  PrintUsage(0);
}

constexpr Companion kAfterAdd{Bit::kAdd, "add"};
constexpr Companion kAfterDvswitch{Bit::kDvswitch, "dvswitch"};
constexpr Companion kAfterActivateEns{Bit::kActivateEns, "activate-ens"};

// In the order getopt_long is given the long options. Columns: letter, long
// name, argument, one-command check, companions; then bit, field that keeps
// the argument as given, handler.
// clang-format off
constexpr OptionRow kOptionTable[] = {
    {'a', "add",                   kNoArg, kCommand,  {},
     Bit::kAdd,                 nullptr,                            nullptr},
    {'W', "dvswitch",              kNoArg, kModifier, {{Bit::kAdd | Bit::kDelete, "add or delete"}},
     Bit::kDvswitch,            nullptr,                            nullptr},
    {'u', "uuid",                  kArg,   kModifier, {kAfterAdd, kAfterDvswitch},
     Bit::kUuid,                &CommandOptions::uuidText,          CheckUuid},
    {'I', "impl-class",            kArg,   kModifier, {kAfterAdd, kAfterDvswitch},
     Bit::kImplClass,           &CommandOptions::implClass,         nullptr},
    {'n', "version",               kArg,   kModifier, {kAfterAdd, kAfterDvswitch},
     Bit::kVersion,             &CommandOptions::dvsVersion,        nullptr},
    {'d', "delete",                kNoArg, kCommand,  {},
     Bit::kDelete,              nullptr,                            nullptr},
    {'l', "list",                  kNoArg, kCommand,  {},
     Bit::kList,                nullptr,                            nullptr},
    {'L', "link",                  kArg,   kCommand,  {},
     Bit::kLink,                &CommandOptions::uplinkName,        nullptr},
    {'U', "unlink",                kArg,   kCommand,  {},
     Bit::kUnlink,              &CommandOptions::uplinkName,        nullptr},
    {'R', "restore-uplinks",       kNoArg, kCommand,  {},
     Bit::kRestoreUplinks,      nullptr,                            nullptr},
    {'r', "restore",               kNoArg, kCommand,  {},
     Bit::kRestore,             nullptr,                            nullptr},
    {'A', "add-pg",                kArg,   kCommand,  {},
     Bit::kAddPg,               &CommandOptions::portGroupName,     nullptr},
    {'D', "del-pg",                kArg,   kCommand,  {},
     Bit::kDelPg,               &CommandOptions::portGroupName,     nullptr},
    {'C', "check-pg",              kArg,   kCommand,  {},
     Bit::kCheckPg,             &CommandOptions::portGroupName,     nullptr},
    {'c', "check",                 kNoArg, kCommand,  {},
     Bit::kCheck,               nullptr,                            nullptr},
    {'p', "pg",                    kArg,   kModifier, {},
     kNoBit,                    &CommandOptions::portGroupName,     nullptr},
    {'v', "vlan",                  kArg,   kCommand,  {},
     Bit::kVlan,                nullptr,                            ConvertVlan},
    {'B', "set-cdp",               kArg,   kCommand,  {},
     Bit::kCdp,                 &CommandOptions::cdpStatus,         nullptr},
    {'b', "get-cdp",               kNoArg, kCommand,  {},
     Bit::kCdp,                 nullptr,                            AskForCdp},
    {'M', "add-pg-uplink",         kArg,   kCommand,  {},
     Bit::kAddPgUplink,         &CommandOptions::uplinkName,        nullptr},
    {'N', "del-pg-uplink",         kArg,   kCommand,  {},
     Bit::kDelPgUplink,         &CommandOptions::uplinkName,        nullptr},
    {'P', "add-dvp-uplink",        kArg,   kCommand,  {},
     Bit::kAddDvpUplink,        &CommandOptions::uplinkName,        nullptr},
    {'Q', "del-dvp-uplink",        kArg,   kCommand,  {},
     Bit::kDelDvpUplink,        &CommandOptions::uplinkName,        nullptr},
    {'V', "dvp",                   kArg,   kModifier, {},
     kNoBit,                    &CommandOptions::dvPortId,          nullptr},
    {'m', "mtu",                   kArg,   kCommand,  {},
     Bit::kMtu,                 nullptr,                            ConvertMtu},
    {'X', "set-maxactive",         kArg,   kCommand,  {},
     Bit::kSetMaxActive,        nullptr,                            ConvertMaxActive},
    {'x', "get-maxactive",         kNoArg, kCommand,  {},
     Bit::kGetMaxActive,        nullptr,                            nullptr},
    {'T', "test-sync-nota",        kNoArg, kCommand,  {},
     Bit::kTestSyncNota,        nullptr,                            nullptr},
    {'y', "activate-ens",          kNoArg, kModifier, {},
     Bit::kActivateEns,         nullptr,                            nullptr},
    {'Y', "deactivate-ens",        kNoArg, kModifier, {},
     Bit::kDeactivateEns,       nullptr,                            nullptr},
    {'z', "reassociate-ens",       kNoArg, kModifier, {},
     Bit::kReassociateEns,      nullptr,                            nullptr},
    {'Z', "ens-ready",             kNoArg, kModifier, {},
     Bit::kEnsReady,            nullptr,                            nullptr},
    {'f', "force-reassociate-ens", kNoArg, kModifier, {},
     Bit::kForceReassociateEns, nullptr,                            nullptr},
    {'i', "intr",                  kNoArg, kModifier, {kAfterActivateEns},
     Bit::kIntr,                nullptr,                            nullptr},
    {'F', "fast-switch",           kNoArg, kModifier, {kAfterActivateEns},
     Bit::kFastSwitch,          nullptr,                            nullptr},
    {'o', "get-lacp-timeout",      kNoArg, kCommand,  {},
     Bit::kGetLacpTimeout,      nullptr,                            nullptr},
    {'O', "load-lacp-timeout",     kNoArg, kCommand,  {},
     Bit::kLoadLacpTimeout,     nullptr,                            nullptr},
    {'s', "portset",               kArg,   kModifier, {},
     Bit::kPortset,             &CommandOptions::portsetName,       nullptr},
    {'j', "lagid",                 kArg,   kModifier, {},
     Bit::kLagId,               nullptr,                            ConvertLagId},
    {'k', "uplink",                kArg,   kModifier, {},
     Bit::kUplink,              &CommandOptions::timeoutUplinkName, nullptr},
    {'g', "get-lag-timeout",       kNoArg, kCommand,  {},
     Bit::kGetLagTimeout,       nullptr,                            nullptr},
    {'G', "load-lag-timeout",      kNoArg, kCommand,  {},
     Bit::kLoadLagTimeout,      nullptr,                            nullptr},
    {'S', "system",                kNoArg, kModifier, {{Bit::kList, "list"}},
     Bit::kSystem,              nullptr,                            nullptr},
    {'h', "help",                  kNoArg, kModifier, {},
     kNoBit,                    nullptr,                            ShowHelp},
};
// clang-format on

std::map<char, std::string> BuildOptionLongNames() {
  std::map<char, std::string> names;
  for (const OptionRow& row : kOptionTable) names.emplace(row.letter, row.longName);
  return names;
}

// Letter to long name, for the companion message.
const std::map<char, std::string> optionLongNames = BuildOptionLongNames();

std::vector<option> BuildLongOptions() {
  std::vector<option> options;
  for (const OptionRow& row : kOptionTable)
    options.push_back({row.longName, row.argument, nullptr, row.letter});
  options.push_back({nullptr, 0, nullptr, 0});
  return options;
}

const OptionRow* FindRow(int letter) {
  for (const OptionRow& row : kOptionTable)
    if (row.letter == letter) return &row;
  return nullptr;
}

// A command option must be the first option with a bit.
void EnsureSingleCommand(CommandMask mask) {
  if (mask == 0) return;
  std::cerr << "Error, only one command can be performed at a time." << std::endl;
  PrintUsage(1);
}

// Every required set lies in the low 32 bits, so only those are looked at.
void EnsureOptionGiven(CommandMask mask, CommandMask requiredBits, const std::string& requiredName,
                       const std::string& optionName) {
  if ((mask & requiredBits & 0xffffffffu) != 0) return;
  std::cerr << "Error, " << requiredName << " must be specified in order to use " << optionName
            << std::endl;
  PrintUsage(1);
}

void ApplyOption(const OptionRow& row, const char* argument, CommandOptions& options) {
  if (row.oneCommand) EnsureSingleCommand(options.mask);
  for (const Companion& companion : row.companions)
    if (companion.name != nullptr)
      EnsureOptionGiven(options.mask, companion.bits, companion.name,
                        optionLongNames.at(row.letter));
  options.mask |= row.bit;
  if (row.storeIn != nullptr) options.*row.storeIn = argument;
  if (row.handle != nullptr) row.handle(options, argument);
}

}  // namespace

CommandOptions ParseCommandLine(int argc, char** argv, int& firstOperand) {
  static const std::vector<option> longOptions = BuildLongOptions();
  CommandOptions options;
  optind = 0;  // full re-initialisation, so that a process may parse more than once
  int letter;
  while ((letter = getopt_long(argc, argv, kShortOptions, longOptions.data(), nullptr)) != -1) {
    const OptionRow* row = FindRow(letter);
    // 't', an unknown option and a missing argument (getopt_long has already
    // said which) end here.
    if (row == nullptr) PrintUsage(1);
    ApplyOption(*row, optarg, options);
  }
  firstOperand = optind;
  return options;
}

}  // namespace Cli
