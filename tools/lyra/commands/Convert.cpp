// lyra convert FILE --to json|bcf|xlsx|csv
#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <memory>
#include <thread>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/GroupOptions.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/Picture.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Progress.h"
#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Table.h"
#include "lyra/terminal/Terminal.h"
#include "toolkit/exchange/bcf/BcfWriter.h"
#include "toolkit/exchange/sheets/ResultSheet.h"
#include "toolkit/review/Match.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr const char* kFormats[] = {"json", "bcf", "xlsx", "csv"};
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
    const std::vector<std::string> ids = StableIds(ReadForReview(ioDocument, {.identities = true}));
    ForEachInterference(ioDocument, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      array.Add(IdentifiedRecord{inRecord, ids[static_cast<std::size_t>(inRecord.index - 1)]});
    });
  }
  array.Finish();
}

/// Writes text to the file that was named, or to standard output.
int WriteText(const ConvertOptions& inOptions, Output& ioOutput,
              const std::function<void(Output& ioText)>& inWrite) {
  if (inOptions.output.empty()) {
    inWrite(ioOutput);
    return 0;
  }
  OutputFile file(inOptions.output);
  std::unique_ptr<std::FILE, int (*)(std::FILE*)> stream(ZORFoundation::OpenStream(file.Path()),
                                                         &std::fclose);
  if (stream == nullptr) throw ZORFoundation::FileError(inOptions.output, errno);
  Output text(stream.get());
  inWrite(text);
  text.Finish();
  stream.reset();  // Windows renames no file that is open
  file.Finish(ioOutput);
  return 0;
}

int ConvertToJson(const ConvertOptions& inOptions, Output& ioOutput) {
  ClashDocument document(inOptions.file);
  return WriteText(inOptions, ioOutput, [&](Output& ioText) {
    ioText.Write(JsonHeaderText("convert") + ",\n\"info\":" + JsonText(ReadDocument(document)));
    WriteInterferences(document, ioText);
    WriteArray("components", ReadComponents(document), ioText);
    WriteArray("specifications", ReadSpecifications(document), ioText);
    WriteArray("links", ReadLinks(document), ioText);
    ioText.Write("}\n");
  });
}

// BCF

int ProcessCount() { return static_cast<int>(std::max(1U, std::thread::hardware_concurrency())); }

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
  options.processes = ProcessCount();
  return options;
}

OrderedJson ToJson(const std::vector<NotCarried>& inNotCarried) {
  OrderedJson rows = OrderedJson::array();
  for (const NotCarried& each : inNotCarried)
    rows.push_back({{"what", each.what}, {"count", each.count}, {"kept", each.kept}});
  return rows;
}

std::string TextOf(const std::vector<NotCarried>& inNotCarried, const std::string& inFormat) {
  std::string text = inNotCarried.empty() ? "" : inFormat + " has no place for:\n";
  for (const NotCarried& each : inNotCarried)
    text += "  " + each.what + " (" + std::to_string(each.count) + ")" +
            (each.kept.empty() ? "" : ": kept " + each.kept) + "\n";
  return text;
}

/// Says what became of the result where the file does not go.
void Say(const ConvertOptions& inOptions, const std::string& inReport, Output& ioOutput) {
  if (inOptions.output.empty() || inOptions.output == "-")
    WriteError(inReport);
  else
    ioOutput.Write(inReport);
}

/// As JSON, with what only one format has.
std::string JsonReport(const ConvertOptions& inOptions, const OrderedJson& inOfFormat,
                       std::size_t inInterferences, std::size_t inPictures,
                       const std::vector<NotCarried>& inNotCarried,
                       const std::vector<std::string>& inWarnings) {
  OrderedJson filters = OrderedJson::object();
  if (!inOptions.only.empty()) filters["only"] = inOptions.only;
  if (inOptions.isGrouped) {
    const GroupOptions grouping = inOptions.grouping.Get();
    filters["group"] = Name(grouping.by.front());
    if (grouping.by.front() == GroupBy::kPlace) filters["distance"] = grouping.distance;
  }
  OrderedJson json = JsonHeader("exchange", filters);
  json["format"] = inOptions.format;
  json.update(inOfFormat);
  json["file"] = inOptions.output;
  json["interferences"] = inInterferences;
  json["pictures"] = inPictures;
  json["notCarried"] = ToJson(inNotCarried);
  json["warnings"] = inWarnings;
  return JsonLine(json) + "\n";
}

