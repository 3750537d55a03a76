// lyra_manual man|bash|zsh|fish: writes a paper about lyra to standard output. Runs when lyra is built.
#include <cstdio>
#include <exception>
#include <string>

#include "lyra/manual/CommandTable.h"

namespace {

int Write(const std::string& inText) {
  const bool isWritten = std::fwrite(inText.data(), 1, inText.size(), stdout) == inText.size() &&
                         std::fflush(stdout) == 0;
  return isWritten ? 0 : 1;
}

int WritePaper(const std::string& inKind) {
  const lyra::CommandTable table = lyra::TableOfCommand();
  if (inKind == "man") return Write(lyra::ManualPage(table));
  if (inKind == "bash") return Write(lyra::BashCompletion(table));
  if (inKind == "zsh") return Write(lyra::ZshCompletion(table));
  if (inKind == "fish") return Write(lyra::FishCompletion(table));
  std::fputs("usage: lyra_manual man|bash|zsh|fish\n", stderr);
  return 2;
}

}  // namespace

int main(int inCount, char** inArguments) {
  try {
    return WritePaper(inCount == 2 ? inArguments[1] : "");
  } catch (const std::exception& error) {
    std::fprintf(stderr, "lyra_manual: %s\n", error.what());
    return 1;
  }
}
