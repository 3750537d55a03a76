#include "default_platform/system/NumberFormat.h"

#include <cstring>

namespace ZORDefault {
namespace {

bool IsOneOf(char inCharacter, const char* inSet) {
  return inCharacter != '\0' && std::strchr(inSet, inCharacter) != nullptr;
}

// Passes over at most four digits: a longer width or precision is a mistake or an attack.
bool SkipDigits(const char*& ioText) {
  int digits = 0;
  for (; IsOneOf(*ioText, "0123456789"); ++ioText) ++digits;
  return digits <= 4;
}

// Reads what stands between '%' and the conversion letter.
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

}  // namespace

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

}  // namespace ZORDefault
