// lyra tree MODEL
#include <memory>

#include "ZORLyraGeneralServices.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/Table.h"
#include "toolkit/records/DocumentText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr std::size_t kDrawnLevels = 40;  // deeper ones are numbered instead

struct TreeOptions {
  std::string file;
  std::optional<long long> depth;
  bool json = false, leaves = false;
  ModelReading reading;
};

// The lines that lead to a product, then its alias.
std::string Drawn(const ProductLevels& inLevels, const std::string& inAlias) {
  const std::size_t below = inLevels.size() - 1;
  if (below > kDrawnLevels) return "(level " + std::to_string(below) + ") " + inAlias;
  std::string lines;
  for (std::size_t i = 1; i < below; ++i) lines += inLevels[i].isLast ? "   " : "│  ";
  if (below > 0) lines += inLevels.back().isLast ? "└─ " : "├─ ";
  return lines + inAlias;
}

std::vector<TableColumn> Columns(const char* inFirst, Cut inCut) {
  using Align = TableColumn::Align;
  return {{inFirst, Align::kLeft, inCut},          {"Part", Align::kLeft, Cut::kEnd},
          {"Position", Align::kLeft, Cut::kEnd},   {"Turned", Align::kLeft, Cut::kEnd},
          {"Triangles", Align::kRight, Cut::kEnd}, {"Colour", Align::kLeft, Cut::kEnd}};
}

void AddRow(const std::string& inFirst, const ModelProductRecord& inRecord, bool inIsAssembly,
            Table& ioTable) {
  const bool hasCount = !inIsAssembly || inRecord.triangles != 0;
  ioTable.Add({inFirst, inRecord.part, PositionShown(inRecord.placement),
               TurnShown(inRecord.placement), hasCount ? std::to_string(inRecord.triangles) : "",
               inRecord.colour.value_or("")});
}

void PrintTree(const ZORIProduct_var& inRoot, std::size_t inDepth, Output& ioOutput) {
  Table table(Columns("Product", Cut::kEnd));
  WalkProducts(inRoot, inDepth, [&](const ProductLevels& inLevels) {
    const ModelProductRecord record = ReadModelProduct(inLevels.back().product);
    AddRow(Drawn(inLevels, record.alias), record, inLevels.back().ChildCount() != 0, table);
  });
  table.Print(ioOutput);
}

// One product a line. A product whose children are not shown has no "children".
void PrintTreeJson(const ZORIProduct_var& inRoot, std::size_t inDepth, Output& ioOutput) {
  bool isFirst = true;  // among its parent's children
  OrderedJson filters = OrderedJson::object();
  if (inDepth != kAllLevels) filters["depth"] = inDepth;
  const auto showsChildren = [&](const ProductLevels& inLevels) {
    return inLevels.size() <= inDepth || inLevels.back().ChildCount() == 0;
  };
  const auto enter = [&](const ProductLevels& inLevels) {
    std::string text = JsonText(ReadModelProduct(inLevels.back().product));
    text.pop_back();  // the object stays open
    if (inLevels.size() > 1)
      ioOutput.Write(isFirst ? "\n" : ",\n");
    else
      text = Behind(JsonHeaderText("tree", filters), text);
    ioOutput.Write(showsChildren(inLevels) ? text + ",\"children\":[" : text);
    isFirst = true;
  };
  const auto leave = [&](const ProductLevels& inLevels) {
    ioOutput.Write(showsChildren(inLevels) ? "]}" : "}");
    isFirst = false;
  };
  WalkProducts(inRoot, inDepth, enter, leave);
  ioOutput.Write("\n");
}

std::vector<ModelProductRecord> ReadLeaves(const ZORIProduct_var& inRoot) {
  ZORListValZORBaseUnknown_var products;
  ZORLyraGeneralServices::Expand(inRoot.GetInterface(), products);
  std::vector<ModelProductRecord> records;
  for (int i = 1; i <= products.Size(); ++i) {
    const ZORIProduct_var product = products[i];
    records.push_back(ReadModelProduct(product));
    records.back().path = Utf8(ZORLyraGeneralServices::GetPathRoot(product));
  }
  return records;
}

void PrintLeaves(const std::vector<ModelProductRecord>& inRecords, Output& ioOutput) {
  Table table(Columns("Path", Cut::kStart));
  for (const ModelProductRecord& record : inRecords) AddRow(*record.path, record, false, table);
  table.Print(ioOutput);
}

void PrintLeavesJson(const std::vector<ModelProductRecord>& inRecords, Output& ioOutput) {
  WriteJsonLines(inRecords, ioOutput);
}

int Tree(const TreeOptions& inOptions, Output& ioOutput) {
  if (inOptions.depth.value_or(0) < 0) throw UsageError("tree: --depth cannot be negative");
  if (inOptions.leaves && inOptions.depth)
    throw UsageError("tree: --depth and --leaves exclude each other");
  const ZORIProduct_var root = OpenModelFile(inOptions.file, inOptions.reading).root;
  const std::size_t depth =
      inOptions.depth ? static_cast<std::size_t>(*inOptions.depth) : kAllLevels;
  if (inOptions.leaves)
    (inOptions.json ? PrintLeavesJson : PrintLeaves)(ReadLeaves(root), ioOutput);
  else
    (inOptions.json ? PrintTreeJson : PrintTree)(root, depth, ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareTree(Arguments& ioArguments) {
  const auto options = std::make_shared<TreeOptions>();
  ioArguments.Positional("MODEL", options->file, "A STEP, IGES, glTF, OBJ or STL file");
  ioArguments.Number("--depth", "N", options->depth, "Only so many levels below the root");
  ioArguments.Flag("--leaves", options->leaves,
                   "Only products that carry geometry, by their paths from below the root");
  ioArguments.Flag("--json", options->json, "Print all of it as JSON");
  options->reading.Declare(ioArguments);
  return [options](Output& ioOutput) { return Tree(*options, ioOutput); };
}

}  // namespace lyra
