#include "lyra/commands/JsonDocument.h"

#include "lyra/terminal/SafeText.h"

namespace lyra {

OrderedJson JsonHeader(const char* inName, const OrderedJson& inFilters, const char* inVersionKey) {
  return {{"$schema", std::string("urn:zorlyra:schema:").append(inName)},
          {inVersionKey, 1},
          {"units", {{"length", "mm"}}},
          {"tool", {{"name", "lyra"}, {"version", LYRA_VERSION}}},
          {"filters", inFilters}};
}

std::string JsonHeaderText(const char* inName, const OrderedJson& inFilters,
                           const char* inVersionKey) {
  std::string text = JsonLine(JsonHeader(inName, inFilters, inVersionKey));
  text.pop_back();
  return text;
}

std::string JsonLine(const OrderedJson& inJson) {
  return EscapedForJson(inJson.dump(-1, ' ', false, OrderedJson::error_handler_t::replace));
}

}  // namespace lyra
