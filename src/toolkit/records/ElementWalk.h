// Walking the elements of a document; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_RECORDS_ELEMENT_WALK_H
#define ZOR_TOOLKIT_RECORDS_ELEMENT_WALK_H

#include <string>

#include "ZORLyraGeneralServices.h"
#include "platform/xml/DOM_Node.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {

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

/// How many child elements of a name (null for any) there are.
inline int CountElements(const DOM_Node& inParent, const char* inName) {
  int count = 0;
  ForEachElement(inParent, inName, [&](const DOM_Node&) { ++count; });
  return count;
}

/// The value of an attribute, empty when it is missing.
inline std::string AttributeText(const DOM_Node& inNode, const char* inName) {
  return Utf8(ZORLyraGeneralServices::GetAttrOnNode(inNode, inName));
}

/// UTF-8 as the document holds texts.
inline DOMString DocumentString(const std::string& inText) {
  const ZORUnicodeString text = FromUtf8(inText);
  return DOMString(text.ConvertToUCChar(), static_cast<unsigned int>(text.GetLengthInChar()));
}

}  // namespace ZORToolkit

#endif
