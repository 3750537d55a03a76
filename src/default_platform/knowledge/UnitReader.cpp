#include "default_platform/knowledge/UnitReader.h"

#include <udunits2.h>

#include <charconv>
#include <cmath>
#include <memory>
#include <mutex>
#include <string_view>

#include "default_platform/system/CLocale.h"

namespace ZORDefault {
namespace {

// The dictionary of the installed UDUNITS-2; null when it cannot be read. Reading takes about ten
// milliseconds, so it waits until a unit is asked for. Numbers in it have decimal points.
ut_system* UnitSystem() {
  static ut_system* const system = [] {
    const CLocaleScope cLocale;
    ut_set_error_message_handler(&ut_ignore);
    return ut_read_xml(nullptr);
  }();
  return system;
}

// A unit as so many base units.
struct Measure {
  double factor = 1;
  Dimension dimension;
};

ut_status AddBasicUnit(const ut_unit* inUnit, int inPower, Measure& ioMeasure) {
  const char* const symbol = ut_get_symbol(inUnit, UT_ASCII);
  const char* const name = symbol ? symbol : ut_get_name(inUnit, UT_ASCII);
  if (!name) return UT_MEANINGLESS;
  ioMeasure.dimension[name] += inPower;
  return UT_SUCCESS;
}

ut_status VisitBasic(const ut_unit* inUnit, void* ioMeasure) {
  return AddBasicUnit(inUnit, 1, *static_cast<Measure*>(ioMeasure));
}

ut_status VisitProduct(const ut_unit*, int inCount, const ut_unit* const* inUnits,
                       const int* inPowers, void* ioMeasure) {
  for (int i = 0; i < inCount; ++i) {
    const ut_status status =
        AddBasicUnit(inUnits[i], inPowers[i], *static_cast<Measure*>(ioMeasure));
    if (status != UT_SUCCESS) return status;
  }
  return UT_SUCCESS;
}

ut_status VisitScaled(const ut_unit*, double inScale, const ut_unit* inUnderlying, double inOrigin,
                      void* ioMeasure);

// Clocks' dates and logarithms are no multiples of a base unit.
ut_status VisitTimestamp(const ut_unit*, const ut_unit*, double, void*) { return UT_MEANINGLESS; }
ut_status VisitLogarithm(const ut_unit*, double, const ut_unit*, void*) { return UT_MEANINGLESS; }

ut_visitor MeasuringVisitor() {
  return {&VisitBasic, &VisitProduct, &VisitScaled, &VisitTimestamp, &VisitLogarithm};
}

ut_status VisitScaled(const ut_unit*, double inScale, const ut_unit* inUnderlying, double inOrigin,
                      void* ioMeasure) {
  if (inOrigin != 0) return UT_MEANINGLESS;  // a scale with another zero
  static_cast<Measure*>(ioMeasure)->factor *= inScale;
  const ut_visitor visitor = MeasuringVisitor();
  return ut_accept_visitor(inUnderlying, &visitor, ioMeasure);
}

bool IsLetter(char inByte) {
  return (inByte >= 'a' && inByte <= 'z') || (inByte >= 'A' && inByte <= 'Z') ||
         static_cast<unsigned char>(inByte) >= 0x80;
}
bool IsDigit(char inByte) { return inByte >= '0' && inByte <= '9'; }

// True for words with powers, multiplied and divided ("mm", "m^2", "kg.m/s2"). The dictionary's
// grammar has more (numbers as factors, offsets, dates), which in a quantity would be a mistake.
bool IsPlainUnit(std::string_view inUnit) {
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

std::optional<Measure> ParseUnit(const std::string& inUnit) {
  const CLocaleScope cLocale;
  const std::unique_ptr<ut_unit, decltype(&ut_free)> unit(
      ut_parse(UnitSystem(), inUnit.c_str(), UT_UTF8), &ut_free);
  const ut_visitor visitor = MeasuringVisitor();
  Measure measure;
  if (!unit || ut_accept_visitor(unit.get(), &visitor, &measure) != UT_SUCCESS) return std::nullopt;
  std::erase_if(measure.dimension, [](const auto& inPower) { return inPower.second == 0; });
  return measure;
}

// What a unit measures; remembered, since a document says "mm" many times.
std::optional<Measure> MeasureOf(const std::string& inUnit) {
  constexpr std::size_t kMostRemembered = 256;
  if (!IsPlainUnit(inUnit)) return std::nullopt;
  static std::mutex mutex;  // also for the parser, which keeps its state in statics
  static auto* const known = new std::map<std::string, std::optional<Measure>, std::less<>>();
  const std::lock_guard lock(mutex);
  const auto found = known->find(inUnit);
  if (found != known->end()) return found->second;
  if (known->size() == kMostRemembered) known->clear();
  return (*known)[inUnit] = ParseUnit(inUnit);
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

}  // namespace

bool IsUnitDictionaryThere() { return UnitSystem() != nullptr; }

std::optional<double> ReadQuantity(const ZORUnicodeString& inText, const Dimension& inDimension) {
  if (!UnitSystem()) return std::nullopt;
  const ZORUnicodeString trimmed = WithoutBlanks(inText);
  std::string_view text = trimmed.ConvertToChar();
  const std::optional<double> number = TakeNumber(text);
  if (!number) return std::nullopt;
  ZORUnicodeString unit;
  unit.BuildFromUTF8(text.data(), text.size());
  const std::optional<Measure> measure = MeasureOf(WithoutBlanks(unit).ConvertToChar());
  if (!measure || measure->dimension != inDimension) return std::nullopt;
  const double value = Multiplied(*number, measure->factor);
  return std::isfinite(value) ? std::optional(value) : std::nullopt;
}

}  // namespace ZORDefault
