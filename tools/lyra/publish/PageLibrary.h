// The library that applies style sheets, loaded when the first one is.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_PAGELIBRARY_H
#define ZOR_TOOLS_LYRA_PUBLISH_PAGELIBRARY_H

#include "lyra/publish/PageMaker.h"

namespace lyra {

/// All raise InputError when the library is not there.
class PageLibrary {
 public:
  /// @return the page. Raises InputError with the reason when there is none.
  std::string MakePage(const PageRequest& inRequest) const;
  const char* ReportStyleSheet() const;
  const char* ReportType() const;
};

}  // namespace lyra

#endif
