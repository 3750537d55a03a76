#include "platform/system/ZORSettingRepository.h"

#include <charconv>
#include <cmath>
#include <limits>

#include "default_platform/system/TomlSettingRepository.h"
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

}  // namespace

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
