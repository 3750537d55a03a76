// Settings in TOML files.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLSETTINGREPOSITORY_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_TOMLSETTINGREPOSITORY_H

#include <algorithm>
#include <map>
#include <memory>
#include <mutex>
#include <string>

#include "default_platform/system/SearchPath.h"
#include "platform/system/ZORSettingRepository.h"

namespace ZORDefault {

// How a value of a file converts to what is asked for; false when it does not, and nothing changes.
bool ConvertTomlValue(const TomlValue& inValue, ZORString& outValue);
bool ConvertTomlValue(const TomlValue& inValue, ZORUnicodeString& outValue);
bool ConvertTomlValue(const TomlValue& inValue, int& outValue);
bool ConvertTomlValue(const TomlValue& inValue, double& outValue);

/// A repository that reads NAME.toml of a folder of the setting directories at each call.
/// @tparam Repository ZORSettingRepository or ZORSysSettingRepository.
template <class Repository>
class TomlSettingRepository final : public Repository {
 public:
  /// The one repository of a name; null when its file is not there or damaged.
  static Repository* Find(const char* inFolder, const char* inName) {
    if (!inName || !ReadSettingFile(inFolder, inName)) return nullptr;
    // Never destroyed: callers keep repositories until the process ends.
    static auto* const repositories =
        new std::map<std::string, std::unique_ptr<TomlSettingRepository>, std::less<>>();
    static std::mutex mutex;
    const std::lock_guard lock(mutex);
    auto& repository = (*repositories)[inName];
    if (!repository) repository.reset(new TomlSettingRepository(inFolder, inName));
    return repository.get();
  }

  HRESULT ReadSetting(const char* inName, ZORString* outValue) override {
    return Read(inName, outValue);
  }
  HRESULT ReadSetting(const char* inName, ZORUnicodeString* outValue) override {
    return Read(inName, outValue);
  }
  HRESULT ReadSetting(const char* inName, int* outValue) override { return Read(inName, outValue); }
  HRESULT ReadSetting(const char* inName, double* outValue) override {
    return Read(inName, outValue);
  }
  HRESULT ReadSetting(const char* inName, int* outValues, int inCount) override {
    return ReadNumbers(inName, outValues, inCount);
  }

 private:
  TomlSettingRepository(const char* inFolder, const char* inName)
      : folder_(inFolder), name_(inName) {}

  template <class Value>
  HRESULT Read(const char* inName, Value* outValue) const {
    if (!inName || !outValue) return E_INVALIDARG;
    const auto table = ReadSettingFile(folder_, name_);
    const TomlValue* const value = ValueOf(table, inName);
    return value && ConvertTomlValue(*value, *outValue) ? S_OK : E_FAIL;
  }

  HRESULT ReadNumbers(const char* inName, int* outValues, int inCount) const {
    if (!inName || !outValues || inCount < 1) return E_INVALIDARG;
    const auto table = ReadSettingFile(folder_, name_);
    const TomlValue* const value = ValueOf(table, inName);
    if (!value) return E_FAIL;
    std::vector<int> numbers;
    if (const auto* const array = std::get_if<std::vector<std::int64_t>>(value)) {
      for (const std::int64_t element : *array)
        if (!ConvertTomlValue(TomlValue(element), numbers.emplace_back())) return E_FAIL;
    } else if (!ConvertTomlValue(*value, numbers.emplace_back())) {
      return E_FAIL;
    }
    if (static_cast<std::size_t>(inCount) > numbers.size()) return E_FAIL;
    std::copy_n(numbers.begin(), inCount, outValues);
    return S_OK;
  }

  static const TomlValue* ValueOf(const std::shared_ptr<const TomlTable>& inTable,
                                  const char* inName) {
    if (!inTable) return nullptr;
    const auto found = inTable->find(std::string_view(inName));
    return found == inTable->end() ? nullptr : &found->second;
  }

  const std::string folder_;
  const std::string name_;
};

}  // namespace ZORDefault

#endif
