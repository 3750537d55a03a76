// A string of the XML library.
#ifndef ZOR_PLATFORM_XML_DOMSTRING_H
#define ZOR_PLATFORM_XML_DOMSTRING_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORUnicodeString.h"

class DOM_Tree;
struct DOM_Text;

/// UTF-16 text of a document, or text on its way into one. A value: copied freely, never changed. A
/// string may be null, which is what a missing value is; a null string has the length 0 and
/// converts to the empty string. A string taken from a document keeps that document alive.
class ZOR_PLATFORM_EXPORT DOMString {
 public:
  DOMString();  ///< null
  /// @param inNarrow zero-terminated narrow text; null gives the null string.
  DOMString(const char* inNarrow);
  DOMString(const DOMString& inOther);
  DOMString(DOMString&& ioOther) noexcept;
  DOMString& operator=(DOMString inOther) noexcept;
  ~DOMString();

  bool isNull() const;
  unsigned int length() const;  ///< code units
  /// The code units, without terminating zero; null when the length is 0. Valid while this string
  /// or a copy lives.
  const ZORUC2Bytes* rawBuffer() const;
  ZORUnicodeString DOMStringToZORUnicodeString() const;

#if ZOR_PLATFORM_ADDITIONS
  /// @param inUnits inCount UTF-16 code units; null gives the null string.
  DOMString(const ZORUC2Bytes* inUnits, unsigned int inCount);
  /// Same text; a null string equals an empty one.
  bool equals(const DOMString& inOther) const;
  bool equals(const char* inAscii) const;
  /// The same text as UTF-8, without terminating zero, if the string is kept so, as that of a
  /// serialised node is; else null. Valid while this string or a copy lives.
  const char* rawUTF8(std::size_t& outCount) const;
#endif

 private:
  friend class DOM_Tree;
  friend class DOM_HandleAccess;
  DOMString(DOM_Tree* inTree, const DOM_Text* inText);

  const DOM_Text* text_;  // null for the null string
  DOM_Tree* tree_;        // the tree that owns text_; null when the string owns it
};

#endif
