// JSON documents: what they begin with, and their lines.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_JSON_DOCUMENT_H
#define ZOR_TOOLS_LYRA_COMMANDS_JSON_DOCUMENT_H

#include <nlohmann/json.hpp>
#include <string>

namespace lyra {

using OrderedJson = nlohmann::ordered_json;

/// What every JSON document of the command that is an object begins with: which schema describes it
/// (resources/NAME.schema.json), its version, the units, the tool, and the filters that were applied.
/// @param inVersionKey another where the document has a "version" of its own.
OrderedJson JsonHeader(const char* inName, const OrderedJson& inFilters = OrderedJson::object(),
                       const char* inVersionKey = "version");
/// The same as text to write members behind: without the closing brace.
std::string JsonHeaderText(const char* inName, const OrderedJson& inFilters = OrderedJson::object(),
                           const char* inVersionKey = "version");
/// The text of an object that is not empty, or of its beginning, behind such a text.
inline std::string Behind(const std::string& inHeader, const std::string& inObject) {
  return inHeader + "," + inObject.substr(1);
}

/// One line of JSON text, safe to print on a terminal, without line feed. Bytes that are no UTF-8
/// become U+FFFD.
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
