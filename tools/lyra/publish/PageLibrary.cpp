#include "lyra/publish/PageLibrary.h"

#include <cstdio>

#include "foundation/PluginLoader.h"
#include "lyra/CommandErrors.h"
#include "lyra/SafeText.h"

namespace lyra {
namespace {

template <typename Function>
Function* FindFunction(const char* inName) {
  std::string reason;
  void* const function = ZORFoundation::FindPluginFunction("libZORPage.so", inName, reason);
  if (function == nullptr)
    throw InputError("the library that makes pages cannot be loaded: " + reason);
  return reinterpret_cast<Function*>(function);
}

}  // namespace

std::string PageLibrary::MakePage(const PageRequest& inRequest) const {
  Page page;
  if (!FindFunction<MakePageFunction>(kMakePageName)(inRequest, page))
    throw InputError(inRequest.styleSheetName + ": " + page.reason);
  if (!page.messages.empty())
    std::fprintf(stderr, "lyra: warning: %s: %s\n", Printable(inRequest.styleSheetName).c_str(),
                 Printable(page.messages.substr(0, page.messages.find('\n'))).c_str());
  return page.bytes;
}

const char* PageLibrary::ReportStyleSheet() const {
  return FindFunction<ShippedTextFunction>(kReportStyleSheetName)();
}

const char* PageLibrary::ReportType() const {
  return FindFunction<ShippedTextFunction>(kReportTypeName)();
}

}  // namespace lyra
