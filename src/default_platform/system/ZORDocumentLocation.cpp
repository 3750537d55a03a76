#include "platform/system/ZORDocumentLocation.h"

#include <string>
#include <string_view>

#include "default_platform/system/TomlFiles.h"
#include "foundation/Process.h"
#include "platform/system/ZORGetEnv.h"

namespace {

// Replaces every ${VARIABLE}; false when one is not closed or not set.
bool Expand(std::string_view inText, std::string& outText) {
  for (;;) {
    const std::size_t start = inText.find("${");
    outText += inText.substr(0, start);
    if (start == inText.npos) return true;
    const std::size_t end = inText.find('}', start);
    if (end == inText.npos) return false;
    const std::string variable(inText.substr(start + 2, end - start - 2));
    const char* const value = variable.empty() ? nullptr : ZORGetEnv(variable.c_str());
    if (!value) return false;
    outText += value;
    inText.remove_prefix(end + 1);
  }
}

}  // namespace

const char* ZORGetEnv(const char* inName) {
  return inName ? ZORFoundation::ReadEnvironment(inName) : nullptr;
}

HRESULT ZORGetDLName(const ZORUnicodeString& inName, ZORUnicodeString** outDirectory) {
  if (!outDirectory) return E_INVALIDARG;
  *outDirectory = nullptr;
  const auto table = ZORDefault::ReadSettingFile("", "DLNames");
  if (!table) return E_FAIL;
  const auto entry = table->find(std::string_view(inName.ConvertToChar()));
  if (entry == table->end()) return E_FAIL;
  const std::string* const directory = std::get_if<std::string>(&entry->second);
  if (!directory) return E_FAIL;
  *outDirectory = new ZORUnicodeString(directory->c_str());
  return S_OK;
}

HRESULT ZORExpandString(ZORUnicodeString* ioText) {
  if (!ioText) return E_INVALIDARG;
  // A text without a placeholder keeps even what the narrow form cannot hold.
  if (ioText->SearchSubString("${") < 0) return S_OK;
  std::string expanded;
  if (!Expand(ioText->ConvertToChar(), expanded)) return E_FAIL;
  ioText->BuildFromUTF8(expanded.data(), expanded.size());
  return S_OK;
}
