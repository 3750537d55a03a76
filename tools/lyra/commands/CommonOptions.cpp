#include "lyra/commands/CommonOptions.h"

#include <algorithm>
#include <span>

#include "foundation/Process.h"
#include "lyra/Arguments.h"
#include "lyra/CommandErrors.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

void CheckReference(const char* inOption, const std::string& inText) {
  for (char byte : inText)
    if (byte == '"' || static_cast<unsigned char>(byte) < ' ')
      throw UsageError(std::string(inOption) +
                       ": must not hold quotation marks or control characters");
  if (inText.find("?>") != std::string::npos)
    throw UsageError(std::string(inOption) + ": must not hold \"?>\"");
}

}  // namespace

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
  ZORFoundation::WriteEnvironment("ZOR_LANG", language.c_str());
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

}  // namespace lyra