std::string ReportOf(const ConvertOptions& inOptions, const BcfWritten& inWritten) {
  if (inOptions.json)
    return JsonReport(
        inOptions, {{"bcfVersion", inOptions.bcfVersion}, {"topics", inWritten.topics}},
        inWritten.interferences, inWritten.pictures, inWritten.notCarried, inWritten.warnings);
  return Printable(inOptions.output + ": " + std::to_string(inWritten.topics) + " topics of " +
                   std::to_string(inWritten.interferences) + " interferences, " +
                   std::to_string(inWritten.pictures) + " with a picture of their products") +
         "\n" + TextOf(inWritten.notCarried, "BCF");
}

/// Of a sheet.
std::string ReportOf(const ConvertOptions& inOptions, const SpreadsheetWritten& inWritten) {
  if (inOptions.json)
    return JsonReport(inOptions, OrderedJson::object(), inWritten.interferences, inWritten.pictures,
                      inWritten.notCarried, {});
  const std::string list = TextOf(inWritten.notCarried, "A sheet");
  if (inOptions.output.empty()) return list;
  return Printable(inOptions.output + ": " + std::to_string(inWritten.interferences) +
                   " interferences, " + std::to_string(inWritten.pictures) + " with a picture") +
         "\n" + list;
}

/// The document, and the model where pictures are to show one, with the progress of drawing.
class Conversion {
 public:
  explicit Conversion(const ConvertOptions& inOptions)
      : options_(inOptions), document_(inOptions.file), file_(inOptions.output) {}
  /// @param inBytes those of the file.
  Conversion(const ConvertOptions& inOptions, const std::string& inBytes)
      : options_(inOptions), document_(inOptions.file, inBytes), file_(inOptions.output) {}

  ClashDocument& Document() { return document_; }
  OutputFile& File() { return file_; }
  std::function<ZORIProduct_var()> ModelOpener() {
    if (options_.model.empty()) return {};
    return [this] {
      const ZORIProduct_var root = OpenModelFile(options_.model, options_.reading).root;
      progress_.emplace();
      return root;
    };
  }
  std::function<void(std::size_t, std::size_t)> Drawn() {
    return [this](std::size_t inDone, std::size_t inAll) {
      if (progress_) progress_->Show(inDone, inAll);
    };
  }
  void EndProgress() { progress_.reset(); }

 private:
  const ConvertOptions& options_;
  ClashDocument document_;
  OutputFile file_;
  std::optional<DrawingProgress> progress_;
};

int ConvertToBcf(const ConvertOptions& inOptions, Output& ioOutput) {
  BcfOptions options = BcfOptionsOf(inOptions);
  options.resultBytes = BytesOfInput(inOptions.file);
  Conversion conversion(inOptions, options.resultBytes);
  options.drawn = conversion.Drawn();
  const BcfWritten written =
      WriteBcf(conversion.Document(), options, conversion.ModelOpener(), conversion.File().Path());
  conversion.EndProgress();
  for (const std::string& warning : written.warnings)
    WriteError("lyra: warning: " + Printable(warning) + "\n");
  conversion.File().Finish(ioOutput);
  Say(inOptions, ReportOf(inOptions, written), ioOutput);
  return 0;
}

// Sheets

