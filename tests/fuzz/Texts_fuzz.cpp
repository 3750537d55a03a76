// Operations on texts: searching, cutting, converting and reading numbers.
#include <vector>

#include "foundation/Utf8.h"
#include "fuzz/Fuzz.h"
#include "platform/system/ZORToken.h"
#include "platform/system/ZORUnicodeString.h"

namespace {

std::string Utf8Of(const ZORUnicodeString& inText) {
  std::vector<char> bytes(3 * static_cast<std::size_t>(inText.GetLengthInChar()) + 1);
  std::size_t count = 0;
  inText.ConvertToUTF8(bytes.data(), &count);
  return {bytes.data(), count};
}

void CutAndJoin(const ZORUnicodeString& inText, const ZORUnicodeString& inPart, int inAt) {
  const int length = inText.GetLengthInChar();
  for (const int mode : {1, 2, 4}) inText.Strip(mode);
  for (const int mode : {1, 2}) {
    const int found = inText.SearchSubString(inPart, inAt, mode);
    if (found < 0) continue;
    fuzz::Require(inText.SubString(found, inPart.GetLengthInChar()) == inPart, "found otherwise");
  }
  if (inAt < 0 || inAt > length) return;
  ZORUnicodeString joined = inText.SubString(0, inAt);
  joined.Append(inText.SubString(inAt));
  fuzz::Require(joined == inText, "cut and joined otherwise");
  joined.Insert(inAt, inPart);
  fuzz::Require(joined.GetLengthInChar() == length + inPart.GetLengthInChar(),
                "inserted otherwise");
  joined.ReplaceSubString(inPart, "x");
}

void ReadNumbers(const ZORUnicodeString& inText, const char* inFormat) {
  int integer = 0;
  double number = 0;
  inText.ConvertToNum(&integer);
  inText.ConvertToNum(&number);
  inText.ConvertToNum(&integer, inFormat);
  inText.ConvertToNum(&number, inFormat);
  ZORUnicodeString built;
  built.BuildFromNum(integer, inFormat);
  built.BuildFromNum(number, inFormat);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  const std::string bytes = fuzz::Text(inBytes, inSize);
  const std::size_t half = inSize / 2;
  const int at = inSize == 0 ? 0 : static_cast<int>(inBytes[0]) - 8;
  const ZORUnicodeString text(bytes.c_str()), part(bytes.substr(half).c_str());
  fuzz::Require(ZORFoundation::IsUtf8(Utf8Of(text)), "no valid UTF-8");
  fuzz::Require(ZORUnicodeString(text.ConvertToChar()) == text, "narrowed and widened otherwise");
  CutAndJoin(text, part, at);
  ReadNumbers(text, bytes.substr(0, half).c_str());
  std::u16string units(half, u'\0');
  for (std::size_t i = 0; i < half; ++i)
    units[i] = static_cast<char16_t>(inBytes[2 * i] << 8 | inBytes[2 * i + 1]);
  ZORUnicodeString raw;
  raw.BuildFromUTF16(units.data(), units.size());
  fuzz::Require(ZORFoundation::IsUtf8(Utf8Of(raw)), "no valid UTF-8 from units");
  CutAndJoin(raw, part, at);
  return 0;
}
