#include "Port/CommandLine.h"

namespace Port {

namespace {

bool IsBlank(char c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

}  // namespace

std::size_t CommandLine::Split(std::string_view commandLine, std::vector<std::string>* arguments) {
  if (!arguments) return 0;
  arguments->clear();
  std::string current;
  bool inArgument = false;  // an argument has started, even if it is still empty (`""`)
  bool quoted = false;
  for (std::size_t i = 0; i < commandLine.size(); ++i) {
    char c = commandLine[i];
    if (quoted && c == '\\' && i + 1 < commandLine.size() && commandLine[i + 1] == '"') {
      current += '"';
      ++i;
    } else if (c == '"') {
      quoted = !quoted;
      inArgument = true;
    } else if (!quoted && IsBlank(c)) {
      if (inArgument) arguments->push_back(std::move(current));
      current.clear();
      inArgument = false;
    } else {
      current += c;
      inArgument = true;
    }
  }
  if (inArgument) arguments->push_back(std::move(current));
  return arguments->size();
}

}  // namespace Port
