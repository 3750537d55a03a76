// lyra info FILE…
#include <algorithm>
#include <cstdio>
#include <memory>

#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/JsonDocument.h"
#include "lyra/commands/RecordsJson.h"
#include "lyra/terminal/SafeText.h"
#include "lyra/terminal/Table.h"
#include "lyra/terminal/Terminal.h"
#include "toolkit/records/DocumentRecords.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

struct InfoOptions {
  std::vector<std::string> files;
  bool json = false;
};

const std::string* Find(const AttributeTexts& inAttributes, const char* inName) {
  const auto found = std::find_if(inAttributes.begin(), inAttributes.end(),
                                  [&](const auto& inPair) { return inPair.first == inName; });
  return found == inAttributes.end() ? nullptr : &found->second;
}

std::string Joined(const AttributeTexts& inAttributes) {
  std::string text;
  for (const auto& [name, value] : inAttributes)
    text += (text.empty() ? "" : ", ") + name + " " + value;
  return text;
}

std::string TwoDigits(const std::string& inNumber) {
  return inNumber.size() == 1 ? "0" + inNumber : inNumber;
}

// What a date holds is its writer's affair; day, month and year are what most write.
std::string DateText(const AttributeTexts& inDate) {
  const std::string* day = Find(inDate, "Day");
  const std::string* month = Find(inDate, "Month");
  const std::string* year = Find(inDate, "Year");
  if (inDate.size() != 3 || day == nullptr || month == nullptr || year == nullptr)
    return Joined(inDate);
  return *year + "-" + TwoDigits(*month) + "-" + TwoDigits(*day);
}

std::string Quantity(int inCount, const char* inOne, const char* inMany) {
  return std::to_string(inCount) + " " + (inCount == 1 ? inOne : inMany);
}

std::string ResultText(const ResultSetRecord& inSet) {
  std::string text = inSet.name.empty() ? "(no name)" : inSet.name;
  if (!inSet.computationCase.empty()) text += ", " + inSet.computationCase;
  text += ": " + Quantity(inSet.found, "interference", "interferences");
  if (inSet.declared != inSet.found) text += ", declared " + std::to_string(inSet.declared);
  return text;
}

void AddContents(const DocumentRecord& inRecord, KeyValueList& ioList) {
  if (inRecord.kind == DocumentKind::kComponents)
    ioList.Add("Components", std::to_string(inRecord.components));
  if (inRecord.kind == DocumentKind::kFederator)
    ioList.Add("Linked documents", std::to_string(inRecord.links));
  if (inRecord.kind == DocumentKind::kClash || inRecord.kind == DocumentKind::kInterference)
    ioList.Add("Interferences", std::to_string(inRecord.interferences));
  if (inRecord.kind == DocumentKind::kClash || inRecord.specifications != 0)
    ioList.Add("Specifications", std::to_string(inRecord.specifications));
}

void PrintText(const DocumentRecord& inRecord, Output& ioOutput) {
  KeyValueList list(inRecord.file);
  std::string kind = Description(inRecord.kind);
  kind = kind.substr(kind.find(' ') + 1) + " (" + RootName(inRecord.kind) + ")";
  if (!inRecord.version.empty()) kind += ", version " + inRecord.version;
  list.Add("Kind", kind);
  if (inRecord.error) {
    list.Add("Error", std::to_string(inRecord.error->id));
    list.Add("Message", inRecord.error->message);
  } else {
    list.Add("Document", inRecord.reference);
    list.Add("Responsible", inRecord.responsible);
    list.Add("Date", DateText(inRecord.date));
    list.Add("Specification", Joined(inRecord.specification));
    for (const ResultSetRecord& set : inRecord.results) list.Add("Result", ResultText(set));
    AddContents(inRecord, list);
    list.Add("Server marker", inRecord.serverMarker);
    list.Add("Transaction", inRecord.transaction);
    list.Add("PRC name", inRecord.prcName);
  }
  list.Print(ioOutput);
}

void PrintText(const BcfProject& inProject, const std::string& inFile, Output& ioOutput) {
  KeyValueList list(inFile);
  list.Add("Kind", "BCF file, version " + inProject.version);
  list.Add("Project", inProject.name.empty() ? inProject.guid : inProject.name);
  list.Add("Topics", std::to_string(inProject.topics.size()));
  list.Print(ioOutput);
  if (inProject.topics.empty()) return;
  constexpr TableColumn::Align kRight = TableColumn::Align::kRight;
  Table table({{"Title"},
               {"Type"},
               {"Status"},
               {"Comments", kRight},
               {"Viewpoints", kRight},
               {"Snapshots", kRight},
               {"GUID"}});
  for (const BcfTopic& topic : inProject.topics)
    table.Add({topic.title, topic.type, topic.status, std::to_string(topic.comments.size()),
               std::to_string(topic.viewpoints.size()), std::to_string(topic.Snapshots()),
               topic.guid});
  ioOutput.Write("\n");
  table.Print(ioOutput);
}

void PrintText(const DocumentRecord& inRecord, const std::string&, Output& ioOutput) {
  PrintText(inRecord, ioOutput);
}

/// Prints records as they come: an array when there may be several.
class Printer {
 public:
  Printer(const InfoOptions& inOptions, Output& ioOutput) : options_(inOptions), output_(ioOutput) {
    if (options_.json && options_.files.size() > 1) array_ = std::make_unique<JsonArray>(output_);
  }

  template <class Record>
  void Print(const Record& inRecord, const std::string& inFile) {
    if (array_) {
      array_->Add(inRecord);
    } else if (options_.json) {
      // "version" is that of the document.
      const std::string header = JsonHeaderText("info", OrderedJson::object(), "schemaVersion");
      output_.Write(Behind(header, JsonText(inRecord)) + "\n");
    } else {
      if (!isFirst_) output_.Write("\n");
      PrintText(inRecord, inFile, output_);
    }
    isFirst_ = false;
  }

  void Finish() {
    if (!array_) return;
    array_->Finish();
    output_.Write("\n");
  }

 private:
  const InfoOptions& options_;
  Output& output_;
  std::unique_ptr<JsonArray> array_;
  bool isFirst_ = true;
};

int Info(const InfoOptions& inOptions, Output& ioOutput) {
  Printer printer(inOptions, ioOutput);
  int code = 0;
  for (const std::string& path : inOptions.files) {
    try {
      if (LooksLikeBcf(path)) {
        printer.Print(ReadBcf(path), path);
      } else {
        ClashDocument file(path);
        printer.Print(ReadDocument(file), path);
      }
    } catch (const InputError& error) {
      WriteError("lyra: " + Printable(error.what()) + "\n");
      code = 1;
    }
  }
  printer.Finish();
  return code;
}

}  // namespace

VerbAction DeclareInfo(Arguments& ioArguments) {
  const auto options = std::make_shared<InfoOptions>();
  ioArguments.Positionals("FILE", options->files,
                          "Clash results or BCF files, or - for standard input");
  ioArguments.Flag("--json", options->json, "Print JSON: an object, of several files an array");
  return [options](Output& ioOutput) { return Info(*options, ioOutput); };
}

}  // namespace lyra
