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

/// What is said of a word that an option does not know.
UsageError UnknownWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown);

/// @return the place of a word among those that an option knows. Raises UsageError.
std::size_t ChosenWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown);

/// Makes a language that of the message catalogues for the rest of the process; the empty text
/// leaves it as the environment has it. A locale such as "fr_CA.UTF-8" is a language too. Raises
/// UsageError for a language that there are no catalogues of.
void ChooseLanguage(const std::string& inLanguage);

inline constexpr const char* kTypeWords[] = {"clash", "contact", "clearance", "error"};
inline constexpr const char* kStatusWords[] = {"relevant", "irrelevant", "not-inspected", "error"};

/// As given; empty for no condition.
struct FilterOptions {
  std::vector<std::string> types;     ///< of kTypeWords in any letter case
  std::vector<std::string> statuses;  ///< of kStatusWords, likewise; also "not inspected"
  std::string result, product;
};

/// Raises UsageError for a word that is not known.
ZORToolkit::RecordFilter FilterOf(const FilterOptions& inOptions);
/// From conditions such as "type=clash,status=relevant": type, status, result and product, each as
/// the options of `lyra list` take it. Several words of one kind are alternatives. Raises UsageError.
ZORToolkit::RecordFilter FilterOfConditions(const std::vector<std::string>& inLists);

/// The document type, the style sheet and the XML declaration as options of a verb.
struct PrologueOptions : ZORToolkit::Prologue {
  void Declare(Arguments& ioArguments);
  /// Raises UsageError for what would make a document that is no XML.
  void Check() const;
};

}  // namespace lyra

#endif
