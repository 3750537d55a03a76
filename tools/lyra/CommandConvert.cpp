// lyra convert FILE --to json
#include <memory>

#include "lyra/Language.h"
#include "lyra/OptionWord.h"
#include "lyra/RecordsJson.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

constexpr const char* kFormats[] = {"json"};

struct ConvertOptions {
  std::string file, format, language;
};

template <class Records>
void WriteArray(const char* inName, const Records& inRecords, Output& ioOutput) {
  ioOutput.Write(std::string(",\n\"") + inName + "\":");
  JsonArray array(ioOutput);
  for (const auto& record : inRecords) array.Add(record);
  array.Finish();
}

void WriteInterferences(ClashResultFile& ioFile, Output& ioOutput) {
  ioOutput.Write(",\n\"interferences\":");
  JsonArray array(ioOutput);
  const bool has =
      ioFile.Kind() == DocumentKind::kClash || ioFile.Kind() == DocumentKind::kInterference;
  if (has) {
    ForEachInterference(ioFile, [&](const PlacedInterference& inPlaced) {
      array.Add(ReadInterference(ioFile, inPlaced));
    });
  }
  array.Finish();
}

int Convert(const ConvertOptions& inOptions, Output& ioOutput) {
  ChosenWord("--to", inOptions.format, kFormats);
  ChooseLanguage(inOptions.language);
  ClashResultFile file(inOptions.file);
  ioOutput.Write("{\"info\":" + JsonText(ReadGeneral(file)));
  WriteInterferences(file, ioOutput);
  WriteArray("components", ReadComponents(file), ioOutput);
  WriteArray("specifications", ReadSpecifications(file), ioOutput);
  WriteArray("links", ReadLinks(file), ioOutput);
  ioOutput.Write("}\n");
  return 0;
}

}  // namespace

VerbAction DeclareConvert(Arguments& ioArguments) {
  const auto options = std::make_shared<ConvertOptions>();
  ioArguments.Positional("FILE", options->file, "Any clash result, or - for standard input");
  ioArguments.RequiredText("--to", "FORMAT", options->format, "json: all of it in one document");
  ioArguments.Words("--to", kFormats);
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Convert(*options, ioOutput); };
}

}  // namespace lyra
