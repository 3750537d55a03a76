// Walking the element children of a node by name, and reading their attributes.
#ifndef ZOR_CLASH_READING_CLASH_ELEMENTS_H
#define ZOR_CLASH_READING_CLASH_ELEMENTS_H

#include <limits>
#include <string_view>

#include "PlatformAdapter.h"
#include "ZORLyraGeneralServices.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_Node.h"
#include "platform/xml/DOM_NodeList.h"

/// Whether a node is an element of a name; the name is a ZORUnicodeString or ASCII text.
template <class NameText>
bool IsElementNamed(const DOM_Node& inNode, const NameText& inName) {
  return inNode.getNodeType() == DOM_Node::ELEMENT_NODE &&
         adapter::IsText(inNode.getNodeName(), inName);
}

/// Calls inVisit for each child node of a parent in document order.
template <class Visit>
void ForEachChild(const DOM_Node& inParent, const Visit& inVisit) {
  for (DOM_Node child = inParent.getFirstChild(); !child.isNull(); child = child.getNextSibling())
    inVisit(child);
}

/// Calls inVisit for each child element of a name in document order.
template <class NameText, class Visit>
void ForEachElement(const DOM_Node& inParent, const NameText& inName, const Visit& inVisit) {
  ForEachChild(inParent, [&](const DOM_Node& inChild) {
    if (IsElementNamed(inChild, inName)) inVisit(inChild);
  });
}

/// The first child element of a name, or a null node.
template <class NameText>
DOM_Node FirstElement(const DOM_Node& inParent, const NameText& inName) {
  DOM_Node child = inParent.getFirstChild();
  while (!child.isNull() && !IsElementNamed(child, inName)) child = child.getNextSibling();
  return child;
}

/// The child node at a position counted from 0, of any type; null outside.
inline DOM_Node ChildAt(const DOM_Node& inParent, int inPosition) {
  return inParent.getChildNodes().item(static_cast<unsigned int>(inPosition));
}

/// The attributes of an element, looked up once for all that are read of it.
class ElementAttributes {
 public:
  explicit ElementAttributes(const DOM_Node& inElement) : attributes_(inElement.getAttributes()) {}

  /// Empty where the attribute is missing.
  ZORUnicodeString Text(const char* inName) const {
    return ZORLyraGeneralServices::GetDOMName(attributes_.getNamedItem(inName).getNodeValue());
  }
  ZORUnicodeString Text(const ZORUnicodeString& inName) const {
    return Text(inName.ConvertToChar());
  }
  /// An attribute that holds a number, its first comma replaced by a point.
  ZORUnicodeString Number(const char* inName) const {
    ZORUnicodeString text = Text(inName);
    if (adapter::UnitsOf(text).find(u',') != std::u16string_view::npos)
      text.ReplaceSubString(",", ".");
    return text;
  }

 private:
  DOM_NamedNodeMap attributes_;
};

/// The "NbInterf" of a result set read as a floating number and truncated toward zero; 0 when it is
/// missing or no number, the nearest int when it is beyond the range of int.
inline int TruncatedDeclaredCount(const DOM_Node& inResultSet) {
  using Int = std::numeric_limits<int>;
  double declared = 0.0;
  ZORLyraGeneralServices::GetAttrOnNode(inResultSet, "NbInterf").ConvertToNum(&declared, "%le");
  if (!(declared >= Int::min())) return declared < 0 ? Int::min() : 0;  // 0: not a number
  return declared > Int::max() ? Int::max() : static_cast<int>(declared);
}

#endif
