// A style sheet, applied to a small report.
#include "foundation/PluginLoader.h"
#include "fuzz/Fuzz.h"
#include "toolkit/publishing/page/PageLibrary.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  using ZORToolkit::PageLibraryFunction;
  std::string reason;
  static auto* const library = reinterpret_cast<PageLibraryFunction*>(
      ZORFoundation::FindPluginFunction("ZORPage", ZORToolkit::kPageLibraryName, reason));
  fuzz::Require(library != nullptr, reason);
  ZORToolkit::Page page;
  const bool isMade = library()->makePage({"<ClashElement><ClashResult Name=\"r\"/></ClashElement>",
                                           fuzz::Text(inBytes, inSize), "text"},
                                          page);
  fuzz::Require(isMade || !page.reason.empty(), "no page and no reason");
  return 0;
}
