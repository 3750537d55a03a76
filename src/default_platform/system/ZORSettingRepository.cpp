#include "platform/system/ZORSettingRepository.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <limits>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "default_platform/SettingOverride.h"
#include "default_platform/system/TomlFiles.h"
#include "platform/system/ZORSysSettingRepository.h"

namespace ZORDefault {
namespace {

// Text of a scalar; nothing for an array.
struct ToText {
  bool operator()(const std::string& inText) { return text = inText, true; }
  bool operator()(std::int64_t inNumber) { return text = std::to_string(inNumber), true; }
  bool operator()(bool inTruth) { return text = inTruth ? "true" : "false", true; }
  bool operator()(double inNumber) {
    char digits[32];  // the shortest text that reads back as the same number
    text.assign(digits, std::to_chars(digits, digits + sizeof(digits), inNumber).ptr);
    return true;
  }
  bool operator()(const std::vector<std::int64_t>&) { return false; }

  std::string text;
};

// A number, or a text that is a number and nothing else.
struct ToNumber {
  bool operator()(const std::string& inText) {
    const char* const end = inText.data() + inText.size();
    const auto [rest, error] = std::from_chars(inText.data(), end, number);
    return error == std::errc() && rest == end && !inText.empty();
  }
  bool operator()(std::int64_t inNumber) { return number = static_cast<double>(inNumber), true; }
  bool operator()(double inNumber) { return number = inNumber, true; }
  bool operator()(bool) { return false; }
  bool operator()(const std::vector<std::int64_t>&) { return false; }

  double number = 0;
};

// Converts a value of a file to the type that is asked for. Returns false, with nothing changed,
// when it cannot.
bool ConvertTomlValue(const TomlValue& inValue, ZORString& outValue) {
  ToText convert;
  if (!std::visit(convert, inValue)) return false;
  outValue = ZORString(convert.text.data(), static_cast<int>(convert.text.size()));
  return true;
}

bool ConvertTomlValue(const TomlValue& inValue, ZORUnicodeString& outValue) {
  ToText convert;
  if (!std::visit(convert, inValue)) return false;
  outValue.BuildFromUTF8(convert.text.data(), convert.text.size());
  return true;
}

bool ConvertTomlValue(const TomlValue& inValue, double& outValue) {
  ToNumber convert;
  if (!std::visit(convert, inValue)) return false;
  outValue = convert.number;
  return true;
}

bool ConvertTomlValue(const TomlValue& inValue, int& outValue) {
  double number = 0;
  if (!ConvertTomlValue(inValue, number) || number != std::floor(number)) return false;
  if (number < std::numeric_limits<int>::min() || number > std::numeric_limits<int>::max())
    return false;
  outValue = static_cast<int>(number);
  return true;
}

/// A value that overrides those of the files.
struct OverriddenSetting {
  const SettingOverride* owner;
  std::string repository, setting;
  TomlValue value;
};
std::vector<OverriddenSetting>& Overrides() {
  static std::vector<OverriddenSetting> overrides;
  return overrides;
}

/// @param inSetting null: any setting of the repository.
const TomlValue* FindOverride(const std::string& inRepository, const char* inSetting) {
  const auto found = std::find_if(Overrides().rbegin(), Overrides().rend(),
                                  [&](const OverriddenSetting& inOverride) {
                                    return inOverride.repository == inRepository &&
                                           (!inSetting || inOverride.setting == inSetting);
                                  });
  return found == Overrides().rend() ? nullptr : &found->value;
}

/// A repository that reads NAME.toml of a folder of the setting directories at each call.
/// @tparam Repository ZORSettingRepository or ZORSysSettingRepository.
template <class Repository>
class TomlSettingRepository final : public Repository {
 public:
  /// The one repository of a name; null when its file is not there or damaged.
  static Repository* Find(const char* inFolder, const char* inName) {
    if (!inName) return nullptr;
    if (!FindOverride(inFolder + std::string(inName), nullptr) &&
        !ReadSettingFile(inFolder, inName))
      return nullptr;
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

  const TomlValue* ValueOf(const std::shared_ptr<const TomlTable>& inTable,
                           const char* inName) const {
    if (const TomlValue* const value = FindOverride(folder_ + name_, inName)) return value;
    if (!inTable) return nullptr;
    const auto found = inTable->find(std::string_view(inName));
    return found == inTable->end() ? nullptr : &found->second;
  }

  const std::string folder_;
  const std::string name_;
};

}  // namespace
SettingOverride::SettingOverride(const std::string& inRepository, const std::string& inSetting,
                                 int inValue) {
  Overrides().push_back({this, inRepository, inSetting, static_cast<std::int64_t>(inValue)});
}

SettingOverride::~SettingOverride() {
  std::erase_if(Overrides(),
                [&](const OverriddenSetting& inOverride) { return inOverride.owner == this; });
}

}  // namespace ZORDefault

ZORSettingRepository::~ZORSettingRepository() = default;

ZORSettingRepository* ZORSettingRepository::GetRepository(const char* inName, int, int,
                                                          ZORSettingController*) {
  return ZORDefault::TomlSettingRepository<ZORSettingRepository>::Find("", inName);
}

ZORSysSettingRepository* ZORSysSettingRepository::GetRepository(const char* inName, int) {
  return ZORDefault::TomlSettingRepository<ZORSysSettingRepository>::Find("system/", inName);
}

HRESULT ZORSysSettingRepository::ReadAttr(const char* inName, int* outValues, int inCount) {
  return ReadSetting(inName, outValues, inCount);
}
