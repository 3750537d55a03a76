// The table of units beside the dictionary of UDUNITS-2, which the platform's magnitudes read by.
#include <gtest/gtest.h>

#include <cmath>
#include <random>
#include <string>
#include <utility>
#include <vector>

#include "default_platform/knowledge/UnitConversion.h"
#include "platform/knowledge/ZORParmDictionary.h"

namespace {

using Words = std::vector<std::string>;

const Words kSymbols{"m", "g", "s", "rad", "l", "L", "Hz"};
const Words kNames{"meter",   "metre",  "metres", "gram",  "grams",  "second",
                   "seconds", "radian", "liter",  "litre", "litres", "hertz"};
const Words kAlone{"in",    "inch", "inches", "mil",    "ft",       "foot",   "feet",    "yd",
                   "yard",  "mi",   "mile",   "miles",  "\xC2\xB0", "degree", "degrees", "t",
                   "tonne", "lb",   "pound",  "pounds", "min",      "minute", "h",       "hr",
                   "hours", "d",    "day",    "days",   "micron",   "microns"};

/// What UDUNITS-2 makes of a unit, nothing where it is no multiple of the base.
std::optional<double> ByUdunits(const std::string& inUnit, const char* inMagnitude) {
  const ZORICkeMagnitude_var magnitude = ZORParmDictionary::FindMagnitude(inMagnitude);
  ZORUnicodeString text;
  const std::string quantity = "1 " + inUnit;
  text.BuildFromUTF8(quantity.data(), quantity.size());
  double value = 0;
  if (magnitude->Unit()->Decode(text, value) == ZORCke::False) return std::nullopt;
  return value;
}

/// @return how many magnitudes the unit is of.
int ExpectSame(const std::string& inUnit) {
  int count = 0;
  for (const auto& [magnitude, base] :
       {std::pair("LENGTH", "m"), std::pair("ANGLE", "rad"), std::pair("MASS", "kg"),
        std::pair("TIME", "s"), std::pair("AREA", "m2"), std::pair("VOLUME", "m3")}) {
    const std::optional<double> expected = ByUdunits(inUnit, magnitude);
    const std::optional<double> actual = ZORDefault::ConversionFactor(inUnit, base);
    EXPECT_EQ(expected.has_value(), actual.has_value()) << inUnit << " as " << magnitude;
    if (!expected || !actual) continue;
    EXPECT_NEAR(*actual / *expected, 1, 1e-14) << inUnit << " as " << magnitude;
    ++count;
  }
  return count;
}

Words WithPrefixes() {
  Words words;
  for (const char* const prefix : {"P", "T", "G", "M", "k", "h", "da", "d", "c", "m", "\xC2\xB5",
                                   "\xCE\xBC", "u", "n", "p", "f"})
    for (const std::string& symbol : kSymbols) words.push_back(prefix + symbol);
  for (const char* const prefix : {"peta", "tera", "giga", "mega", "kilo", "hecto", "deka", "deci",
                                   "centi", "milli", "micro", "nano", "pico", "femto"})
    for (const std::string& name : kNames) words.push_back(prefix + name);
  return words;
}

}  // namespace

TEST(UnitConversionByTable, WordsAreThoseOfUdunits) {
  for (const Words& words : {kSymbols, kNames, kAlone, WithPrefixes()})
    for (const std::string& word : words)
      EXPECT_EQ(ExpectSame(word), word.ends_with("Hz") || word.ends_with("hertz") ? 0 : 1) << word;
}

TEST(UnitConversionByTable, ProductsByChanceAreThoseOfUdunits) {
  std::mt19937 random(20261122);
  const auto below = [&](std::size_t inEnd) { return random() % inEnd; };
  const Words words{"m", "mm", "in", "kg", "g", "s", "min", "rad", "Hz", "l", "ft", "meter"};
  const Words powers{"", "", "2", "3", "^2", "^-1", "-1", "-2", "0", "1", "^", "12"};
  const Words signs{"*", ".", "/", "/", "-"};
  int found = 0;
  for (int i = 0; i < 3000; ++i) {
    std::string unit = words[below(words.size())] + powers[below(powers.size())];
    for (std::size_t more = below(4); more > 0; --more)
      unit +=
          signs[below(signs.size())] + words[below(words.size())] + powers[below(powers.size())];
    found += ExpectSame(unit);
  }
  EXPECT_GT(found, 100);
}

TEST(UnitConversionByTable, WhatIsNoUnitIsRefused) {
  for (const char* const unit :
       {"", "MM", "furlongish", "kin", "kmin", "mmm", "m^", "m^^2", "m2x", "m*", "*m", "m**m",
        "m..m", "m 2", "m99999999999", "\xC2", "k", "milli"})
    EXPECT_EQ(ZORDefault::ConversionFactor(unit, "m"), std::nullopt) << unit;
}
