// A handle of the children of a node.
#ifndef ZOR_PLATFORM_XML_DOM_NODELIST_H
#define ZOR_PLATFORM_XML_DOM_NODELIST_H

#include "platform/xml/DOM_Node.h"

/// The children of a node, as they are at each question. Empty by default.
class ZOR_PLATFORM_EXPORT DOM_NodeList {
 public:
  DOM_NodeList();
  bool isNull() const;  ///< belongs to no node
  unsigned int getLength() const;
  /// @return the child at a 0-based position, null outside.
  DOM_Node item(unsigned int inPosition) const;

 private:
  friend class DOM_Node;
  explicit DOM_NodeList(const DOM_Node& inParent);
  DOM_Node parent_;
};

#endif
