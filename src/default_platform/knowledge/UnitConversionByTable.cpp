// By a table of the units that lengths, angles, masses and times are written in, for systems
// without UDUNITS-2. Words, prefixes and factors are those of its dictionary.
#include <array>
#include <charconv>
#include <span>
#include <string_view>

#include "default_platform/knowledge/UnitConversion.h"

namespace ZORDefault {
namespace {

enum Dimension { kLength, kAngle, kMass, kTime };

/// A product of powers of the base units (metre, radian, gram, second), times a factor.
struct Unit {
  double factor = 1;
  std::array<int, 4> powers{};

  void Multiply(const Unit& inOther, int inPower) {
    for (int i = 0; i < inPower; ++i) factor *= inOther.factor;
    for (int i = 0; i > inPower; --i) factor /= inOther.factor;
    for (std::size_t i = 0; i < powers.size(); ++i) powers[i] += inPower * inOther.powers[i];
  }
};

constexpr Unit Base(Dimension inDimension, double inFactor = 1, int inPower = 1) {
  Unit unit{inFactor, {}};
  unit.powers[inDimension] = inPower;
  return unit;
}

struct Word {
  std::string_view text;
  Unit unit;
};

constexpr double kPi = 3.14159265358979323846;
constexpr double kInch = 0.0254, kPound = 453.59237, kLitre = 0.001;

// What prefixes stand before: those of one letter before symbols, whole ones before names.
constexpr Word kSymbols[] = {{"m", Base(kLength)},
                             {"g", Base(kMass)},
                             {"s", Base(kTime)},
                             {"rad", Base(kAngle)},
                             {"l", Base(kLength, kLitre, 3)},
                             {"L", Base(kLength, kLitre, 3)},
                             {"Hz", Base(kTime, 1, -1)}};
constexpr Word kNames[] = {{"meter", Base(kLength)},
                           {"meters", Base(kLength)},
                           {"metre", Base(kLength)},
                           {"metres", Base(kLength)},
                           {"gram", Base(kMass)},
                           {"grams", Base(kMass)},
                           {"second", Base(kTime)},
                           {"seconds", Base(kTime)},
                           {"radian", Base(kAngle)},
                           {"radians", Base(kAngle)},
                           {"liter", Base(kLength, kLitre, 3)},
                           {"liters", Base(kLength, kLitre, 3)},
                           {"litre", Base(kLength, kLitre, 3)},
                           {"litres", Base(kLength, kLitre, 3)},
                           {"hertz", Base(kTime, 1, -1)}};
constexpr Word kAlone[] = {
    {"in", Base(kLength, kInch)},
    {"inch", Base(kLength, kInch)},
    {"inches", Base(kLength, kInch)},
    {"mil", Base(kLength, 0.001 * kInch)},
    {"mils", Base(kLength, 0.001 * kInch)},
    {"ft", Base(kLength, 12 * kInch)},
    {"foot", Base(kLength, 12 * kInch)},
    {"feet", Base(kLength, 12 * kInch)},
    {"yd", Base(kLength, 36 * kInch)},
    {"yard", Base(kLength, 36 * kInch)},
    {"yards", Base(kLength, 36 * kInch)},
    {"mi", Base(kLength, 63360 * kInch)},
    {"mile", Base(kLength, 63360 * kInch)},
    {"miles", Base(kLength, 63360 * kInch)},
    {"micron", Base(kLength, 1e-6)},
    {"microns", Base(kLength, 1e-6)},
    {"\xC2\xB0", Base(kAngle, kPi / 180)},
    {"degree", Base(kAngle, kPi / 180)},
    {"degrees", Base(kAngle, kPi / 180)},
    {"t", Base(kMass, 1e6)},
    {"tonne", Base(kMass, 1e6)},
    {"tonnes", Base(kMass, 1e6)},
    {"lb", Base(kMass, kPound)},
    {"pound", Base(kMass, kPound)},
    {"pounds", Base(kMass, kPound)},
    {"min", Base(kTime, 60)},
    {"minute", Base(kTime, 60)},
    {"minutes", Base(kTime, 60)},
    {"h", Base(kTime, 3600)},
    {"hr", Base(kTime, 3600)},
    {"hour", Base(kTime, 3600)},
    {"hours", Base(kTime, 3600)},
    {"d", Base(kTime, 86400)},
    {"day", Base(kTime, 86400)},
    {"days", Base(kTime, 86400)},
};

struct Prefix {
  std::string_view symbol, name;
  double factor;
};
constexpr Prefix kPrefixes[] = {
    {"P", "peta", 1e15},  {"T", "tera", 1e12},  {"G", "giga", 1e9},     {"M", "mega", 1e6},
    {"k", "kilo", 1e3},   {"h", "hecto", 1e2},  {"da", "deka", 1e1},    {"d", "deci", 1e-1},
    {"c", "centi", 1e-2}, {"m", "milli", 1e-3}, {"\xC2\xB5", "", 1e-6}, {"\xCE\xBC", "", 1e-6},
    {"u", "micro", 1e-6}, {"n", "nano", 1e-9},  {"p", "pico", 1e-12},   {"f", "femto", 1e-15}};

const Unit* Find(std::span<const Word> inWords, std::string_view inText) {
  for (const Word& word : inWords)
    if (word.text == inText) return &word.unit;
  return nullptr;
}

std::optional<Unit> UnitOf(std::string_view inWord) {
  for (const std::span<const Word> words : {std::span<const Word>(kAlone), {kSymbols}, {kNames}})
    if (const Unit* const unit = Find(words, inWord)) return *unit;
  for (const Prefix& prefix : kPrefixes) {
    const Unit* unit = nullptr;
    if (inWord.starts_with(prefix.symbol))
      unit = Find(kSymbols, inWord.substr(prefix.symbol.size()));
    if (unit == nullptr && !prefix.name.empty() && inWord.starts_with(prefix.name))
      unit = Find(kNames, inWord.substr(prefix.name.size()));
    if (unit != nullptr) return Unit{prefix.factor * unit->factor, unit->powers};
  }
  return std::nullopt;
}

/// Takes a power off the start of a text: "^2", "2" or "-1"; 1 where there is none.
std::optional<int> TakePower(std::string_view& ioText) {
  constexpr int kMaxPower = 255;
  const bool isMarked = ioText.starts_with('^');
  if (isMarked) ioText.remove_prefix(1);
  int power = 1;
  const auto [end, error] = std::from_chars(ioText.data(), ioText.data() + ioText.size(), power);
  if (error == std::errc::invalid_argument && !isMarked) return 1;
  if (error != std::errc() || power < -kMaxPower || power > kMaxPower) return std::nullopt;
  ioText.remove_prefix(static_cast<std::size_t>(end - ioText.data()));
  return power;
}

/// A division is of the next word alone: "kg/m.s" is a kilogram second a metre.
std::optional<Unit> ProductOf(std::string_view inText) {
  Unit product;
  for (bool isDivided = false;;) {
    const std::size_t length = inText.find_first_of("0123456789*/.^-");
    const std::optional<Unit> unit = UnitOf(inText.substr(0, length));
    if (!unit) return std::nullopt;
    inText.remove_prefix(length == std::string_view::npos ? inText.size() : length);
    const std::optional<int> power = TakePower(inText);
    if (!power) return std::nullopt;
    product.Multiply(*unit, isDivided ? -*power : *power);
    if (inText.empty()) return product;
    isDivided = inText.starts_with('/');
    if (inText.find_first_of("*/.-") != 0) return std::nullopt;
    inText.remove_prefix(1);
  }
}

}  // namespace

bool AreUnitsKnown() { return true; }

std::optional<double> ConversionFactor(const std::string& inFrom, const std::string& inTo) {
  const std::optional<Unit> from = ProductOf(inFrom), to = ProductOf(inTo);
  if (!from || !to || from->powers != to->powers) return std::nullopt;
  return from->factor / to->factor;
}

}  // namespace ZORDefault
