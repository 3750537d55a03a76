#include "lyra/commands/ReviewImport.h"

#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Terminal.h"
#include "toolkit/exchange/ReviewImport.h"
#include "toolkit/records/RecordFilter.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

bool IsSheet(const std::string& inFile) {
  const std::string name = CaseFolded(inFile);
  const auto ends = [&](const char* inEnding) { return name.ends_with(inEnding); };
  return ends(".xlsx") || ends(".csv") || ends(".tsv") || ends(".txt");
}

/// What became of the work, where the review file does not go.
void Report(const ReviewImportOptions& inOptions, const ImportedReview& inReview,
            Output& ioOutput) {
  std::string text;
  if (inOptions.json) {
    OrderedJson json = JsonHeader("import");
    json["file"] = inOptions.file;
    json["seen"] = inReview.seen;
    json["changed"] = inReview.entries.size();
    json["notes"] = inReview.notes;
    text = JsonLine(json) + "\n";
  } else {
    for (const std::string& note : inReview.notes) text += "note: " + Printable(note) + "\n";
    text += std::to_string(inReview.seen) + " known, " + std::to_string(inReview.entries.size()) +
            " changed\n";
  }
  if (inOptions.output == "-")
    WriteError(text);
  else
    ioOutput.Write(text);
}

}  // namespace

int ImportReview(const ReviewImportOptions& inOptions, Output& ioOutput) {
  ReviewInput input(inOptions.result);
  const ImportedReview review =
      IsSheet(inOptions.file)
          ? ImportSheet(input.result, inOptions.file)
          : ImportBcf(input.result, ReadBcf(inOptions.file), inOptions.grouping);
  OutputFile output(inOptions.output);
  ZORFoundation::WriteWholeFile(output.Path(), ReviewFileText(review, DocumentHash(input.bytes)));
  output.Finish(ioOutput);
  Report(inOptions, review, ioOutput);
  return 0;
}

}  // namespace lyra
