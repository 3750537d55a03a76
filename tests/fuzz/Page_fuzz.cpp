// A style sheet, applied to a small report.
#include "foundation/PluginLoader.h"
#include "fuzz/Fuzz.h"
#include "toolkit/publishing/PageMaker.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  using ZORToolkit::MakePageFunction;
  std::string reason;
  static auto* const makePage = reinterpret_cast<MakePageFunction*>(
      ZORFoundation::FindPluginFunction("libZORPage.so", ZORToolkit::kMakePageName, reason));
  fuzz::Require(makePage != nullptr, reason);
  ZORToolkit::Page page;
  const bool isMade = makePage({"<ClashElement><ClashResult Name=\"r\"/></ClashElement>",
                                fuzz::Text(inBytes, inSize), "text"},
                               page);
  fuzz::Require(isMade || !page.reason.empty(), "no page and no reason");
  return 0;
}
