// By UDUNITS-2 and the dictionary that is installed with it.
#include <udunits2.h>

#include <memory>

#include "default_platform/knowledge/UnitConversion.h"
#include "default_platform/system/CLocale.h"

namespace ZORDefault {
namespace {

// Null when the dictionary cannot be read. Reading takes about ten milliseconds, so it waits until
// a unit is asked for. Numbers in it have decimal points.
ut_system* UnitSystem() {
  static ut_system* const system = [] {
    const CLocaleScope cLocale;
    ut_set_error_message_handler(&ut_ignore);
    return ut_read_xml(nullptr);
  }();
  return system;
}

using UnitPointer = std::unique_ptr<ut_unit, decltype(&ut_free)>;

UnitPointer ParseUnit(const std::string& inUnit) {
  return UnitPointer(ut_parse(UnitSystem(), inUnit.c_str(), UT_UTF8), &ut_free);
}

}  // namespace

bool AreUnitsKnown() { return UnitSystem() != nullptr; }

std::optional<double> ConversionFactor(const std::string& inFrom, const std::string& inTo) {
  const CLocaleScope cLocale;
  const UnitPointer from = ParseUnit(inFrom);
  const UnitPointer to = ParseUnit(inTo);
  const std::unique_ptr<cv_converter, decltype(&cv_free)> converter(
      ut_get_converter(from.get(), to.get()), &cv_free);
  if (!converter) return std::nullopt;
  const double factor = cv_convert_double(converter.get(), 1);
  // UDUNITS also converts reciprocals (Hz to s), plain numbers to angles and scales with another
  // zero, none of which is a multiple.
  const UnitPointer multiple(ut_scale(factor, to.get()), &ut_free);
  if (!multiple || ut_compare(from.get(), multiple.get()) != 0) return std::nullopt;
  return factor;
}

}  // namespace ZORDefault
