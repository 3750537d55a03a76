// What the verbs that compare and settle results have in common.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_REVIEW_INPUT_H
#define ZOR_TOOLS_LYRA_COMMANDS_REVIEW_INPUT_H

#include <nlohmann/json.hpp>
#include <string>

#include "lyra/Arguments.h"
#include "lyra/terminal/Output.h"
#include "toolkit/review/ReviewedFile.h"

namespace lyra {

using OrderedJson = nlohmann::ordered_json;

using ZORToolkit::BytesOfInput;
using ReviewInput = ZORToolkit::ReviewedFile;

/// Writes a result: as it was read when nothing in it changed, else as the document is now.
void WriteReviewed(ReviewInput& ioInput, const std::string& inPath, Output& ioOutput);

/// A length in millimetres, not negative. Raises UsageError.
/// @param inText with a decimal point or comma; empty for inDefault.
double LengthOf(const char* inOption, const std::string& inText, double inDefault);

/// The options of how results are compared.
struct CompareOptions {
  std::string tolerance, place, language;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError.
  ZORToolkit::DiffOptions Get() const;
};

/// What every JSON document of the command that is an object begins with: which schema describes it
/// (resources/NAME.schema.json), its version, the units, the tool, and the filters that were applied.
OrderedJson JsonHeader(const char* inName, const OrderedJson& inFilters = OrderedJson::object());
/// The same as text to write members behind: without the closing brace.
std::string JsonHeaderText(const char* inName);

/// One line of JSON text, safe to print on a terminal, without line feed.
std::string JsonLine(const OrderedJson& inJson);
/// An array of such lines.
template <class Rows>
std::string JsonRows(const Rows& inRows) {
  std::string text = "[";
  for (const OrderedJson& row : inRows) text += (text.size() > 1 ? ",\n" : "\n") + JsonLine(row);
  return text + (text.size() > 1 ? "\n]" : "]");
}

}  // namespace lyra

#endif
