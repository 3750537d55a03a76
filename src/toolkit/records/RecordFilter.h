// Which interferences are meant.
#ifndef ZOR_TOOLKIT_RECORDS_RECORD_FILTER_H
#define ZOR_TOOLKIT_RECORDS_RECORD_FILTER_H

#include <optional>
#include <span>
#include <string>
#include <vector>

#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

/// The text with differences of letter case taken out, character by character.
ZOR_TOOLKIT_EXPORT std::string CaseFolded(std::string_view inText);
/// The same of a word, with "-" and "_" as spaces.
ZOR_TOOLKIT_EXPORT std::string WordKey(std::string_view inWord);

/// All conditions must hold; an absent one always holds.
class ZOR_TOOLKIT_EXPORT RecordFilter {
 public:
  /// Any of several words; letter case and the sign between two words do not matter.
  void SetTypes(const std::vector<std::string>& inWords);
  void SetStatuses(const std::vector<std::string>& inWords);
  void SetResult(const std::string& inName) { result_ = inName; }
  /// A text that the alias, id, instance or label of one of the products holds in any letter case.
  void SetProduct(const std::string& inText) { product_ = CaseFolded(inText); }

  /// Whether Accepts looks at the products' labels.
  bool NeedsLabels() const { return product_.has_value(); }
  bool Accepts(const InterferenceRecord& inRecord) const;

 private:
  std::vector<std::string> types_, statuses_;
  std::optional<std::string> result_, product_;
};

// As a user gives conditions

inline constexpr const char* kTypeWords[] = {"clash", "contact", "clearance", "error"};
inline constexpr const char* kStatusWords[] = {"relevant", "irrelevant", "not-inspected", "error"};

/// What is said of a word that an option does not know.
ZOR_TOOLKIT_EXPORT UsageError UnknownWord(const std::string& inOption, const std::string& inWord,
                                          std::span<const char* const> inKnown);

/// As given; empty for no condition.
struct FilterOptions {
  std::vector<std::string> types;     ///< of kTypeWords in any letter case
  std::vector<std::string> statuses;  ///< of kStatusWords, likewise; also "not inspected"
  std::string result, product;
};

/// Raises UsageError for a word that is not known.
ZOR_TOOLKIT_EXPORT RecordFilter FilterOf(const FilterOptions& inOptions);
/// From conditions such as "type=clash,status=relevant": type, status, result and product, each as
/// the options of `lyra list` take it. Several words of one kind are alternatives. Raises UsageError.
ZOR_TOOLKIT_EXPORT RecordFilter FilterOfConditions(const std::vector<std::string>& inLists);

}  // namespace ZORToolkit

#endif
