// Which interferences a list shows.
#ifndef ZOR_TOOLS_LYRA_LIST_FILTER_H
#define ZOR_TOOLS_LYRA_LIST_FILTER_H

#include <optional>
#include <string>
#include <vector>

#include "toolkit/records/InterferenceRecord.h"

namespace lyra {

inline constexpr const char* kTypeWords[] = {"clash", "contact", "clearance", "error"};
inline constexpr const char* kStatusWords[] = {"relevant", "irrelevant", "not-inspected", "error"};

/// All conditions must hold; an absent one always holds.
class ListFilter {
 public:
  /// Clash, contact, clearance or error in any letter case; any of several. Raises UsageError for
  /// another word.
  void SetTypes(const std::vector<std::string>& inWords);
  /// Relevant, irrelevant, not-inspected (or "not inspected") or error, likewise.
  void SetStatuses(const std::vector<std::string>& inWords);
  void SetResult(const std::string& inName) { result_ = inName; }
  /// A text that the alias, id, instance or label of one of the products holds in any letter case.
  void SetProduct(const std::string& inText);

  /// Whether Accepts looks at the products' labels.
  bool NeedsLabels() const { return product_.has_value(); }
  bool Accepts(const ZORToolkit::InterferenceRecord& inRecord) const;

 private:
  std::vector<std::string> types_, statuses_;
  std::optional<std::string> result_, product_;
};

}  // namespace lyra

#endif
