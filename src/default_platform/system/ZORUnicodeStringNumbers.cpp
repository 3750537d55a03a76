// Numbers in texts: the C library's formatted reading and printing in the C locale, with fast paths
// for the common formats.
#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdio>
#include <cstring>
#include <limits>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

#include "default_platform/system/CLocale.h"
#include "platform/system/ZORUnicodeString.h"

namespace {

enum class NumberKind { kInt, kDouble };
enum class FormatUse { kPrint, kScan };

bool IsOneOf(char inCharacter, const char* inSet) {
  return inCharacter != '\0' && std::strchr(inSet, inCharacter) != nullptr;
}

// Passes over at most four digits: a longer width or precision is a mistake or an attack.
bool SkipDigits(const char*& ioText) {
  int digits = 0;
  for (; IsOneOf(*ioText, "0123456789"); ++ioText) ++digits;
  return digits <= 4;
}

// Skips what lies between '%' and the conversion letter.
bool SkipToLetter(const char*& ioText, NumberKind inKind, FormatUse inUse) {
  if (inUse == FormatUse::kPrint)
    while (IsOneOf(*ioText, inKind == NumberKind::kInt ? "-+ 0" : "-+ #0")) ++ioText;
  if (!SkipDigits(ioText)) return false;
  if (inUse == FormatUse::kPrint && *ioText == '.' && !SkipDigits(++ioText)) return false;
  if (inKind == NumberKind::kInt) return true;
  // A double is scanned with 'l' only (without, it would be a float); printing takes it or not.
  const bool isLong = *ioText == 'l';
  if (isLong) ++ioText;
  return isLong || inUse == FormatUse::kPrint;
}

/// @return the position of the conversion letter when the format holds, beside plain text and "%%",
/// exactly one conversion and that is of one number of this kind; else nothing. Refused are "*"
/// (it takes or drops an argument), lengths of other types, and widths past four digits.
std::optional<std::size_t> FindConversion(const char* inFormat, NumberKind inKind,
                                          FormatUse inUse) {
  std::optional<std::size_t> letter;
  if (!inFormat) return letter;
  for (const char* text = inFormat; *text; ++text) {
    if (*text != '%') continue;
    ++text;
    if (*text == '%') continue;
    if (letter || !SkipToLetter(text, inKind, inUse)) return std::nullopt;
    if (!IsOneOf(*text, inKind == NumberKind::kInt ? "di" : "aAeEfFgG")) return std::nullopt;
    letter = static_cast<std::size_t>(text - inFormat);
  }
  return letter;
}

bool IsSpace(char16_t inUnit) { return inUnit == ' ' || (inUnit >= '\t' && inUnit <= '\r'); }
bool IsDigit(char16_t inUnit) { return inUnit >= '0' && inUnit <= '9'; }

const char16_t* SkipSpace(const char16_t* inText, const char16_t* inEnd) {
  while (inText < inEnd && IsSpace(*inText)) ++inText;
  return inText;
}

int Saturated(long long inNumber) {
  return static_cast<int>(std::clamp<long long>(inNumber, std::numeric_limits<int>::min(),
                                                std::numeric_limits<int>::max()));
}

// Reads a decimal int straight from the code units: "%d" without conversion to narrow text.
bool ReadDecimalInt(std::u16string_view inText, int& outNumber) {
  const char16_t* const end = inText.data() + inText.size();
  const char16_t* text = SkipSpace(inText.data(), end);
  const bool negative = text < end && *text == '-';
  if (text < end && (*text == '-' || *text == '+')) ++text;
  if (text == end || !IsDigit(*text)) return false;
  constexpr long long kEnough = 1LL << 40;  // past every int: further digits change nothing
  long long number = 0;
  for (; text < end && IsDigit(*text); ++text)
    if (number < kEnough) number = number * 10 + (*text - '0');
  outNumber = Saturated(negative ? -number : number);
  return true;
}

// The start of a text as narrow characters, as long as they are those of a plain decimal number;
// empty when the number is not plain: then the C library decides.
class DecimalDigits {
 public:
  explicit DecimalDigits(std::u16string_view inText) {
    const char16_t* const end = inText.data() + inText.size();
    const char16_t* text = SkipSpace(inText.data(), end);
    if (text < end && *text == '+') {
      if (++text < end && *text == '-') return;
    }
    std::size_t length = 0;
    for (; text < end && IsPart(*text); ++text) {
      if (length == sizeof(characters_)) return;
      characters_[length++] = static_cast<char>(*text);
    }
    // Letters here mean "0x1p3", "inf", "nan" and their like.
    if (text == end || !IsWord(*text)) length_ = length;
  }
  const char* begin() const { return characters_; }
  const char* end() const { return characters_ + length_; }

 private:
  static bool IsPart(char16_t inUnit) {
    return IsDigit(inUnit) || inUnit == '.' || inUnit == '-' || inUnit == '+' || inUnit == 'e' ||
           inUnit == 'E';
  }
  static bool IsWord(char16_t inUnit) {
    return (inUnit >= 'a' && inUnit <= 'z') || (inUnit >= 'A' && inUnit <= 'Z');
  }

