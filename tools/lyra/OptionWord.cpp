#include "lyra/OptionWord.h"

#include <algorithm>

namespace lyra {

UsageError UnknownWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown) {
  std::string message = inOption + ": unknown word \"" + inWord + "\"; known are";
  const char* separator = " ";
  for (const char* const known : inKnown) {
    message.append(separator).append(known);
    separator = ", ";
  }
  return UsageError(message);
}

std::size_t ChosenWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown) {
  const auto found = std::find(inKnown.begin(), inKnown.end(), inWord);
  if (found == inKnown.end()) throw UnknownWord(inOption, inWord, inKnown);
  return static_cast<std::size_t>(found - inKnown.begin());
}

}  // namespace lyra
