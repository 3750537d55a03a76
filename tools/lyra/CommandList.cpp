// lyra list FILE
#include <memory>

#include "lyra/CommandErrors.h"
#include "lyra/Csv.h"
#include "lyra/Language.h"
#include "lyra/ListFilter.h"
#include "lyra/RecordsJson.h"
#include "lyra/Table.h"
#include "lyra/Verbs.h"

namespace lyra {
namespace {

struct ListOptions {
  std::string file, language, result, product;
  std::vector<std::string> types, statuses;
  bool json = false, csv = false;
};

const std::vector<std::string>& Headers() {
  static const std::vector<std::string> headers = {
      "N", "Type", "Value", "Status", "Rule", "First product", "Second product"};
  return headers;
}

/// What a person calls a product: its alias, or its identifier when it has none.
const std::string& NameOf(const ProductRecord& inProduct) {
  return inProduct.alias.empty() ? inProduct.id : inProduct.alias;
}

std::vector<std::string> Cells(const InterferenceRecord& inRecord) {
  return {std::to_string(inRecord.index),
          inRecord.type,
          inRecord.value,
          inRecord.status,
          inRecord.rule.name,
          NameOf(inRecord.products[0]),
          NameOf(inRecord.products[1])};
}

ListFilter FilterOf(const ListOptions& inOptions) {
  ListFilter filter;
  filter.SetTypes(inOptions.types);
  filter.SetStatuses(inOptions.statuses);
  if (!inOptions.result.empty()) filter.SetResult(inOptions.result);
  if (!inOptions.product.empty()) filter.SetProduct(inOptions.product);
  return filter;
}

/// What a row needs.
RecordPart PartFor(const ListFilter& inFilter) {
  return inFilter.NeedsLabels() ? RecordPart::kAll : RecordPart::kRow;
}

template <class Visit>
void ForEachAccepted(ClashResultFile& ioFile, const ListFilter& inFilter, RecordPart inPart,
                     const Visit& inVisit) {
  ForEachInterference(ioFile, [&](const PlacedInterference& inPlaced) {
    const InterferenceRecord record = ReadInterference(ioFile, inPlaced, inPart);
    if (inFilter.Accepts(record)) inVisit(record);
  });
}

void PrintJson(ClashResultFile& ioFile, const ListFilter& inFilter, Output& ioOutput) {
  JsonArray array(ioOutput);
  ForEachAccepted(ioFile, inFilter, RecordPart::kAll,
                  [&](const InterferenceRecord& inRecord) { array.Add(inRecord); });
  array.Finish();
  ioOutput.Write("\n");
}

void PrintCsv(ClashResultFile& ioFile, const ListFilter& inFilter, Output& ioOutput) {
  ioOutput.Write(CsvRow(Headers()));
  ForEachAccepted(ioFile, inFilter, PartFor(inFilter), [&](const InterferenceRecord& inRecord) {
    std::vector<std::string> cells = Cells(inRecord);
    // On its way to a program a text stays as it is; a terminal must not be driven by it.
    if (ioOutput.IsTerminal())
      for (std::string& cell : cells) cell = Printable(cell);
    ioOutput.Write(CsvRow(cells));
  });
}

void PrintTable(ClashResultFile& ioFile, const ListFilter& inFilter, Output& ioOutput) {
  std::vector<TableColumn> columns;
  for (const std::string& header : Headers()) columns.push_back({header});
  columns[0].align = columns[2].align = TableColumn::Align::kRight;
  columns[5].cut = columns[6].cut = Cut::kStart;  // what tells products apart is at their ends
  Table table(columns);
  ForEachAccepted(ioFile, inFilter, PartFor(inFilter),
                  [&](const InterferenceRecord& inRecord) { table.Add(Cells(inRecord)); });
  table.Print(ioOutput);
}

int List(const ListOptions& inOptions, Output& ioOutput) {
  if (inOptions.json && inOptions.csv)
    throw UsageError("list: --json and --csv exclude each other");
  const ListFilter filter = FilterOf(inOptions);
  ChooseLanguage(inOptions.language);
  ClashResultFile file(inOptions.file);
  file.Require({DocumentKind::kClash, DocumentKind::kInterference}, "interferences");
  if (inOptions.json)
    PrintJson(file, filter, ioOutput);
  else if (inOptions.csv)
    PrintCsv(file, filter, ioOutput);
  else
    PrintTable(file, filter, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareList(Arguments& ioArguments) {
  const auto options = std::make_shared<ListOptions>();
  ioArguments.Positional("FILE", options->file, "A clash result, or - for standard input");
  ioArguments.Texts("--type", "TYPE", options->types,
                    "Only clash, contact, clearance or error; may be given several times");
  ioArguments.Words("--type", kTypeWords);
  ioArguments.Texts("--status", "STATUS", options->statuses,
                    "Only relevant, irrelevant, not-inspected or error; likewise");
  ioArguments.Words("--status", kStatusWords);
  ioArguments.Text("--result", "NAME", options->result, "Only the result set of this name");
  ioArguments.Text("--product", "TEXT", options->product,
                   "Only with a product whose alias, identifier, instance or label holds TEXT");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  ioArguments.Flag("--csv", options->csv, "Print comma-separated values for a spreadsheet");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return List(*options, ioOutput); };
}

}  // namespace lyra
