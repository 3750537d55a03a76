#include "BuildPath.h"

#include <algorithm>
#include <array>
#include <cstddef>
#include <cstdio>
#include <string_view>
#include <utility>

#include "LogicalNames.h"
#include "PlatformAdapter.h"
#include "platform/system/ZORTime.h"

namespace {

/// The converters, each a column of the table below.
enum TextConverter { kXMLText, kXMLName, kFileName, kFileNameReference };

struct CharacterRow {
  char16_t character;
  std::u16string_view replacement[4];  // by TextConverter; empty: the character stays
};

constexpr std::array<CharacterRow, 11> kCharacterRows = {{
    {u' ', {u"", u"_", u"_", u""}},
    {u'"', {u"&quot;", u"&quot;", u"&34", u"&#34;"}},
    {u'&', {u"&amp;", u"&amp;", u"", u""}},
    {u'*', {u"", u"", u"&42", u"&#42;"}},
    {u'/', {u"", u"", u"&47", u"&#47;"}},
    {u':', {u"", u"", u"&58", u"&#58;"}},
    {u'<', {u"&lt;", u"&lt;", u"&60", u"&#60;"}},
    {u'>', {u"&gt;", u"&gt;", u"&62", u"&#62;"}},
    {u'?', {u"", u"", u"&63", u"&#63;"}},
    {u'\\', {u"", u"", u"&92", u"&#92;"}},
    {u'|', {u"", u"", u"&124", u"&#124;"}},
}};

template <TextConverter kConverter>
constexpr std::u16string_view ReplacementOf(char16_t inUnit) {
  for (const CharacterRow& row : kCharacterRows)
    if (row.character == inUnit) return row.replacement[kConverter];
  return {};
}

/// Whether a unit has a replacement: one comparison a row and no branch, so that the compiler
/// vectorises the test.
template <TextConverter kConverter>
constexpr bool IsReplaced(char16_t inUnit) {
  return [inUnit]<std::size_t... kRow>(std::index_sequence<kRow...>) {
    return ((int{!kCharacterRows[kRow].replacement[kConverter].empty()} &
             int{kCharacterRows[kRow].character == inUnit}) |
            ...) != 0;
  }
  (std::make_index_sequence<kCharacterRows.size()>());
}

/// The first unit at or after inFrom that has a replacement, or inEnd. Most text has few: whole
/// blocks are skipped.
template <TextConverter kConverter>
const char16_t* FindReplaced(const char16_t* inFrom, const char16_t* inEnd) {
  constexpr std::ptrdiff_t kBlock = 64;
  for (; inEnd - inFrom >= kBlock; inFrom += kBlock) {
    unsigned short any = 0;
    for (std::ptrdiff_t i = 0; i < kBlock; ++i)
      any = static_cast<unsigned short>(any | IsReplaced<kConverter>(inFrom[i]));
    if (any != 0) break;
  }
  return std::find_if(inFrom, inEnd, IsReplaced<kConverter>);
}

/// Ordinary text is appended in runs short enough to be still in the cache when they are copied.
template <TextConverter kConverter>
void AppendReplaced(const char16_t* inUnits, std::size_t inCount, ZORUnicodeString& ioOutput) {
  constexpr std::ptrdiff_t kMaxRun = 8192;
  const char16_t* const end = inUnits + inCount;
  while (inUnits != end) {
    const char16_t* const runEnd = inUnits + std::min(end - inUnits, kMaxRun);
    const char16_t* const special = FindReplaced<kConverter>(inUnits, runEnd);
    adapter::AppendUnits(ioOutput, {inUnits, special});
    inUnits = special;
    if (special == runEnd) continue;
    const std::u16string_view replacement = ReplacementOf<kConverter>(*special);
    adapter::AppendUnits(ioOutput, replacement);
    ++inUnits;
  }
}

/// Reserves room for the converted text, but not for a short tail of a long text: there the
/// string's own growth keeps a sequence of appends linear.
void ReserveForTail(std::size_t inCount, ZORUnicodeString& ioOutput) {
  const std::size_t length = static_cast<std::size_t>(ioOutput.GetLengthInChar());
  if (inCount > length) adapter::Reserve(ioOutput, length + inCount + inCount / 8);
}

/// Appends a text to ioOutput, with the characters replaced that the converter replaces.
template <TextConverter kConverter>
void AppendConverted(const ZORUnicodeString& inText, ZORUnicodeString& ioOutput) {
  if (&inText == &ioOutput) return AppendConverted<kConverter>(ZORUnicodeString(inText), ioOutput);
  const ZORUC2Bytes* const units = inText.ConvertToUCChar();
  if (units == nullptr || inText.GetLengthInChar() < 1) return;
  const std::size_t count = static_cast<std::size_t>(inText.GetLengthInChar());
  ReserveForTail(count, ioOutput);
  AppendReplaced<kConverter>(units, count, ioOutput);
}

}  // namespace

BuildPath& BuildPath::operator=(const BuildPath&) { return *this; }

void BuildPath::CheckXMLString(ZORUnicodeString& inText, ZORUnicodeString& ioOutput) {
  AppendConverted<kXMLText>(inText, ioOutput);
}

void BuildPath::CheckXMLString2(ZORUnicodeString& inText, ZORUnicodeString& ioOutput) {
  AppendConverted<kXMLName>(inText, ioOutput);
}

void BuildPath::DeleteSpecialCharacterOfFilename(ZORUnicodeString& inText,
                                                 ZORUnicodeString& ioOutput) {
  AppendConverted<kFileName>(inText, ioOutput);
}

void BuildPath::DeleteSpecialCharacterOfFilename2(ZORUnicodeString& inText,
                                                  ZORUnicodeString& ioOutput) {
  AppendConverted<kFileNameReference>(inText, ioOutput);
}

ZORUnicodeString BuildPath::ConvToStr(int inValue) {
  char digits[16];
  std::snprintf(digits, sizeof digits, "%d", inValue);
  return ZORUnicodeString(digits);
}

ZORUnicodeString BuildPath::AppendSlash() { return ZORUnicodeString("\\"); }

ZORString BuildPath::AppendSlash2() { return ZORString("\\"); }

ZORUnicodeString BuildPath::TransformFromDLName(ZORUnicodeString inName) {
  return DirectoryOfLogicalName(inName);
}

ZORUnicodeString BuildPath::TransformPathnameFromDLName(ZORUnicodeString inReference) {
  return PathOfReference(inReference);
}

ZORUnicodeString BuildPath::GenerateDateURL() {
  const ZORTime now;
  const int day = now.GetDay(kZORTzLocal);
  const int month = now.GetMonth(kZORTzLocal);
  const int year = now.GetYear(kZORTzLocal);
  const int hour = now.GetHour(kZORTzLocal);
  const int minute = now.GetMinute(kZORTzLocal);
  const int second = now.GetSecond(kZORTzLocal);
  ZORUnicodeString stamp = ConvToStr(day);
  for (int part : {month, year, hour, minute, second}) {
    stamp.Append("_");
    stamp.Append(ConvToStr(part));
  }
  return stamp;
}
