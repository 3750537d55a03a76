#include "platform/knowledge/ZORParmDictionary.h"

#include <charconv>
#include <cmath>
#include <cstring>
#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "default_platform/knowledge/UnitConversion.h"

namespace {

// ---- quantities

bool IsLetter(char inByte) {
  return (inByte >= 'a' && inByte <= 'z') || (inByte >= 'A' && inByte <= 'Z') ||
         static_cast<unsigned char>(inByte) >= 0x80;
}
bool IsDigit(char inByte) { return inByte >= '0' && inByte <= '9'; }

// True for words with powers, multiplied and divided ("mm", "m^2", "kg.m/s2"). The dictionary's
// grammar has more (numbers as factors, offsets, dates), which in a quantity would be a mistake.
bool IsProductOfUnits(std::string_view inUnit) {
  if (inUnit.empty() || !IsLetter(inUnit.front())) return false;
  char before = '*';
  for (const char byte : inUnit) {
    const bool startsFactor = before == '*' || before == '/' || before == '.';
    if (IsDigit(byte)) {
      if (startsFactor) return false;
    } else if (IsLetter(byte) || byte == '_') {
      if (IsDigit(before)) return false;
    } else if (std::string_view("*/.^-").find(byte) == std::string_view::npos || startsFactor) {
      return false;
    }
    before = byte;
  }
  return true;
}

// Remembered, since a document says "mm" many times.
std::optional<double> FactorOf(const std::string& inUnit, const std::string& inBase) {
  constexpr std::size_t kMaxRemembered = 256;
  if (!IsProductOfUnits(inUnit)) return std::nullopt;
  static std::mutex mutex;  // also for the parser, which keeps its state in statics
  static auto* const factors =
      new std::map<std::pair<std::string, std::string>, std::optional<double>>();
  const std::lock_guard lock(mutex);
  const auto known = factors->find({inUnit, inBase});
  if (known != factors->end()) return known->second;
  if (factors->size() == kMaxRemembered) factors->clear();
  return (*factors)[{inUnit, inBase}] = ZORDefault::ConversionFactor(inUnit, inBase);
}

// Text without the blanks at its ends; those that typesetting puts before units count too.
ZORUnicodeString WithoutBlanks(const ZORUnicodeString& inText) {
  const auto isBlank = [](char16_t inUnit) {
    return inUnit == u' ' || inUnit == u'\t' || inUnit == u'\u00A0' || inUnit == u'\u202F';
  };
  const ZORUC2Bytes* const units = inText.ConvertToUCChar();
  int begin = 0;
  int end = inText.GetLengthInChar();
  while (begin < end && isBlank(units[begin])) ++begin;
  while (end > begin && isBlank(units[end - 1])) --end;
  return inText.SubString(begin, end - begin);
}

// Takes a decimal number off the start of a text.
std::optional<double> TakeNumber(std::string_view& ioText) {
  const bool isSigned = ioText.starts_with('+') || ioText.starts_with('-');
  const std::string_view digits = ioText.substr(isSigned ? 1 : 0);
  if (digits.empty() || !(IsDigit(digits[0]) || digits[0] == '.')) return std::nullopt;
  if (ioText.starts_with('+')) ioText.remove_prefix(1);  // not known to from_chars
  double number = 0;
  const auto [rest, error] = std::from_chars(ioText.data(), ioText.data() + ioText.size(), number);
  if (error != std::errc()) return std::nullopt;
  ioText.remove_prefix(static_cast<std::size_t>(rest - ioText.data()));
  return number;
}

// A factor such as 0.001 has no exact double, its reciprocal has: dividing rounds once only.
double Multiplied(double inNumber, double inFactor) {
  const double reciprocal = std::round(1 / inFactor);
  const bool isFraction = reciprocal > 1 && 1 / reciprocal == inFactor;
  return isFraction ? inNumber / reciprocal : inNumber * inFactor;
}

// Reads a decimal number followed by a unit, blanks allowed around both; the value in base units.
std::optional<double> ReadQuantity(const ZORUnicodeString& inText, const std::string& inBase) {
  if (!ZORDefault::AreUnitsKnown()) return std::nullopt;
  const ZORUnicodeString trimmed = WithoutBlanks(inText);
  std::string_view text = trimmed.ConvertToChar();
  const std::optional<double> number = TakeNumber(text);
  if (!number) return std::nullopt;
  ZORUnicodeString unit;
  unit.BuildFromUTF8(text.data(), text.size());
  const std::optional<double> factor = FactorOf(WithoutBlanks(unit).ConvertToChar(), inBase);
  if (!factor) return std::nullopt;
  const double value = Multiplied(*number, *factor);
  return std::isfinite(value) ? std::optional(value) : std::nullopt;
}

// ---- components

// A component that is seen through one interface besides the base.
template <class Interface>
class Component : public Interface {
 public:
  using ZORBaseUnknown::QueryInterface;
  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    if (inInterface != Interface::ClassId())
      return ZORBaseUnknown::QueryInterface(inInterface, outInterface);
    if (!outInterface) return E_INVALIDARG;
    this->AddRef();
    *outInterface = static_cast<Interface*>(this);
    return S_OK;
  }
};

class StorageUnit final : public Component<ZORICkeUnit> {
 public:
  explicit StorageUnit(const char* inBase) : base_(inBase) {}

  ZORCke::Boolean Decode(const ZORUnicodeString& inText, double& outValue) const override {
    const auto value = ReadQuantity(inText, base_);
    if (!value) return ZORCke::False;
    outValue = *value;
    return ZORCke::True;
  }

 private:
  const std::string base_;  // the unit that values are stored in
};

class Magnitude final : public Component<ZORICkeMagnitude> {
 public:
  Magnitude(const char* inName, const char* inBase)
      : name_(inName), unit_(new StorageUnit(inBase)) {
    unit_->Release();  // the handle holds it now
  }

  ZORUnicodeString Name() const override { return name_; }
  ZORICkeUnit_var Unit() const override { return unit_; }

 private:
  const ZORUnicodeString name_;
  const ZORICkeUnit_var unit_;
};

// The dictionary's own references keep the magnitudes until the process ends.
const auto& Magnitudes() {
  static const auto* const magnitudes = new std::map<std::string, Magnitude*>{
      {"LENGTH", new Magnitude("LENGTH", "m")}, {"ANGLE", new Magnitude("ANGLE", "rad")},
      {"MASS", new Magnitude("MASS", "kg")},    {"TIME", new Magnitude("TIME", "s")},
      {"AREA", new Magnitude("AREA", "m2")},    {"VOLUME", new Magnitude("VOLUME", "m3")},
  };
  return *magnitudes;
}

}  // namespace

ZORICkeMagnitude_var ZORParmDictionary::FindMagnitude(const ZORUnicodeString& inName) {
  const auto found = Magnitudes().find(inName.ConvertToChar());
  if (found == Magnitudes().end() || !ZORDefault::AreUnitsKnown()) return ZORICkeMagnitude_var();
  return found->second;
}
