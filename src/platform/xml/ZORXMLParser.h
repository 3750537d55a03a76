// The platform's access to the XML library.
#ifndef ZOR_PLATFORM_XML_ZORXMLPARSER_H
#define ZOR_PLATFORM_XML_ZORXMLPARSER_H

#include "ZORPlatformExport.h"
#include "platform/system/ZORResult.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"
#include "platform/xml/InputSource.h"

class ZOR_PLATFORM_EXPORT ZORXMLParser {
 public:
  /// Prepares the XML library; may be called again and again.
  /// @return S_OK, or E_FAIL when it cannot be prepared.
  static HRESULT Initialize();

  /// Makes a source over bytes in memory.
  /// @param inBytes      read while a parser reads the source; kept by the caller unless adopted.
  /// @param inCount      number of bytes; inBytes may be null when it is 0.
  /// @param inIdentifier what errors name the document by.
  /// @param inAdopt      nonzero: the source deletes the bytes (allocated with new[]) when it ends.
  /// @param outSource    the new source, deleted by the caller; null on failure.
  /// @return S_OK, or E_INVALIDARG for null bytes with a count or a count beyond 2,147,483,647.
  static HRESULT CreateMemBufInputSource(const unsigned char* inBytes, unsigned int inCount,
                                         const ZORUnicodeString& inIdentifier,
                                         unsigned char inAdopt, InputSource*& outSource);

  /// Writes a node and all below it as XML text, without an XML declaration and with nothing
  /// between the nodes of a document. The text reads back as an equal tree, but for neighbouring
  /// texts, which read back as one, and a CDATA section that holds "]]>" or a carriage return, which
  /// reads back as several nodes with the same characters.
  /// @param inEncoding the encoding that the text is meant for: "UTF-8" or "UTF-16", in any case.
  /// @param outText    the text; unchanged on failure.
  /// @return S_OK; E_INVALIDARG for a null node or an unknown encoding; E_FAIL for a tree that no XML
  ///         text can carry (a control character, half a surrogate pair, "--" in a comment).
  static HRESULT WriteXML(const DOM_Node& inNode, const ZORUnicodeString& inEncoding,
                          DOMString& outText);
};

#endif
