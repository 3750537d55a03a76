#include "publish/RepeatedResult.h"

#include <algorithm>
#include <pugixml.hpp>
#include <stdexcept>
#include <vector>

std::size_t WriteRepeatedResult(const std::string& inResult, std::size_t inCount,
                                const std::string& inPath) {
  pugi::xml_document document;
  if (!document.load_file(inResult.c_str(), pugi::parse_full))
    throw std::runtime_error(inResult + ": cannot be read");
  pugi::xml_node result =
      document.find_node([](const auto& inNode) { return inNode.child("Interference"); });
  std::vector<pugi::xml_node> originals;
  for (const pugi::xml_node one : result.children("Interference")) originals.push_back(one);
  if (originals.empty()) throw std::runtime_error(inResult + ": no interferences");
  for (std::size_t i = 0; i < inCount; ++i)
    result.append_copy(originals[i % originals.size()])
        .attribute("Name")
        .set_value(("Interference." + std::to_string(i + 1)).c_str());
  for (const pugi::xml_node one : originals) result.remove_child(one);
  result.attribute("NbInterf").set_value(static_cast<unsigned long long>(inCount));
  if (!document.save_file(inPath.c_str(), "  ", pugi::format_indent, pugi::encoding_utf8))
    throw std::runtime_error(inPath + ": cannot be written");
  return std::min(inCount, originals.size());
}
