// lyra diff OLD NEW
#include <algorithm>
#include <memory>
#include <thread>

#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/PublishRun.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr int kDiffer = 3;

struct DiffVerbOptions {
  std::string oldFile, newFile, model, oldModel, page;
  CompareOptions compare;
  ModelReading reading;
  bool json = false, csv = false, all = false, exitCode = false;
};

struct Compared {
  const ReviewedResult& oldResult;
  const ReviewedResult& newResult;
  ResultDiff diff;

  std::vector<std::string> Ids() const { return EntryIds(diff, oldResult, newResult); }
};

std::string IndexText(int inPosition) {
  return inPosition < 0 ? "" : std::to_string(inPosition + 1);
}

void PrintJson(const Compared& inCompared, const DiffOptions& inOptions, Output& ioOutput) {
  const std::vector<std::string> ids = inCompared.Ids();
  const OrderedJson filters = {{"tolerance", inOptions.tolerance}, {"place", inOptions.samePlace}};
  std::string begin = JsonHeaderText("diff", filters) + ",\n";
  for (std::size_t i = 0; i < kDiffClassCount; ++i) {
    const auto itsClass = static_cast<DiffClass>(i);
    ioOutput.Write(begin.append("\"").append(Name(itsClass)).append("\":["));
    begin = ",\n";
    const char* lineBegin = "\n";
    for (std::size_t k = 0; k < ids.size(); ++k) {
      const DiffEntry& entry = inCompared.diff.entries[k];
      if (entry.itsClass != itsClass) continue;
      ioOutput.Write(lineBegin + JsonText(IdentifiedEntry{entry, ids[k]}));
      lineBegin = ",\n";
    }
    ioOutput.Write(*lineBegin == ',' ? "\n]" : "]");
  }
  ioOutput.Write("}\n");
}

/// The interference as it is now, or was where it is no more.
std::pair<const ReviewedResult*, const ReviewRecord*> Shown(const Compared& inCompared,
                                                            const DiffEntry& inEntry) {
  const bool isOld = inEntry.newPosition < 0;
  const ReviewedResult& result = isOld ? inCompared.oldResult : inCompared.newResult;
  const int position = isOld ? inEntry.oldPosition : inEntry.newPosition;
  return {&result, &result.interferences[static_cast<std::size_t>(position)]};
}

std::string ChangesText(const DiffEntry& inEntry) {
  std::string text;
  for (const Change& change : inEntry.changes) {
    if (!text.empty()) text += "; ";
    text.append(change.what).append(1, ' ').append(change.from).append(" -> ").append(change.to);
  }
  return text.empty() ? std::string(inEntry.reason) : text;
}

std::vector<std::string> Cells(const Compared& inCompared, const DiffEntry& inEntry) {
  const auto [result, record] = Shown(inCompared, inEntry);
  std::vector<std::string> cells{Name(inEntry.itsClass), IndexText(inEntry.oldPosition),
                                 IndexText(inEntry.newPosition), std::string(record->type),
                                 std::string(record->value.text)};
  for (const int product : record->products)
    cells.emplace_back(product < 0 ? ""
                                   : result->products[static_cast<std::size_t>(product)].Name());
  cells.push_back(ChangesText(inEntry));
  return cells;
}

void PrintCsv(const Compared& inCompared, Output& ioOutput) {
  ioOutput.Write(CsvRow({"Class", "Old", "New", "Type", "Value", "First product", "Second product",
                         "Changes or reason", "Id", "Reason"}));
  const std::vector<std::string> ids = inCompared.Ids();
  for (std::size_t i = 0; i < ids.size(); ++i) {
    const DiffEntry& entry = inCompared.diff.entries[i];
    std::vector<std::string> cells = Cells(inCompared, entry);
    cells.push_back(ids[i]);
    cells.emplace_back(entry.reason);
    if (ioOutput.IsTerminal())
      for (std::string& cell : cells) cell = Printable(cell);
    ioOutput.Write(CsvRow(cells));
  }
}

void PrintTable(const Compared& inCompared, bool inIsAll, Output& ioOutput) {
  std::vector<TableColumn> columns;
  for (const char* const header : {"Class", "Old", "New", "Type", "Value", "First product",
                                   "Second product", "Changes or reason"})
    columns.push_back({header});
  columns[1].align = columns[2].align = columns[4].align = TableColumn::Align::kRight;
  columns[5].cut = columns[6].cut = Cut::kStart;
  Table table(columns);
  for (const DiffEntry& entry : inCompared.diff.entries)
    if (inIsAll || entry.itsClass != DiffClass::kPersisting) table.Add(Cells(inCompared, entry));
  table.Print(ioOutput);
  const ResultDiff& diff = inCompared.diff;
  const auto count = [&](DiffClass inClass) { return std::to_string(diff.Count(inClass)); };
  ioOutput.Write("\n");
  ioOutput.Write(count(DiffClass::kNew) + " new, " + count(DiffClass::kPersisting) +
                 " persisting, " + count(DiffClass::kChanged) + " changed, " +
                 count(DiffClass::kResolved) + " resolved, " + count(DiffClass::kNotComparable) +
                 " not comparable\n");
}

/// @param inKeepsBytes for a page that gives its result back; a large result is read without them.
struct DiffInput {
  DiffInput(const std::string& inPath, bool inKeepsBytes, const ReviewReading& inReading)
      : bytes(inKeepsBytes ? BytesOfInput(inPath) : std::string()),
        document(inKeepsBytes ? ClashDocument(inPath, bytes) : ClashDocument(inPath)),
        result(ReadForReview(document, inReading)) {}