  char characters_[64];
  std::size_t length_ = 0;
};

// @return false also where only the C library can decide.
bool ReadDecimalDouble(std::u16string_view inText, double& outNumber) {
  const DecimalDigits digits(inText);
  double number = 0;
  const auto [rest, error] = std::from_chars(digits.begin(), digits.end(), number);
  // What is left over (such as the "e" of "1e") and what is out of range is left to the C library.
  if (error != std::errc() || rest != digits.end()) return false;
  outNumber = number;
  return true;
}

template <class Number>
int Scan(const char* inText, const char* inFormat, Number* outNumber) {
  const ZORDefault::CLocaleScope cLocale;
  return std::sscanf(inText, inFormat, outNumber) == 1 ? 1 : 0;
}

// Prints into a buffer that fits most numbers, and again into one that fits them all.
template <class Number>
std::string Print(const char* inFormat, Number inNumber) {
  const ZORDefault::CLocaleScope cLocale;
  char buffer[400];
  const int length = std::snprintf(buffer, sizeof(buffer), inFormat, inNumber);
  if (length < 0) return std::string();
  const std::size_t size = static_cast<std::size_t>(length);
  if (size < sizeof(buffer)) return std::string(buffer, size);
  std::string text(size + 1, '\0');
  std::snprintf(text.data(), text.size(), inFormat, inNumber);
  text.resize(size);
  return text;
}

// As the C library of Unix prints it. That of MinGW makes up the sign; it prints infinity right.
std::string PrintNaN(const std::string& inFormat, std::size_t inLetter, double inNaN) {
  const std::size_t begin = inFormat.rfind('%', inLetter);
  std::string text = Print(inFormat.substr(begin, inLetter + 1 - begin).c_str(),
                           std::copysign(std::numeric_limits<double>::infinity(), inNaN));
  for (const auto& [infinite, none] : {std::pair("inf", "nan"), std::pair("INF", "NAN")})
    if (const std::size_t at = text.find(infinite); at != text.npos) text.replace(at, 3, none);
  const std::string around = inFormat.substr(0, begin) + "%s" + inFormat.substr(inLetter + 1);
  return Print(around.c_str(), text.c_str());
}

bool IsFormat(const char* inFormat, const char* inPlain) {
  return inFormat && std::strcmp(inFormat, inPlain) == 0;
}

}  // namespace

HRESULT ZORUnicodeString::BuildFromNum(int inNumber, const char* inFormat) {
  if (IsFormat(inFormat, "%d") || IsFormat(inFormat, "%i")) {
    char digits[std::numeric_limits<int>::digits10 + 3];
    char* const end = std::to_chars(digits, digits + sizeof(digits), inNumber).ptr;
    BuildFromLatin1(digits, static_cast<std::size_t>(end - digits));
    return S_OK;
  }
  if (!FindConversion(inFormat, NumberKind::kInt, FormatUse::kPrint)) return E_INVALIDARG;
  const std::string text = Print(inFormat, inNumber);
  BuildFromUTF8(text.data(), text.size());
  return S_OK;
}

HRESULT ZORUnicodeString::BuildFromNum(double inNumber, const char* inFormat) {
  if (IsFormat(inFormat, "%f")) {
    char digits[330];  // the longest double has 309 digits before the point
    char* const end =
        std::to_chars(digits, digits + sizeof(digits), inNumber, std::chars_format::fixed, 6).ptr;
    BuildFromLatin1(digits, static_cast<std::size_t>(end - digits));
    return S_OK;
  }
  const auto letter = FindConversion(inFormat, NumberKind::kDouble, FormatUse::kPrint);
  if (!letter) return E_INVALIDARG;
  const std::string text =
      std::isnan(inNumber) ? PrintNaN(inFormat, *letter, inNumber) : Print(inFormat, inNumber);
  BuildFromUTF8(text.data(), text.size());
  return S_OK;
}

int ZORUnicodeString::ConvertToNum(int* outNumber, const char* inFormat) const {
  if (!outNumber) return 0;
  if (IsFormat(inFormat, "%d")) return ReadDecimalInt(units_, *outNumber) ? 1 : 0;
  const auto letter = FindConversion(inFormat, NumberKind::kInt, FormatUse::kScan);
  if (!letter) return 0;
  // Scanned as a long long, so that a number past the range of int is seen and not cut.
  const std::string wideFormat = std::string(inFormat).insert(*letter, "ll");
  long long number = 0;
  if (!Scan(ConvertToChar(), wideFormat.c_str(), &number)) return 0;
  *outNumber = Saturated(number);
  return 1;
}

int ZORUnicodeString::ConvertToNum(double* outNumber, const char* inFormat) const {
  if (!outNumber) return 0;
  const bool plain =
      IsFormat(inFormat, "%le") || IsFormat(inFormat, "%lf") || IsFormat(inFormat, "%lg");
  if (plain && ReadDecimalDouble(units_, *outNumber)) return 1;
  if (!plain && !FindConversion(inFormat, NumberKind::kDouble, FormatUse::kScan)) return 0;
  double number = 0;
  if (!Scan(ConvertToChar(), inFormat, &number)) return 0;
  *outNumber = number;
  return 1;
}
