// What whole runs of commands cost.
#ifndef ZOR_BENCH_START_TIMES_H
#define ZOR_BENCH_START_TIMES_H

#include <filesystem>
#include <string>
#include <vector>

#include "Measurement.h"

/// The path of the command, which is built into our folder.
std::string LyraBesideUs();

/// Wall times of whole runs of commands, in alternating order.
/// @return for each command one Steps a repeat, with the one step "run". Raises when a run fails.
std::vector<std::vector<Steps>> TimeCommands(
    const std::vector<std::vector<std::string>>& inCommands, int inRepeats);

/// The shared libraries for CAD models and pictures that a command loads, at its start or later.
/// @param inScratch directory for the loader's notes.
std::vector<std::string> HeavyLibrariesOf(const std::vector<std::string>& inCommand,
                                          const std::filesystem::path& inScratch);

#endif
