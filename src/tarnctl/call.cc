#include "tarnctl/call.h"

#include "tarnctl/faults.h"
#include "tarnctl/session.h"

namespace TarnCtl::Detail {

namespace {
const char* g_running = nullptr;
}  // namespace

Target Nothing() {
  return {};
}

Target On(const std::string& name) {
  return {name, {name}, ""};
}

Target On(const std::string& switchName, const std::string& portsetName) {
  return {switchName, {switchName, portsetName}, ""};
}

Target Named(const std::string& argument) {
  return {"", {argument}, ""};
}

Target Of(const std::string& record) {
  return {"", {record}, record + "::"};
}

Call::Call(Session* session, const char* operation, const Target& target, const std::string& args,
           OnFault onFault)
    : previous_(g_running) {
  g_running = operation;
  std::string line = target.scope + operation + '(' + args + ')';
  if (!target.on.empty()) line += " on " + target.on;
  WriteTraceLine(line);
  if (session == nullptr) return;
  try {
    auto fault = TakeFault(*session, operation, target.names);
    if (!fault) return;
    if (onFault == OnFault::kReport) {
      failed_ = true;
      return;
    }
    throw *fault;
  } catch (...) {
    g_running = previous_;
    throw;
  }
}

Call::~Call() {
  g_running = previous_;
}

const char* Call::Running() {
  return g_running;
}

}  // namespace TarnCtl::Detail
