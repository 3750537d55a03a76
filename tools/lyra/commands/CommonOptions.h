// Options that several verbs have.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_COMMON_OPTIONS_H
#define ZOR_TOOLS_LYRA_COMMANDS_COMMON_OPTIONS_H

#include <cstddef>
#include <span>
#include <string>
#include <vector>

#include "lyra/Arguments.h"
#include "lyra/CommandErrors.h"
#include "toolkit/records/ClashDocumentEdit.h"
#include "toolkit/records/RecordFilter.h"

namespace lyra {

using ZORToolkit::FilterOf;
using ZORToolkit::FilterOfConditions;
using ZORToolkit::FilterOptions;
using ZORToolkit::kStatusWords;
using ZORToolkit::kTypeWords;
using ZORToolkit::UnknownWord;

/// @return the place of a word among those that an option knows. Raises UsageError.
std::size_t ChosenWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown);

/// Makes a language that of the message catalogues for the rest of the process; the empty text
/// leaves it as the environment has it. A locale such as "fr_CA.UTF-8" is a language too. Raises
/// UsageError for a language that there are no catalogues of.
void ChooseLanguage(const std::string& inLanguage);

/// The document type, the style sheet and the XML declaration as options of a verb.
struct PrologueOptions : ZORToolkit::Prologue {
  void Declare(Arguments& ioArguments);
  /// Raises UsageError for what would make a document that is no XML.
  void Check() const;
};

}  // namespace lyra

#endif
