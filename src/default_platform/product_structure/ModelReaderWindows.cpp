// The programs that read models stand on the CAD kernel, which is not built for Windows yet.
#include "default_platform/product_structure/ModelReader.h"

namespace ZORDefault {

std::string ReadModelInChild(const ModelRequest& /*inRequest*/, std::string_view /*inBytes*/,
                             const ModelLimits& /*inLimits*/, const ModelProgram& /*inProgram*/) {
  throw ModelReaderError{ModelErrorKind::kNoReader,
                         "cannot be read: this build for Windows reads no CAD models"};
}

}  // namespace ZORDefault
