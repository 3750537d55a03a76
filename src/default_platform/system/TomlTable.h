// The entries of a TOML file.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLTABLE_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLTABLE_H

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <variant>
#include <vector>

namespace ZORDefault {

/// The value of one entry.
using TomlValue = std::variant<std::string, std::int64_t, double, bool, std::vector<std::int64_t>>;

/// The entries at the top of a file, by key. Entries of other kinds (tables, dates, mixed arrays)
/// are left out.
using TomlTable = std::map<std::string, TomlValue, std::less<>>;

/// @return the entries, or null when the text is not TOML.
std::shared_ptr<const TomlTable> ParseToml(std::string_view inText);

}  // namespace ZORDefault

#endif
