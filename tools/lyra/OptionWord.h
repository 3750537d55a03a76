// Options whose value is one of a few words.
#ifndef ZOR_TOOLS_LYRA_OPTION_WORD_H
#define ZOR_TOOLS_LYRA_OPTION_WORD_H

#include <cstddef>
#include <span>
#include <string>

#include "lyra/CommandErrors.h"

namespace lyra {

/// What is said of a word that an option does not know.
UsageError UnknownWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown);

/// @return the place of a word among those that an option knows. Raises UsageError.
std::size_t ChosenWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown);

}  // namespace lyra

#endif
