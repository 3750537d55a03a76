// Which interferences are meant.
#ifndef ZOR_TOOLKIT_RECORDS_RECORD_FILTER_H
#define ZOR_TOOLKIT_RECORDS_RECORD_FILTER_H

#include <optional>
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

}  // namespace ZORToolkit

#endif
