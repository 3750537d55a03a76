// Walking the element children of a node.
#ifndef ZOR_TOOLS_LYRA_ELEMENT_CHILDREN_H
#define ZOR_TOOLS_LYRA_ELEMENT_CHILDREN_H

#include "platform/xml/DOM_Node.h"

namespace lyra {

/// The first element of a name among a node and its next siblings; a null node when there is none.
/// @param inName null for any name.
inline DOM_Node ElementFrom(DOM_Node inNode, const char* inName) {
  while (!inNode.isNull() && (inNode.getNodeType() != DOM_Node::ELEMENT_NODE ||
                              (inName != nullptr && !inNode.getNodeName().equals(inName))))
    inNode = inNode.getNextSibling();
  return inNode;
}

inline DOM_Node FirstElement(const DOM_Node& inParent, const char* inName) {
  return ElementFrom(inParent.getFirstChild(), inName);
}

/// Calls inVisit for each child element of a name (null for any) in document order.
template <class Visit>
void ForEachElement(const DOM_Node& inParent, const char* inName, const Visit& inVisit) {
  for (DOM_Node child = FirstElement(inParent, inName); !child.isNull();
       child = ElementFrom(child.getNextSibling(), inName))
    inVisit(child);
}

}  // namespace lyra

#endif
