// Texts made safe for XML and for file names, logical names of places, a date stamp.
#ifndef ZOR_BUILD_PATH_H
#define ZOR_BUILD_PATH_H

#include "ZORLyraExport.h"
#include "platform/system/ZORString.h"
#include "platform/system/ZORUnicodeString.h"

/// Helpers for texts and paths. Only static operations; nothing is kept between two calls, and none
/// reports a failure but through its result.
///
/// The four converters append the converted input to the output, whose earlier text stays in front.
/// An empty input appends nothing. They work on UTF-16 code units: what is not named below is
/// copied as it is, surrogates, control characters and apostrophes included. Input and output may
/// be one string: its converted text then follows the text that it had.
class ZOR_LYRA_EXPORT BuildPath {
 public:
  BuildPath() = default;
  BuildPath(const BuildPath& inOther) = default;
  /// There is nothing to copy. @return this object.
  BuildPath& operator=(const BuildPath& inOther);

  // Texts for XML
  /// Replaces " & < > by "&quot;" "&amp;" "&lt;" "&gt;". Safe as element content and between
  /// quotation marks, not between apostrophes. Escaped text is escaped again.
  static void CheckXMLString(ZORUnicodeString& inText, ZORUnicodeString& ioOutput);
  /// As CheckXMLString, and each space becomes "_": for texts that end up as names or identifiers.
  static void CheckXMLString2(ZORUnicodeString& inText, ZORUnicodeString& ioOutput);

  // Names of files
  /// Replaces the nine characters that a Windows file name may not hold (" * / : < > ? \ |) by an
  /// ampersand and their decimal code, such as "&47", and each space by "_". The ampersand itself
  /// stays, so the input cannot be had back.
  static void DeleteSpecialCharacterOfFilename(ZORUnicodeString& inText,
                                               ZORUnicodeString& ioOutput);
  /// Replaces the same nine characters by complete character references such as "&#47;"; spaces
  /// stay.
  static void DeleteSpecialCharacterOfFilename2(ZORUnicodeString& inText,
                                                ZORUnicodeString& ioOutput);

  /// @return the number in decimal, with a leading "-" when it is negative.
  static ZORUnicodeString ConvToStr(int inValue);
  /// @return one backslash, the separator on every system; nothing is appended to anything.
  static ZORUnicodeString AppendSlash();
  /// @return one backslash as narrow text.
  static ZORString AppendSlash2();

  // Logical names
  /// The directory of a logical name of a document location. A name whose narrow form begins with a
  /// byte outside 0x02 to 0x7F, or is empty, is looked up without its first three characters.
  /// @return the expanded directory; for a name that is not in the table the name itself, but the
  ///         empty string when it was looked up without its first characters; the empty string when
  ///         the directory cannot be expanded.
  static ZORUnicodeString TransformFromDLName(ZORUnicodeString inName);
  /// The path that a reference such as "ZORDLN://NAME\folder\file" stands for: the directory of
  /// NAME, a backslash and all that follows the first backslash. Text before the scheme is dropped.
  /// @return the path; the reference itself when it holds no "ZORDLN://"; the empty string for a
  ///         name that is not in the table; "error" when its directory cannot be expanded.
  static ZORUnicodeString TransformPathnameFromDLName(ZORUnicodeString inReference);

  /// The user's local time now as day, month, year, hour, minute and second, joined by "_" and
  /// without leading zeros: 5_3_2024_9_7_3. Such stamps do not sort by time.
  static ZORUnicodeString GenerateDateURL();
};

#endif
