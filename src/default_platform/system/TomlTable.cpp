#include "default_platform/system/TomlTable.h"

#include <toml++/toml.h>

#include <optional>

namespace ZORDefault {
namespace {

std::optional<TomlValue> IntegersOf(const toml::array& inArray) {
  std::vector<std::int64_t> integers;
  for (const toml::node& element : inArray) {
    const auto* const integer = element.as_integer();
    if (!integer) return std::nullopt;
    integers.push_back(integer->get());
  }
  return integers;
}

std::optional<TomlValue> ValueOf(const toml::node& inNode) {
  if (const auto* const text = inNode.as_string()) return text->get();
  if (const auto* const integer = inNode.as_integer()) return integer->get();
  if (const auto* const number = inNode.as_floating_point()) return number->get();
  if (const auto* const truth = inNode.as_boolean()) return truth->get();
  if (const auto* const array = inNode.as_array()) return IntegersOf(*array);
  return std::nullopt;
}

}  // namespace

std::shared_ptr<const TomlTable> ParseToml(std::string_view inText) {
  try {
    auto table = std::make_shared<TomlTable>();
    for (const auto& [key, node] : toml::parse(inText))
      if (auto value = ValueOf(node)) table->emplace(std::string(key.str()), *std::move(value));
    return table;
  } catch (const toml::parse_error&) {
    return nullptr;
  }
}

}  // namespace ZORDefault
