// lyra convert FILE --to json|bcf
#include <algorithm>
#include <cstdio>
#include <memory>
#include <thread>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/GroupOptions.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/Picture.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Progress.h"
#include "lyra/terminal/SafeText.h"
#include "toolkit/exchange/BcfWriter.h"
#include "toolkit/review/Match.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr const char* kFormats[] = {"json", "bcf"};
constexpr const char* kBcfVersions[] = {"2.1", "3.0"};

struct ConvertOptions {
  std::string file, format, language, output, bcfVersion = "2.1", model, page, size;
  std::vector<std::string> only;
  bool isGrouped = false, json = false;
  GroupVerbOptions grouping;
  ModelReading reading;
};

// JSON

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

int ConvertToJson(const ConvertOptions& inOptions, Output& ioOutput) {
  if (!inOptions.output.empty()) throw UsageError("--output: JSON is written to standard output");
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

// BCF

BcfOptions BcfOptionsOf(const ConvertOptions& inOptions) {
  BcfOptions options;
  options.version =
      static_cast<BcfVersion>(ChosenWord("--bcf-version", inOptions.bcfVersion, kBcfVersions));
  if (inOptions.isGrouped) options.grouping = inOptions.grouping.Get();
  options.filter = FilterOfConditions(inOptions.only);
  if (!inOptions.size.empty()) options.size = SizeOf(inOptions.size);
  if (std::max(options.size.width, options.size.height) > kMaxSnapshotSize)
    throw UsageError("--size: a picture in a BCF file has at most " +
                     std::to_string(kMaxSnapshotSize) + " pixels a side");
  options.page = inOptions.page;
  options.processes = static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
  return options;
}

/// What became of the result: as a list for a person, or as JSON.
std::string WrittenText(const ConvertOptions& inOptions, const BcfWritten& inWritten) {
  if (inOptions.json) {
    OrderedJson notCarried = OrderedJson::array();
    for (const NotCarried& each : inWritten.notCarried)
      notCarried.push_back({{"what", each.what}, {"count", each.count}, {"kept", each.kept}});
    return JsonLine({{"format", "bcf"},
                     {"version", inOptions.bcfVersion},
                     {"file", inOptions.output},
                     {"topics", inWritten.topics},
                     {"interferences", inWritten.interferences},
                     {"pictures", inWritten.pictures},
                     {"notCarried", notCarried},
                     {"warnings", inWritten.warnings}}) +
           "\n";
  }
  std::string text =
      Printable(inOptions.output + ": " + std::to_string(inWritten.topics) + " topics of " +
                std::to_string(inWritten.interferences) + " interferences, " +
                std::to_string(inWritten.pictures) + " with a picture of their products") +
      "\n";
  if (!inWritten.notCarried.empty()) text += "BCF has no place for:\n";
  for (const NotCarried& each : inWritten.notCarried)
    text += "  " + each.what + " (" + std::to_string(each.count) + "): kept " + each.kept + "\n";
  return text;
}

int ConvertToBcf(const ConvertOptions& inOptions, Output& ioOutput) {
  if (inOptions.output.empty()) throw UsageError("--to bcf: --output must name the file");
  BcfOptions options = BcfOptionsOf(inOptions);
  inOptions.reading.Check();
  ChooseLanguage(inOptions.language);
  options.resultBytes = BytesOfInput(inOptions.file);
  ClashDocument document(inOptions.file, options.resultBytes);
  OutputFile file(inOptions.output);
  BcfWritten written;
  {
    std::optional<DrawingProgress> progress;
    options.drawn = [&](std::size_t inDone, std::size_t inAll) {
      if (progress) progress->Show(inDone, inAll);
    };
    const auto openModel = [&] {
      const ZORIProduct_var root = OpenModelFile(inOptions.model, inOptions.reading).root;
      progress.emplace();
      return root;
    };
    written = WriteBcf(document, options,
                       inOptions.model.empty() ? std::function<ZORIProduct_var()>() : openModel,
                       file.Path());
  }
  for (const std::string& warning : written.warnings)
    std::fprintf(stderr, "lyra: warning: %s\n", Printable(warning).c_str());
  file.Finish(ioOutput);
  const std::string text = WrittenText(inOptions, written);
  if (inOptions.output == "-")
    std::fputs(text.c_str(), stderr);
  else
    ioOutput.Write(text);
  return 0;
}

int Convert(const ConvertOptions& inOptions, Output& ioOutput) {
  constexpr int (*kConvert[])(const ConvertOptions&, Output&) = {ConvertToJson, ConvertToBcf};
  return kConvert[ChosenWord("--to", inOptions.format, kFormats)](inOptions, ioOutput);
}

}  // namespace

VerbAction DeclareConvert(Arguments& ioArguments) {
  const auto options = std::make_shared<ConvertOptions>();
  ioArguments.Positional("FILE", options->file, "Any clash result, or - for standard input");
  ioArguments.RequiredText("--to", "FORMAT", options->format,
                           "json: all of it in one document; bcf: a topic for each interference");
  ioArguments.Words("--to", kFormats);
  ioArguments.NonEmptyText("-o,--output", "OUT", options->output,
                           "bcf: the file to write, or - for standard output");
  ioArguments.Text("--bcf-version", "VERSION", options->bcfVersion, "bcf: 2.1 (default) or 3.0");
  ioArguments.Words("--bcf-version", kBcfVersions);
  ioArguments.Flag("--group", options->isGrouped,
                   "bcf: a topic for each group, as lyra group makes them");
  options->grouping.Declare(ioArguments);
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
                           "bcf: the model that the pictures show");
  ioArguments.NonEmptyText("--page", "DIR", options->page,
                           "bcf: a published page whose PNG pictures are taken");
  ioArguments.Text("--size", "WxH", options->size,
                   "bcf: width and height of a picture in pixels (default: 756x506)");
  ioArguments.Texts(
      "--only", "CONDITIONS", options->only,
      "bcf: only some, such as type=clash,status=relevant; also result= and product=");
  ioArguments.Flag("--json", options->json, "bcf: print what became of the result as JSON");
  options->reading.Declare(ioArguments);
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Convert(*options, ioOutput); };
}

}  // namespace lyra
