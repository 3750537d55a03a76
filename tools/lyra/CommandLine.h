// What can be written on the command line.
#ifndef ZOR_TOOLS_LYRA_COMMAND_LINE_H
#define ZOR_TOOLS_LYRA_COMMAND_LINE_H

#include <CLI/CLI.hpp>
#include <string>
#include <vector>

#include "lyra/Verbs.h"

namespace lyra {

/// A verb's arguments as they are read, and what is then done with them.
struct DeclaredVerb {
  CLI::App* app;
  VerbAction act;
};

/// The one table of all verbs and options: the command line is read by it, help, manual page and
/// completions are written from it.
struct CommandLine {
  CommandLine();
  CommandLine(const CommandLine&) = delete;
  CommandLine& operator=(const CommandLine&) = delete;

  CLI::App app;
  std::string language;  ///< as given, "" for none
  OptionWords words;
  std::vector<DeclaredVerb> verbs;
};

}  // namespace lyra

#endif
