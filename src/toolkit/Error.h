// What the toolkit raises.
#ifndef ZOR_TOOLKIT_ERROR_H
#define ZOR_TOOLKIT_ERROR_H

#include <stdexcept>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// What was asked for cannot be done with this input or output. what() is one line of UTF-8 that
/// names the file and the reason.
class ZOR_TOOLKIT_EXPORT Error : public std::runtime_error {
 public:
  using std::runtime_error::runtime_error;
};

}  // namespace ZORToolkit

#endif
