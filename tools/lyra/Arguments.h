// What a verb can be given on the command line.
#ifndef ZOR_TOOLS_LYRA_ARGUMENTS_H
#define ZOR_TOOLS_LYRA_ARGUMENTS_H

#include <map>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "toolkit/review/LanguageWords.h"

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace lyra {

/// The words that are worth offering for an option's value; what is read does not depend on them.
using OptionWords = std::map<const CLI::Option*, std::vector<std::string>>;

using ZORToolkit::kLanguages;

/// Declares the arguments of one verb. The variables are filled when the command line is read and
/// must live until then; what is not given leaves its variable as it is.
class Arguments {
 public:
  Arguments(CLI::App& ioApp, OptionWords& ioWords) : app_(ioApp), words_(ioWords) {}

  // Required, by position
  void Positional(const char* inName, std::string& outText, const char* inHelp);
  void Positionals(const char* inName, std::vector<std::string>& outTexts, const char* inHelp,
                   int inMinCount = 1);
  void PositionalNumber(const char* inName, long long& outNumber, const char* inHelp);

  // Optional, by name such as "--type" or "-o,--output"
  void Flag(const char* inNames, bool& outGiven, const char* inHelp);
  void Text(const char* inNames, const char* inValue, std::string& outText, const char* inHelp);
  /// May be given several times.
  void Texts(const char* inNames, const char* inValue, std::vector<std::string>& outTexts,
             const char* inHelp);
  /// Two words after one name; both or none.
  void TwoTexts(const char* inNames, const char* inValues, std::vector<std::string>& outTexts,
                const char* inHelp);
  void RequiredText(const char* inNames, const char* inValue, std::string& outText,
                    const char* inHelp);
  /// One that is given must not be empty, as for files.
  void NonEmptyText(const char* inNames, const char* inValue, std::string& outText,
                    const char* inHelp);
  void Number(const char* inNames, const char* inValue, std::optional<long long>& outNumber,
              const char* inHelp);
  /// The language of the message catalogues, for verbs that translate words of documents.
  void Language(std::string& outLanguage);

  /// The words that an option takes, which is declared already: "--type".
  void Words(const char* inName, std::span<const char* const> inWords);

 private:
  CLI::App& app_;
  OptionWords& words_;
};

}  // namespace lyra

#endif
