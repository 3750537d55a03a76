// The library that applies style sheets, loaded when the first one is.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_PAGELIBRARY_H
#define ZOR_TOOLS_LYRA_PUBLISH_PAGELIBRARY_H

#include "lyra/publish/PageMaker.h"

namespace lyra {

/// Raises InputError when the library is not there.
class PageLibrary {
 public:
  PageLibrary();

  /// @return the page. Raises InputError with the reason when there is none.
  std::string MakePage(const PageRequest& inRequest) const;
  const char* ReportStyleSheet() const;
  const char* ReportType() const;

 private:
  void* Function(const char* inName) const;

  void* library_;  // never unloaded: libxml2 keeps hold of what it was given
};

}  // namespace lyra

#endif
