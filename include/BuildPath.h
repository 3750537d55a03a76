// Escaping for XML and for file names, logical names of directories, date stamps.
#ifndef ZOR_BUILD_PATH_H
#define ZOR_BUILD_PATH_H

#include "ZORLyraExport.h"
#include "platform/system/ZORString.h"
#include "platform/system/ZORUnicodeString.h"

/// Helpers for texts and paths: static, stateless operations, which report failures through their
/// results alone.
///
/// The four converters append the converted input to the output, whose earlier text stays in front.
/// They work on UTF-16 code units and copy all that is not listed below unchanged, surrogates,
/// control characters and apostrophes included. Input and output may be the same string: the
/// converted text then follows the original.
class ZOR_LYRA_EXPORT BuildPath {
 public:
  BuildPath() = default;
  BuildPath(const BuildPath& inOther) = default;
  /// Copies nothing: there is no state. @return this object.
  BuildPath& operator=(const BuildPath& inOther);

  // Texts for XML
  /// Replaces " & < > by "&quot;" "&amp;" "&lt;" "&gt;". Safe as element content and between
  /// quotation marks, not between apostrophes. Escaped text is escaped again.
  static void CheckXMLString(ZORUnicodeString& inText, ZORUnicodeString& ioOutput);
  /// As CheckXMLString, and each space becomes "_": for texts that end up as names or identifiers.
  static void CheckXMLString2(ZORUnicodeString& inText, ZORUnicodeString& ioOutput);

  // Names of files
  /// Replaces the nine characters that a Windows file name may not hold (" * / : < > ? \ |) by an
  /// ampersand and their decimal code, such as "&47", and each space by "_". Not reversible: an
  /// ampersand in the input is not escaped.
  static void DeleteSpecialCharacterOfFilename(ZORUnicodeString& inText,
                                               ZORUnicodeString& ioOutput);
  /// Replaces the same nine characters by complete character references such as "&#47;"; spaces
  /// stay.
  static void DeleteSpecialCharacterOfFilename2(ZORUnicodeString& inText,
                                                ZORUnicodeString& ioOutput);

  /// @return the number in decimal, with a leading "-" when it is negative.
  static ZORUnicodeString ConvToStr(int inValue);
  /// @return one backslash, the separator on every system. Appends nothing, in spite of its name.
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
