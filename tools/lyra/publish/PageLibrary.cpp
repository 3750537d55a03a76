#include "lyra/publish/PageLibrary.h"

#include <dlfcn.h>

#include <cstdio>

#include "lyra/CommandErrors.h"
#include "lyra/SafeText.h"

namespace lyra {

PageLibrary::PageLibrary() : library_(dlopen("libZORPage.so", RTLD_NOW | RTLD_LOCAL)) {
  if (library_ == nullptr)
    throw InputError(std::string("the library that makes pages cannot be loaded: ") + dlerror());
}

void* PageLibrary::Function(const char* inName) const {
  void* const function = dlsym(library_, inName);
  if (function == nullptr) throw InputError(std::string("libZORPage.so has no ") + inName);
  return function;
}

std::string PageLibrary::MakePage(const PageRequest& inRequest) const {
  Page page;
  if (!reinterpret_cast<MakePageFunction*>(Function(kMakePageName))(inRequest, page))
    throw InputError(inRequest.styleSheetName + ": " + page.reason);
  if (!page.messages.empty())
    std::fprintf(stderr, "lyra: warning: %s: %s\n", Printable(inRequest.styleSheetName).c_str(),
                 Printable(page.messages.substr(0, page.messages.find('\n'))).c_str());
  return page.bytes;
}

const char* PageLibrary::ReportStyleSheet() const {
  return reinterpret_cast<ShippedTextFunction*>(Function(kReportStyleSheetName))();
}

const char* PageLibrary::ReportType() const {
  return reinterpret_cast<ShippedTextFunction*>(Function(kReportTypeName))();
}

}  // namespace lyra
