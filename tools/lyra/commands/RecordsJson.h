// Records as JSON, and JSON as text.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_RECORDS_JSON_H
#define ZOR_TOOLS_LYRA_COMMANDS_RECORDS_JSON_H

#include <string>

#include "lyra/commands/Model.h"
#include "lyra/terminal/Output.h"
#include "toolkit/exchange/bcf/BcfFile.h"
#include "toolkit/records/RecordFields.h"
#include "toolkit/review/ReviewFields.h"

namespace lyra {

/// A record as one line of UTF-8 JSON, without line feed. Characters that could drive a terminal
/// are escaped; bytes that are no UTF-8 become U+FFFD.
std::string JsonText(const ZORToolkit::IdentifiedRecord& inRecord);
std::string JsonText(const ZORToolkit::DocumentRecord& inRecord);
std::string JsonText(const ZORToolkit::ComponentRecord& inRecord);
std::string JsonText(const ZORToolkit::SpecificationRecord& inRecord);
std::string JsonText(const ZORToolkit::LinkRecord& inRecord);
std::string JsonText(const ZORToolkit::InterferenceGroup& inGroup);
std::string JsonText(const ZORToolkit::IdentifiedEntry& inEntry);
std::string JsonText(const ModelProductRecord& inRecord);
std::string JsonText(const ZORToolkit::BcfProject& inProject);

/// Writes a JSON array record by record, one a line, so that no more than one is in memory.
class JsonArray {
 public:
  explicit JsonArray(Output& ioOutput);
  JsonArray(const JsonArray&) = delete;
  JsonArray& operator=(const JsonArray&) = delete;

  template <class Record>
  void Add(const Record& inRecord) {
    AddText(JsonText(inRecord));
  }
  /// Closes the array, without a line feed behind it.
  void Finish();

 private:
  void AddText(const std::string& inText);

  Output& output_;
  bool isEmpty_ = true;
};

/// Writes records as one JSON array and ends the line.
template <class Records>
void WriteJsonLines(const Records& inRecords, Output& ioOutput) {
  JsonArray array(ioOutput);
  for (const auto& record : inRecords) array.Add(record);
  array.Finish();
  ioOutput.Write("\n");
}

}  // namespace lyra

#endif
