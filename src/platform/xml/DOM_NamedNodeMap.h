// A handle of the attributes of an element.
#ifndef ZOR_PLATFORM_XML_DOM_NAMEDNODEMAP_H
#define ZOR_PLATFORM_XML_DOM_NAMEDNODEMAP_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/xml/DOM_Node.h"

/// The attributes of an element in document order, as they are at each question. Empty by default.
class ZOR_PLATFORM_EXPORT DOM_NamedNodeMap {
 public:
  DOM_NamedNodeMap();
  bool isNull() const;  ///< belongs to no element
  unsigned int getLength() const;
  /// @return the attribute at a 0-based position, null outside.
  DOM_Node item(unsigned int inPosition) const;
  /// @return the attribute of a name, null when there is none.
  DOM_Node getNamedItem(const DOMString& inName) const;

#if ZOR_PLATFORM_ADDITIONS
  /// The same without making a string of the name, which is what readers ask most.
  /// @param inName zero-terminated narrow text; null for no name.
  DOM_Node getNamedItem(const char* inName) const;
#endif

 private:
  friend class DOM_Node;
  explicit DOM_NamedNodeMap(const DOM_Node& inElement);
  DOM_Node element_;
};

#endif
