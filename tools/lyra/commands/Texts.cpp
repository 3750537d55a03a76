// lyra path NAME, lyra escape TEXT, lyra filename TEXT
#include <memory>

#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"
#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "toolkit/records/DocumentText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct TextOptions {
  std::string text;
  bool other = false;  // the second of two converters
};

using Converter = void (*)(ZORUnicodeString& inText, ZORUnicodeString& ioOutput);

/// Converts a text of the command line as a line, standard input as it stands.
int Convert(const TextOptions& inOptions, Converter inFirst, Converter inOther, Output& ioOutput) {
  constexpr int kStandardInput = 0;
  const bool isStream = inOptions.text == "-";
  ZORUnicodeString text = FromUtf8(isStream ? ZORFoundation::ReadToEnd(kStandardInput, "-")
                                            : inOptions.text),
                   converted;
  (inOptions.other ? inOther : inFirst)(text, converted);
  ioOutput.Write(Utf8(converted) + (isStream ? "" : "\n"));
  return 0;
}

int Path(const std::string& inName, Output& ioOutput) {
  const bool isReference = inName.find("ZORDLN://") != std::string::npos;
  const std::string path =
      Utf8(isReference ? ZORLyraGeneralServices::TransformPathnameFromDLName(FromUtf8(inName))
                       : ZORLyraGeneralServices::TransformFromDLName(FromUtf8(inName)));
  if (isReference && path == "error")
    throw InputError(inName + ": the directory of the logical name cannot be expanded");
  if (path.empty())
    throw InputError(inName + (isReference ? ": unknown logical name" : ": names no directory"));
  ioOutput.Write(path + "\n");
  return 0;
}

}  // namespace

VerbAction DeclarePath(Arguments& ioArguments) {
  const auto name = std::make_shared<std::string>();
  ioArguments.Positional("NAME", *name,
                         "A logical name, or a reference ZORDLN://NAME\\folder\\file");
  return [name](Output& ioOutput) { return Path(*name, ioOutput); };
}

VerbAction DeclareEscape(Arguments& ioArguments) {
  const auto options = std::make_shared<TextOptions>();
  ioArguments.Positional("TEXT", options->text, "The text, or - for standard input");
  ioArguments.Flag("--identifier", options->other, "Also make each space an underscore");
  return [options](Output& ioOutput) {
    return Convert(*options, BuildPath::CheckXMLString, BuildPath::CheckXMLString2, ioOutput);
  };
}

VerbAction DeclareFilename(Arguments& ioArguments) {
  const auto options = std::make_shared<TextOptions>();
  ioArguments.Positional("TEXT", options->text, "The text, or - for standard input");
  ioArguments.Flag("--references", options->other,
                   "Write character references such as &#47; and keep spaces");
  return [options](Output& ioOutput) {
    return Convert(*options, BuildPath::DeleteSpecialCharacterOfFilename,
                   BuildPath::DeleteSpecialCharacterOfFilename2, ioOutput);
  };
}

}  // namespace lyra
