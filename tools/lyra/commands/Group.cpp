// lyra group RESULT
#include <algorithm>
#include <memory>
#include <sstream>

#include "lyra/Verbs.h"
#include "lyra/commands/CommonOptions.h"
#include "lyra/commands/GroupOptions.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/commands/ReviewInput.h"
#include "lyra/terminal/Table.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr const char* kCriteria[] = {"parts", "assemblies", "place", "product"};

struct GroupOptionsOfVerb {
  std::string file, language;
  GroupVerbOptions grouping;
  bool json = false;
};

/// Groups inside one that hold no less than it are left out: they say nothing new.
void AddRows(const GroupList& inGroups, int inDepth, Table& ioTable) {
  for (const InterferenceGroup group : inGroups) {
    ioTable.Add(
        {std::to_string(group.Members().size()), group.Worst() ? Number(*group.Worst()).text : "",
         std::to_string(group.Representative() + 1), Name(group.By()),
         std::string(2 * static_cast<std::size_t>(inDepth), ' ') + group.Label(), group.Id()});
    GroupList inner = group.Groups();
    while (inner.size() == 1) inner = inner[0].Groups();
    AddRows(inner, inDepth + 1, ioTable);
  }
}

int Group(const GroupOptionsOfVerb& inOptions, Output& ioOutput) {
  const GroupOptions options = inOptions.grouping.Get();
  ChooseLanguage(inOptions.language);
  ClashDocument document(inOptions.file);
  const ReviewedResult result = ReadForReview(document, ReadingForGroups(options));
  const auto groups = GroupInterferences(result, options);
  if (inOptions.json) {
    WriteJsonLines(groups, ioOutput);
    return 0;
  }
  std::vector<TableColumn> columns;
  for (const char* const header : {"Size", "Worst", "N", "By", "Group", "Id"})
    columns.push_back({header});
  columns[0].align = columns[1].align = columns[2].align = TableColumn::Align::kRight;
  columns[4].cut = Cut::kStart;
  Table table(columns);
  AddRows(groups, 0, table);
  table.Print(ioOutput);
  return 0;
}

}  // namespace

void GroupVerbOptions::Declare(Arguments& ioArguments) {
  ioArguments.Texts("--by", "CRITERIA", by,
                    "A list of parts, assemblies, place, product, each inside the one before "
                    "(default: the first three)");
  ioArguments.Words("--by", kCriteria);
  ioArguments.Text("--distance", "MM", distance,
                   "Interferences of one place are no farther from the next (default: 50)");
}

GroupOptions GroupVerbOptions::Get() const {
  GroupOptions options;
  options.distance = LengthOf("--distance", distance, options.distance);
  if (by.empty()) return options;
  options.by.clear();
  for (const std::string& list : by) {
    if (list.empty()) ChosenWord("--by", list, kCriteria);
    std::istringstream words(list);
    for (std::string word; std::getline(words, word, ',');)
      options.by.push_back(static_cast<GroupBy>(ChosenWord("--by", word, kCriteria)));
  }
  return options;
}

VerbAction DeclareGroup(Arguments& ioArguments) {
  const auto options = std::make_shared<GroupOptionsOfVerb>();
  ioArguments.Positional("RESULT", options->file, "A clash result, or - for standard input");
  options->grouping.Declare(ioArguments);
  ioArguments.Flag("--json", options->json, "Print one JSON document");
  ioArguments.Language(options->language);
  return [options](Output& ioOutput) { return Group(*options, ioOutput); };
}

}  // namespace lyra
