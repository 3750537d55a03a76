#include "BuildPath.h"

#include <cstdio>

#include "path_text/LogicalNames.h"
#include "path_text/TextReplacement.h"
#include "platform/system/ZORTime.h"

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