  std::string bytes;
  ClashDocument document;
  ReviewedResult result;
};

/// The products of two results that a model has, by their names there.
std::unordered_set<std::string> ProductsInModel(const ZORIProduct_var& inRoot,
                                                std::initializer_list<ClashDocument*> inResults) {
  InterferenceScenes scenes(inRoot);
  std::unordered_set<std::string> names;
  for (ClashDocument* const document : inResults)
    ForEachInterference(*document, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
      const ResolvedInterference resolved = scenes.Resolve(inRecord, ProductPlaces::kModel);
      for (std::size_t i = 0; i < 2; ++i) {
        if (resolved.products[i].shown.product.IsNull()) continue;
        for (const std::string& name : {inRecord.products[i].id, inRecord.products[i].alias})
          if (!name.empty()) names.insert(name);
      }
    });
  return names;
}

/// The new result with what became of each interference, and pictures before and after.
void MakePage(const DiffVerbOptions& inOptions, const DiffOptions& inComparison,
              const ZORIProduct_var& inRoot, DiffInput& ioOld, DiffInput& ioNew, Output& ioOutput) {
  PublicationOptions options;
  SetTarget(options, inOptions.page);
  options.isCompact = options.isOneFile;
  if (options.isCompact) options.format = PictureFormat::kPng;
  options.source = ioNew.bytes;
  options.sourceName = FileNameOf(inOptions.newFile);
  options.baseline = &ioOld.document;
  options.baselineSource = ioOld.bytes;
  options.baselineName = FileNameOf(inOptions.oldFile);
  options.comparison = inComparison;
  options.model = inOptions.model;
  options.language = inOptions.compare.language;
  options.processes = static_cast<int>(std::max(1U, std::thread::hardware_concurrency()));
  if (!inOptions.oldModel.empty())
    options.openBaselineModel = [&] {
      return OpenModelFile(inOptions.oldModel, inOptions.reading).root;
    };
  std::optional<DrawingProgress> progress;
  SayOnStandardError(progress, options);
  const Published made = Publish(ioNew.document, options, [&] {
    progress.emplace();
    return inRoot;
  });
  if (inOptions.json || inOptions.csv)
    RequireAllPictures(made);
  else
    ReportPage(made, ioOutput);
}

int Diff(const DiffVerbOptions& inOptions, Output& ioOutput) {
  if (inOptions.json && inOptions.csv)
    throw UsageError("diff: --json and --csv exclude each other");
  if (!inOptions.oldModel.empty() && (inOptions.page.empty() || inOptions.model.empty()))
    throw UsageError("diff: --old-model needs --page and --model");
  DiffOptions options = inOptions.compare.Get();
  inOptions.reading.Check();
  ChooseLanguage(inOptions.compare.language);
  const bool hasPage = !inOptions.page.empty();
  const ReviewReading newReading{.geometries = true, .identities = inOptions.json || inOptions.csv};
  DiffInput oldInput(inOptions.oldFile, hasPage, {.geometries = true});
  DiffInput newInput(inOptions.newFile, hasPage, newReading);
  const ReviewedResult &oldResult = oldInput.result, &newResult = newInput.result;
  ZORIProduct_var root;
  if (!inOptions.model.empty()) {
    root = OpenModelFile(inOptions.model, inOptions.reading).root;
    options.productsOfNewModel = ProductsInModel(root, {&oldInput.document, &newInput.document});
  }
  const Compared compared{oldResult, newResult, ZORToolkit::Diff(oldResult, newResult, options)};
  if (inOptions.json)
    PrintJson(compared, options, ioOutput);
  else if (inOptions.csv)
    PrintCsv(compared, ioOutput);
  else
    PrintTable(compared, inOptions.all, ioOutput);
  if (hasPage) MakePage(inOptions, options, root, oldInput, newInput, ioOutput);
  return inOptions.exitCode && compared.diff.HasDifferences() ? kDiffer : 0;
}

}  // namespace

VerbAction DeclareDiff(Arguments& ioArguments) {
  const auto options = std::make_shared<DiffVerbOptions>();
  ioArguments.Positional("OLD", options->oldFile, "A clash result, or - for standard input");
  ioArguments.Positional("NEW", options->newFile, "The result of a later computation");
  ioArguments.Flag("--json", options->json, "Print one JSON document");
  ioArguments.Flag("--csv", options->csv, "Print comma-separated values");
  ioArguments.Flag("--all", options->all, "Show persisting interferences in the table too");
  ioArguments.Flag("--exit-code", options->exitCode, "Exit with 3 when there are differences");
  ioArguments.NonEmptyText("--page", "DIR", options->page,
                           "Make a page of the new result too, as lyra publish --baseline does");
  ioArguments.NonEmptyText("--model", "MODEL", options->model,
                           "The new model: what it lacks is not comparable, and the page has "
                           "pictures before and after");
  ioArguments.NonEmptyText("--old-model", "MODEL", options->oldModel,
                           "The model of the pictures before (default: that of --model)");
  options->compare.Declare(ioArguments);
  options->reading.Declare(ioArguments);
  return [options](Output& ioOutput) { return Diff(*options, ioOutput); };
}

}  // namespace lyra
