#include "lyra/Arguments.h"

#include <CLI/CLI.hpp>

namespace lyra {

void Arguments::Positional(const char* inName, std::string& outText, const char* inHelp) {
  app_.add_option(inName, outText, inHelp)->required()->type_name("");
}

void Arguments::Positionals(const char* inName, std::vector<std::string>& outTexts,
                            const char* inHelp, int inMinCount) {
  app_.add_option(inName, outTexts, inHelp)
      ->required()
      ->type_name("")
      ->expected(inMinCount, CLI::detail::expected_max_vector_size);
}

void Arguments::PositionalNumber(const char* inName, long long& outNumber, const char* inHelp) {
  app_.add_option(inName, outNumber, inHelp)->required()->type_name("");
}

void Arguments::Flag(const char* inNames, bool& outGiven, const char* inHelp) {
  app_.add_flag(inNames, outGiven, inHelp);
}

void Arguments::Text(const char* inNames, const char* inValue, std::string& outText,
                     const char* inHelp) {
  app_.add_option(inNames, outText, inHelp)->type_name(inValue);
}

void Arguments::Texts(const char* inNames, const char* inValue, std::vector<std::string>& outTexts,
                      const char* inHelp) {
  app_.add_option(inNames, outTexts, inHelp)
      ->type_name(inValue)
      ->expected(1)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
}

void Arguments::TwoTexts(const char* inNames, const char* inValues,
                         std::vector<std::string>& outTexts, const char* inHelp) {
  app_.add_option(inNames, outTexts, inHelp)->type_name(inValues)->expected(2);
}

void Arguments::RequiredText(const char* inNames, const char* inValue, std::string& outText,
                             const char* inHelp) {
  app_.add_option(inNames, outText, inHelp)->required()->type_name(inValue);
}

void Arguments::NonEmptyText(const char* inNames, const char* inValue, std::string& outText,
                             const char* inHelp) {
  Text(inNames, inValue, outText, inHelp);
  const std::string name = inNames;
  app_.get_option(name.substr(name.rfind(',') + 1))
      ->check(CLI::Validator(
          [](std::string& inText) { return inText.empty() ? "must not be empty" : ""; }, ""));
}

void Arguments::Number(const char* inNames, const char* inValue,
                       std::optional<long long>& outNumber, const char* inHelp) {
  app_.add_option(inNames, outNumber, inHelp)->type_name(inValue);
}

void Arguments::Language(std::string& outLanguage) {
  Text("--lang", "LANG", outLanguage,
       "Language of the document's words, such as en or fr (default: that of the system)");
  Words("--lang", kLanguages);
}

void Arguments::Words(const char* inName, std::span<const char* const> inWords) {
  words_[app_.get_option(inName)] = {inWords.begin(), inWords.end()};
}

}  // namespace lyra
