// The language in which a document's words are understood.
#ifndef ZOR_TOOLS_LYRA_LANGUAGE_H
#define ZOR_TOOLS_LYRA_LANGUAGE_H

#include <string>

namespace lyra {

/// Makes a language that of the message catalogues for the rest of the process; the empty text
/// leaves it as the environment has it. A locale such as "fr_CA.UTF-8" is a language too. Raises
/// UsageError for a language that there are no catalogues of.
void ChooseLanguage(const std::string& inLanguage);

}  // namespace lyra

#endif
