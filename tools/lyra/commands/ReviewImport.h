// lyra review import RESULT FILE -o REVIEW.json
#ifndef ZOR_TOOLS_LYRA_COMMANDS_REVIEW_IMPORT_H
#define ZOR_TOOLS_LYRA_COMMANDS_REVIEW_IMPORT_H

#include <string>

#include "lyra/terminal/Output.h"
#include "toolkit/review/Group.h"

namespace lyra {

struct ReviewImportOptions {
  std::string result, file, output;
  ZORToolkit::GroupOptions grouping;
  bool json = false;
};

int ImportReview(const ReviewImportOptions& inOptions, Output& ioOutput);

}  // namespace lyra

#endif
