// Which interferences are published.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_ONLYFILTER_H
#define ZOR_TOOLS_LYRA_PUBLISH_ONLYFILTER_H

#include <string>
#include <vector>

#include "lyra/ListFilter.h"

namespace lyra {

/// From conditions such as "type=clash,status=relevant": type, status, result and product, each as
/// the options of `lyra list` take it. Several words of one kind are alternatives. Raises UsageError
/// for what is no condition.
ListFilter ParseOnly(const std::vector<std::string>& inConditions);

}  // namespace lyra

#endif
