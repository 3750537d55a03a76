// A handle of an element.
#ifndef ZOR_PLATFORM_XML_DOM_ELEMENT_H
#define ZOR_PLATFORM_XML_DOM_ELEMENT_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/xml/DOM_Node.h"

class ZOR_PLATFORM_EXPORT DOM_Element : public DOM_Node {
 public:
  DOM_Element();

  DOMString getTagName() const;
  /// Sets an attribute, added as the last one when it is missing. Raises INVALID_CHARACTER_ERR for
  /// a name that no attribute may have.
  void setAttribute(const DOMString& inName, const DOMString& inValue);

#if ZOR_PLATFORM_ADDITIONS
  /// A cast: null when the node is not an element.
  explicit DOM_Element(const DOM_Node& inNode);
  /// The value of an attribute; the empty string when it is missing.
  DOMString getAttribute(const DOMString& inName) const;
  void removeAttribute(const DOMString& inName);
#endif
};

#endif