int ConvertToXlsx(const ConvertOptions& inOptions, Output& ioOutput) {
  SpreadsheetOptions options;
  if (!inOptions.only.empty()) options.filter = FilterOfConditions(inOptions.only);
  options.grouping = inOptions.grouping.Get();
  options.page = inOptions.page;
  options.processes = ProcessCount();
  Conversion conversion(inOptions);
  options.drawn = conversion.Drawn();
  const SpreadsheetWritten written = WriteSpreadsheet(
      conversion.Document(), options, conversion.ModelOpener(), conversion.File().Path());
  conversion.EndProgress();
  conversion.File().Finish(ioOutput);
  Say(inOptions, ReportOf(inOptions, written), ioOutput);
  return 0;
}

int ConvertToCsv(const ConvertOptions& inOptions, Output& ioOutput) {
  const RecordFilter filter = FilterOfConditions(inOptions.only);
  ClashDocument document(inOptions.file);
  document.RequireInterferences();
  SpreadsheetWritten written;
  WriteText(inOptions, ioOutput, [&](Output& ioText) {
    ioText.Write(CsvRow(SheetHeaders()));
    std::vector<std::string> cells;
    written.notCarried =
        ForEachSheetRow(document, filter, [&](const std::vector<SheetCell>& inCells) {
          cells.clear();
          for (const SheetCell& cell : inCells) {
            const std::string text = cell.number ? Number(*cell.number).text : cell.text;
            cells.push_back(ioText.IsTerminal() ? Printable(text) : text);
          }
          ioText.Write(CsvRow(cells));
          ++written.interferences;
        });
  });
  Say(inOptions, ReportOf(inOptions, written), ioOutput);
  return 0;
}

int Convert(const ConvertOptions& inOptions, Output& ioOutput) {
  constexpr int (*kConvert[])(const ConvertOptions&, Output&) = {ConvertToJson, ConvertToBcf,
                                                                 ConvertToXlsx, ConvertToCsv};
  const std::size_t format = ChosenWord("--to", inOptions.format, kFormats);
  const bool isFile = inOptions.format == "bcf" || inOptions.format == "xlsx";
  if (isFile && inOptions.output.empty())
    throw UsageError("--to " + inOptions.format + ": --output must name the file");
  inOptions.reading.Check();
  ChooseLanguage(inOptions.language);
  return kConvert[format](inOptions, ioOutput);
}

}  // namespace

VerbAction DeclareConvert(Arguments& ioArguments) {
  const auto options = std::make_shared<ConvertOptions>();
  ioArguments.Positional("FILE", options->file, "Any clash result, or - for standard input");
  ioArguments.RequiredText("--to", "FORMAT", options->format,
                           "json: all of it in one document; bcf: a topic for each interference; "
                           "xlsx: a workbook; csv: its rows");
  ioArguments.Words("--to", kFormats);
  ioArguments.NonEmptyText("-o,--output", "OUT", options->output,
                           "The file to write, or - for standard output; bcf and xlsx need it");
  ioArguments.Text("--bcf-version", "VERSION", options->bcfVersion, "bcf: 2.1 (default) or 3.0");
  ioArguments.Words("--bcf-version", kBcfVersions);
  ioArguments.Flag("--group", options->isGrouped,
                   "bcf: a topic for each group, as lyra group makes them");
  options->grouping.Declare(ioArguments);
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
                           "bcf, xlsx: the model that pictures show");
  ioArguments.NonEmptyText("--page", "DIR", options->page,
                           "bcf, xlsx: a published page whose pictures are taken");
  ioArguments.Text("--size", "WxH", options->size,
                   "bcf: width and height of a picture in pixels (default: 756x506)");
  ioArguments.Texts(
      "--only", "CONDITIONS", options->only,
      "Not for json: only some, such as type=clash,status=relevant; also result= and product=");
  ioArguments.Flag("--json", options->json,
                   "bcf, xlsx, csv: print what became of the result as JSON");
  options->reading.Declare(ioArguments);
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Convert(*options, ioOutput); };
}

}  // namespace lyra
