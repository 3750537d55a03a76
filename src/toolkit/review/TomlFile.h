// Settings files in TOML whose every key is known; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_TOML_FILE_H
#define ZOR_TOOLKIT_REVIEW_TOML_FILE_H

#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/Rules.h"

namespace ZORToolkit {

/// A table whose keys are taken one by one: what is left at the end is an error. Errors name file,
/// line and column.
class TomlTable {
 public:
  /// Raises Error for what is no TOML.
  static TomlTable Parse(const std::string& inName, std::string_view inText);
  ~TomlTable();
  TomlTable(TomlTable&&) noexcept;

  // What a key holds; nothing, or an empty list, when it is missing
  std::optional<std::string> Text(const char* inKey);
  std::optional<double> Number(const char* inKey);
  std::optional<bool> Flag(const char* inKey);
  /// A text counts as a list of one.
  std::vector<std::string> Texts(const char* inKey);
  /// Each of "[[key]]".
  void ForEachTable(const char* inKey, const std::function<void(TomlTable&)>& inVisit);

  std::string RequiredText(const char* inKey);
  /// One of several words in any letter case, "-" for a space.
  std::string Word(const char* inKey, const std::string& inText,
                   const std::vector<std::string>& inKnown) const;
  std::vector<std::string> Words(const char* inKey, const std::vector<std::string>& inKnown);
  /// The keys of a condition on an interference.
  InterferenceCondition Condition();
  /// Raises Error for a key that nobody took.
  void Finish() const;
  /// Raises Error at a key, or at the table.
  [[noreturn]] void Fail(const char* inKey, const std::string& inReason) const;

 private:
  struct Data;
  explicit TomlTable(std::unique_ptr<Data> ioData);
  std::unique_ptr<Data> data_;
};

inline const std::vector<std::string> kTypesInToml = {"Clash", "Contact", "Clearance", "error"};
inline const std::vector<std::string> kStatusesInToml = {"Relevant", "Irrelevant", "Not inspected",
                                                         "error"};

}  // namespace ZORToolkit

#endif
