#include "house/Program.h"

#include <cstdio>
#include <sstream>
#include <stdexcept>

namespace house {
std::vector<std::string> LinesOf(const std::string& inCommand) {
  std::FILE* pipe = popen(inCommand.c_str(), "r");
  if (pipe == nullptr) throw std::runtime_error("cannot start: " + inCommand);
  std::string text;
  char block[4096];
  while (const std::size_t count = std::fread(block, 1, sizeof block, pipe)) {
    text.append(block, count);
  }
  if (pclose(pipe) != 0) throw std::runtime_error("failed: " + inCommand);

  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}
}  // namespace house
