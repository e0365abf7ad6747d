#include "tarnhost/help.h"

#include <string>

#include "tarnhost/commands.h"

namespace TarnHost {
namespace {

constexpr size_t kWidth = 80;   // of every line of help
constexpr size_t kColumn = 32;  // where the summaries of the command list start

// `text` in lines of at most kWidth, each after `indent`; "\n" ends a
// paragraph.
std::string Wrap(const std::string& text, size_t indent) {
  std::string out, line;
  auto flush = [&] {
    if (!line.empty()) out += std::string(indent, ' ') + line + "\n";
    line.clear();
  };
  size_t start = 0;
  while (start <= text.size()) {
    const size_t end = std::min(text.find_first_of(" \n", start), text.size());
    const std::string word = text.substr(start, end - start);
    if (!word.empty()) {
      if (!line.empty() && indent + line.size() + 1 + word.size() > kWidth) flush();
      line += (line.empty() ? "" : " ") + word;
    }
    if (end < text.size() && text[end] == '\n') {
      flush();
      out += "\n";
    }
    start = end + 1;
  }
  flush();
  return out;
}

// `left`, then `right` from `column` on: on the same line when it fits.
std::string Columns(const std::string& left, const std::string& right, size_t column) {
  if (left.size() + 2 > column) return left + "\n" + std::string(column, ' ') + right + "\n";
  return left + std::string(column - left.size(), ' ') + right + "\n";
}

std::string Synopsis(const Command& c) {
  const std::string rest = c.syntax.Synopsis();
  return c.Name() + (rest.empty() ? "" : " " + rest);
}

}  // namespace

void PrintUsageLines(const std::vector<const Command*>& commands, std::FILE* stream) {
  const char* lead = "usage: ";
  for (const Command* c : commands) {
    std::fprintf(stream, "%starnhost %s\n", lead, Synopsis(*c).c_str());
    lead = "       ";
  }
}

void PrintHelp(const std::vector<const Command*>& commands, std::FILE* stream) {
  PrintUsageLines(commands, stream);
  for (const Command* c : commands) {
    std::string text = "\n" + c->Name() + ": " + c->summary + "\n" + Wrap(c->help, 2);
    size_t width = 0;
    std::vector<std::string> names;
    for (const auto& o : c->syntax.options) {
      names.push_back(o.Usage());
      width = std::max(width, names.back().size());
    }
    for (size_t i = 0; i < names.size(); ++i) {
      text += Columns("  " + names[i], c->syntax.options[i].help, width + 4);
    }
    Words also;
    for (const auto& spelling : c->also) also.push_back(Join(spelling, " "));
    if (!also.empty()) text += Wrap("Also spelled: " + Join(also, ", ") + ".", 2);
    std::fputs(text.c_str(), stream);
  }
}

void PrintTopUsage(std::FILE* stream) {
  std::string text =
      "usage: tarnhost COMMAND [ARGUMENTS]\n" +
      Wrap(
          "Administers the simulated host: the host file named by TARN_HOST_DB, or the default "
          "location; see 'tarnhost path'.",
          0) +
      "\n";
  for (const Command* c : Select({})) text += Columns("  " + Synopsis(*c), c->summary, kColumn);
  text +=
      "\n" + Wrap(
                 "'tarnhost help COMMAND' or 'tarnhost COMMAND --help' prints the help of a "
                 "command. Numbers are decimal. Options take their value as --opt VALUE or "
                 "--opt=VALUE; \"--\" ends the options. Exit status: 0 success, 1 refused by the "
                 "host, 2 bad usage.",
                 0);
  std::fputs(text.c_str(), stream);
}

int Help(const Args& args) {
  if (args.Positionals().empty()) {
    PrintTopUsage(stdout);
  } else {
    PrintHelp(SelectOrExplain(args.Positionals()), stdout);
  }
  return Print("");  // checks that it was written
}

int Version(const Args&) {
  return Print("tarnhost " TARNHOST_VERSION "\n");
}

}  // namespace TarnHost
