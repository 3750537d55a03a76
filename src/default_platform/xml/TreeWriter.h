// From a tree to XML text.
#ifndef ZOR_DEFAULT_PLATFORM_XML_TREEWRITER_H
#define ZOR_DEFAULT_PLATFORM_XML_TREEWRITER_H

#include "platform/xml/DOM_Node.h"

/// Whether a name is "UTF-8" or "UTF-16", in any case.
bool IsWritableEncoding(const ZORUnicodeString& inName);
/// Writes a node and all below it.
/// @return false, with outText unchanged, for a tree that no XML text can carry.
bool WriteTree(const DOM_Node& inNode, DOMString& outText);

#endif
