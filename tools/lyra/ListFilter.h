// Which interferences a user asks for.
#ifndef ZOR_TOOLS_LYRA_LIST_FILTER_H
#define ZOR_TOOLS_LYRA_LIST_FILTER_H

#include <string>
#include <vector>

#include "toolkit/records/RecordFilter.h"

namespace lyra {

inline constexpr const char* kTypeWords[] = {"clash", "contact", "clearance", "error"};
inline constexpr const char* kStatusWords[] = {"relevant", "irrelevant", "not-inspected", "error"};

/// As given; empty for no condition.
struct FilterOptions {
  std::vector<std::string> types;     ///< of kTypeWords in any letter case
  std::vector<std::string> statuses;  ///< of kStatusWords, likewise; also "not inspected"
  std::string result, product;
};

/// Raises UsageError for a word that is not known.
ZORToolkit::RecordFilter FilterOf(const FilterOptions& inOptions);

}  // namespace lyra

#endif
