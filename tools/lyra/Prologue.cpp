#include "lyra/Prologue.h"

#include "lyra/CommandErrors.h"

namespace lyra {
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
