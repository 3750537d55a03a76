// The papers that are written from the table of the command.
#ifndef ZOR_TOOLS_LYRA_MANUAL_PAPERS_H
#define ZOR_TOOLS_LYRA_MANUAL_PAPERS_H

#include <string>

#include "lyra/manual/CommandTable.h"

namespace lyra {

/// The manual page, in the macros of man(7).
std::string ManualPage(const CommandTable& inTable);

// What a shell reads to complete the command's words.
std::string BashCompletion(const CommandTable& inTable);
std::string ZshCompletion(const CommandTable& inTable);
std::string FishCompletion(const CommandTable& inTable);

}  // namespace lyra

#endif
