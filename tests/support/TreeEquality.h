// Whether two trees say the same.
#ifndef ZOR_TESTS_SUPPORT_TREEEQUALITY_H
#define ZOR_TESTS_SUPPORT_TREEEQUALITY_H

#include <string>

#include "platform/xml/DOM_NamedNodeMap.h"
#include "support/XMLText.h"

namespace support {

/// The first difference of two trees (kinds, names, values, attributes in order, children in order),
/// "" when there is none. Walks without recursion.
inline std::string TreeDifference(const DOM_Node& inA, const DOM_Node& inB);

namespace detail {

inline std::string Describe(const DOM_Node& inNode) {
  return inNode.isNull()
             ? "nothing"
             : "kind " + std::to_string(inNode.getNodeType()) + " \"" +
                   Narrow(inNode.getNodeName()) + "\" = \"" + Narrow(inNode.getNodeValue()) + "\"";
}

inline bool IsSameNode(const DOM_Node& inA, const DOM_Node& inB) {
  if (inA.getNodeType() != inB.getNodeType() || !inA.getNodeName().equals(inB.getNodeName()) ||
      inA.getNodeValue().isNull() != inB.getNodeValue().isNull() ||
      !inA.getNodeValue().equals(inB.getNodeValue()))
    return false;
  // What a document type declares shows in its text alone.
  return inA.getNodeType() != DOM_Node::DOCUMENT_TYPE_NODE || WrittenText(inA) == WrittenText(inB);
}

inline std::string NodeDifference(const DOM_Node& inA, const DOM_Node& inB) {
  if (!IsSameNode(inA, inB)) return Describe(inA) + " against " + Describe(inB);
  const DOM_NamedNodeMap a = inA.getAttributes();
  const DOM_NamedNodeMap b = inB.getAttributes();
  if (a.getLength() != b.getLength()) return Describe(inA) + ": other number of attributes";
  for (unsigned int i = 0; i < a.getLength(); ++i)
    if (!IsSameNode(a.item(i), b.item(i)))
      return Describe(inA) + ": " + Describe(a.item(i)) + " against " + Describe(b.item(i));
  return "";
}

}  // namespace detail

inline std::string TreeDifference(const DOM_Node& inA, const DOM_Node& inB) {
  DOM_Node a = inA;
  DOM_Node b = inB;
  while (true) {
    const std::string difference = detail::NodeDifference(a, b);
    if (!difference.empty() || a.isNull()) return difference;
    const DOM_Node childA = a.getFirstChild();
    const DOM_Node childB = b.getFirstChild();
    if (!childA.isNull() || !childB.isNull()) {
      a = childA;
      b = childB;
      continue;
    }
    while (a != inA && a.getNextSibling().isNull() && b.getNextSibling().isNull()) {
      a = a.getParentNode();
      b = b.getParentNode();
    }
    if (a == inA) return "";
    a = a.getNextSibling();
    b = b.getNextSibling();
  }
}

}  // namespace support

#endif
