// How interferences are grouped, as options of a verb.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_GROUP_OPTIONS_H
#define ZOR_TOOLS_LYRA_COMMANDS_GROUP_OPTIONS_H

#include <string>
#include <vector>

#include "lyra/Arguments.h"
#include "toolkit/review/Group.h"

namespace lyra {

struct GroupVerbOptions {
  std::vector<std::string> by;
  std::string distance;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError.
  ZORToolkit::GroupOptions Get() const;
};

}  // namespace lyra

#endif
