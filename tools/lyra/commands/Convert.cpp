// lyra convert FILE --to json
#include <memory>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/RecordsJson.h"
#include "toolkit/review/Match.h"

namespace lyra {
using namespace ZORToolkit;
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

void WriteInterferences(ClashDocument& ioDocument, Output& ioOutput) {
  ioOutput.Write(",\n\"interferences\":");
  JsonArray array(ioOutput);
  if (ioDocument.HasInterferences()) {
    const std::vector<std::string> ids = StableIds(ReadForReview(ioDocument));
    ForEachInterference(ioDocument, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      array.Add(IdentifiedRecord{inRecord, ids[static_cast<std::size_t>(inRecord.index - 1)]});
    });
  }
  array.Finish();
}

int Convert(const ConvertOptions& inOptions, Output& ioOutput) {
  ChosenWord("--to", inOptions.format, kFormats);
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  ioOutput.Write("{\"info\":" + JsonText(ReadDocument(document)));
  WriteInterferences(document, ioOutput);
  WriteArray("components", ReadComponents(document), ioOutput);
  WriteArray("specifications", ReadSpecifications(document), ioOutput);
  WriteArray("links", ReadLinks(document), ioOutput);
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
