#include "StartTimes.h"

#include <fstream>
#include <regex>
#include <set>
#include <stdexcept>

#include "ChildProcess.h"
#include "ResultHash.h"

namespace {
double MillisecondsOf(const std::vector<std::string>& inCommand) {
  const ChildOutcome outcome = RunChild(inCommand);
  if (outcome.exitCode != 0) throw std::runtime_error(inCommand[0] + " failed");
  return outcome.milliseconds;
}
}  // namespace

std::vector<std::vector<Steps>> TimeCommands(
    const std::vector<std::vector<std::string>>& inCommands, int inRepeats) {
  std::vector<std::vector<Steps>> times(inCommands.size());
  for (const auto& command : inCommands) MillisecondsOf(command);  // from here on files are cached
  for (int repeat = 0; repeat < inRepeats; ++repeat)
    for (std::size_t i = 0; i < inCommands.size(); ++i) {
      const std::size_t turn = (i + static_cast<std::size_t>(repeat)) % inCommands.size();
      times[turn].push_back({{"run", MillisecondsOf(inCommands[turn]), 0, 0}});
    }
  return times;
}

std::string LyraBesideUs() {
  return std::filesystem::read_symlink("/proc/self/exe").parent_path() / "lyra";
}

Steps ListWithLyra(const Arguments& inArguments) {
  const ChildOutcome outcome = RunChild({LyraBesideUs(), "list", "--csv", inArguments.at(0)});
  if (outcome.exitCode != 0) throw std::runtime_error("lyra list failed");
  ResultHash hash;
  hash.Add(std::string_view(outcome.output));
  return {{"run", outcome.processorMilliseconds, outcome.peakMegabytes, hash.Value()}};
}

// The dynamic loader notes every library that it initialises, those opened while running too.
std::vector<std::string> HeavyLibrariesOf(const std::vector<std::string>& inCommand,
                                          const std::filesystem::path& inScratch) {
  std::vector<std::string> command = {"env", "LD_DEBUG=libs",
                                      "LD_DEBUG_OUTPUT=" + (inScratch / "loader").string()};
  command.insert(command.end(), inCommand.begin(), inCommand.end());
  MillisecondsOf(command);

  static const std::regex kInitialised("calling init: (.*)");
  static const std::regex kHeavy("lib(TK|embree|vtk|GL|EGL|OSMesa|freetype|X11|tbb)");
  std::set<std::string> heavy;
  std::size_t initialised = 0;
  for (const auto& entry : std::filesystem::directory_iterator(inScratch)) {
    if (!entry.path().filename().string().starts_with("loader.")) continue;
    std::ifstream notes(entry.path());
    for (std::string line; std::getline(notes, line);) {
      std::smatch match;
      if (!std::regex_search(line, match, kInitialised)) continue;
      ++initialised;
      const std::string library = std::filesystem::path(match[1].str()).filename();
      if (std::regex_search(library, kHeavy)) heavy.insert(library);
    }
  }
  if (initialised == 0) throw std::runtime_error("the loader noted no library");
  return {heavy.begin(), heavy.end()};
}
