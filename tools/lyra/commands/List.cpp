// lyra list FILE
#include <memory>

#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"
#include "toolkit/review/Match.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct ListOptions {
  std::string file, language;
  FilterOptions filter;
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
          inRecord.value.text,
          inRecord.status,
          inRecord.rule.name,
          NameOf(inRecord.products[0]),
          NameOf(inRecord.products[1])};
}

/// What a row needs.
RecordPart PartFor(const RecordFilter& inFilter) {
  return inFilter.NeedsLabels() ? RecordPart::kAll : RecordPart::kRow;
}

template <class Visit>
void ForEachAccepted(ClashDocument& ioDocument, const RecordFilter& inFilter, RecordPart inPart,
                     const Visit& inVisit) {
  ForEachInterference(ioDocument, inPart, [&](const InterferenceRecord& inRecord) {
    if (inFilter.Accepts(inRecord)) inVisit(inRecord);
  });
}

void PrintJson(ClashDocument& ioDocument, const RecordFilter& inFilter, Output& ioOutput) {
  const std::vector<std::string> ids = StableIds(ReadForReview(ioDocument, {.identities = true}));
  JsonArray array(ioOutput);
  ForEachAccepted(ioDocument, inFilter, RecordPart::kAll, [&](const InterferenceRecord& inRecord) {
    array.Add(IdentifiedRecord{inRecord, ids[static_cast<std::size_t>(inRecord.index - 1)]});
  });
  array.Finish();
  ioOutput.Write("\n");
}

void PrintCsv(ClashDocument& ioDocument, const RecordFilter& inFilter, Output& ioOutput) {
  ioOutput.Write(CsvRow(Headers()));
  ForEachAccepted(ioDocument, inFilter, PartFor(inFilter), [&](const InterferenceRecord& inRecord) {
    std::vector<std::string> cells = Cells(inRecord);
    // On its way to a program a text stays as it is; a terminal must not be driven by it.
    if (ioOutput.IsTerminal())
      for (std::string& cell : cells) cell = Printable(cell);
    ioOutput.Write(CsvRow(cells));
  });
}

void PrintTable(ClashDocument& ioDocument, const RecordFilter& inFilter, Output& ioOutput) {
  std::vector<TableColumn> columns;
  for (const std::string& header : Headers()) columns.push_back({header});
  columns[0].align = columns[2].align = TableColumn::Align::kRight;
  columns[5].cut = columns[6].cut = Cut::kStart;  // what tells products apart is at their ends
  Table table(columns);
  ForEachAccepted(ioDocument, inFilter, PartFor(inFilter),
                  [&](const InterferenceRecord& inRecord) { table.Add(Cells(inRecord)); });
  table.Print(ioOutput);
}

int List(const ListOptions& inOptions, Output& ioOutput) {
  if (inOptions.json && inOptions.csv)
    throw UsageError("list: --json and --csv exclude each other");
  const RecordFilter filter = FilterOf(inOptions.filter);
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  document.RequireInterferences();
  if (inOptions.json)
    PrintJson(document, filter, ioOutput);
  else if (inOptions.csv)
    PrintCsv(document, filter, ioOutput);
  else
    PrintTable(document, filter, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareList(Arguments& ioArguments) {
  const auto options = std::make_shared<ListOptions>();
  ioArguments.Positional("FILE", options->file, "A clash result, or - for standard input");
  ioArguments.Texts("--type", "TYPE", options->filter.types,
                    "Only clash, contact, clearance or error; may be given several times");
  ioArguments.Words("--type", kTypeWords);
  ioArguments.Texts("--status", "STATUS", options->filter.statuses,
                    "Only relevant, irrelevant, not-inspected or error; likewise");
  ioArguments.Words("--status", kStatusWords);
  ioArguments.Text("--result", "NAME", options->filter.result, "Only the result set of this name");
  ioArguments.Text("--product", "TEXT", options->filter.product,
                   "Only with a product whose alias, identifier, instance or label holds TEXT");
  ioArguments.Flag("--json", options->json, "Print a JSON array of all that is known of each");
  ioArguments.Flag("--csv", options->csv, "Print comma-separated values for a spreadsheet");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return List(*options, ioOutput); };
}

}  // namespace lyra
