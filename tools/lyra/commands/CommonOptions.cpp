#include "lyra/commands/CommonOptions.h"

#include <algorithm>
#include <cstdlib>
#include <span>
#include <sstream>

#include "lyra/Arguments.h"
#include "lyra/CommandErrors.h"
#include "toolkit/records/RecordFilter.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

void CheckWords(const std::vector<std::string>& inWords, const char* inOption,
                std::span<const char* const> inKnown) {
  for (const std::string& word : inWords) {
    const auto isWord = [&](const char* inKnownWord) {
      return ZORToolkit::WordKey(inKnownWord) == ZORToolkit::WordKey(word);
    };
    if (std::ranges::none_of(inKnown, isWord)) throw UnknownWord(inOption, word, inKnown);
  }
}

void CheckReference(const char* inOption, const std::string& inText) {
  for (char byte : inText)
    if (byte == '"' || static_cast<unsigned char>(byte) < ' ')
      throw UsageError(std::string(inOption) +
                       ": must not hold quotation marks or control characters");
  if (inText.find("?>") != std::string::npos)
    throw UsageError(std::string(inOption) + ": must not hold \"?>\"");
}

class OnlyConditions {
 public:
  void Add(const std::string& inCondition) {
    const std::size_t equals = inCondition.find('=');
    const std::string name = inCondition.substr(0, equals);
    const std::string word = equals == std::string::npos ? "" : inCondition.substr(equals + 1);
    if (word.empty())
      throw UsageError("--only: a condition is such as type=clash, not \"" + inCondition + "\"");
    if (name == "type")
      options_.types.push_back(word);
    else if (name == "status")
      options_.statuses.push_back(word);
    else if (name == "result")
      SetOnce(name, word, options_.result);
    else if (name == "product")
      SetOnce(name, word, options_.product);
    else
      throw UsageError("--only: unknown word \"" + name +
                       "\"; known are type, status, result, product");
  }
  ZORToolkit::RecordFilter Filter() const { return lyra::FilterOf(options_); }

 private:
  static void SetOnce(const std::string& inName, const std::string& inWord, std::string& ioText) {
    if (!ioText.empty()) throw UsageError("--only: " + inName + " is given twice");
    ioText = inWord;
  }
  FilterOptions options_;
};

}  // namespace

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

void ChooseLanguage(const std::string& inLanguage) {
  if (inLanguage.empty()) return;
  const std::string language =
      ZORToolkit::CaseFolded(inLanguage.substr(0, inLanguage.find_first_of("_-.@")));
  ChosenWord("--lang", language, kLanguages);
  setenv("ZOR_LANG", language.c_str(), 1);
}

ZORToolkit::RecordFilter FilterOf(const FilterOptions& inOptions) {
  CheckWords(inOptions.types, "--type", kTypeWords);
  CheckWords(inOptions.statuses, "--status", kStatusWords);
  ZORToolkit::RecordFilter filter;
  filter.SetTypes(inOptions.types);
  filter.SetStatuses(inOptions.statuses);
  if (!inOptions.result.empty()) filter.SetResult(inOptions.result);
  if (!inOptions.product.empty()) filter.SetProduct(inOptions.product);
  return filter;
}

void PrologueOptions::Declare(Arguments& ioArguments) {
  ioArguments.Text("--dtd", "REFERENCE", dtd, "System identifier of the document type");
  ioArguments.Text("--xsl", "REFERENCE", styleSheet, "Reference of the style sheet");
}

void PrologueOptions::Check() const {
  CheckReference("--dtd", dtd);
  CheckReference("--xsl", styleSheet);
  if (!typeName.empty() && !ZORToolkit::IsXmlName(typeName))
    throw UsageError("--type-name: \"" + typeName + "\" is no name in XML");
  if (!hasDeclaration && !(dtd.empty() && styleSheet.empty()))
    throw UsageError("--no-prologue leaves no place for --dtd and --xsl");
}

ZORToolkit::RecordFilter FilterOfConditions(const std::vector<std::string>& inLists) {
  OnlyConditions conditions;
  for (const std::string& list : inLists) {
    std::istringstream parts(list);
    for (std::string part; std::getline(parts, part, ',');) conditions.Add(part);
  }
  return conditions.Filter();
}

}  // namespace lyra
