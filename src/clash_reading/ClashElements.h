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
  return inNode.getNodeType() == DOM_Node::ELEMENT_NODE && adapter::HasName(inNode, inName);
}

/// Calls inVisit for each child element of a parent in document order.
template <class Visit>
void ForEachElement(const DOM_Node& inParent, const Visit& inVisit) {
  for (DOM_Node child = adapter::FirstElementChild(inParent); !child.isNull();
       child = adapter::NextElementSibling(child))
    inVisit(child);
}

/// Calls inVisit for each child element of a name in document order.
template <class NameText, class Visit>
void ForEachElement(const DOM_Node& inParent, const NameText& inName, const Visit& inVisit) {
  ForEachElement(inParent, [&](const DOM_Node& inChild) {
    if (adapter::HasName(inChild, inName)) inVisit(inChild);
  });
}

/// The first child element of a name, or a null node.
template <class NameText>
DOM_Node FirstElement(const DOM_Node& inParent, const NameText& inName) {
  DOM_Node child = adapter::FirstElementChild(inParent);
  while (!child.isNull() && !adapter::HasName(child, inName))
    child = adapter::NextElementSibling(child);
  return child;
}

/// The child node at a position counted from 0, of any type; null outside.
inline DOM_Node ChildAt(const DOM_Node& inParent, int inPosition) {
  return inParent.getChildNodes().item(static_cast<unsigned int>(inPosition));
}

/// What is read of the attributes of an element, which must outlive this.
class ElementAttributes {
 public:
  explicit ElementAttributes(const DOM_Node& inElement) : attributes_(inElement) {}

  /// Empty where the attribute is missing.
  void ReadText(const char* inName, ZORUnicodeString& outText) const {
    attributes_.Read(inName, outText);
  }
  void ReadText(const ZORUnicodeString& inName, ZORUnicodeString& outText) const {
    attributes_.Read(inName.ConvertToChar(), outText);
  }
  /// An attribute that holds a number, its first comma replaced by a point.
  void ReadNumber(const char* inName, ZORUnicodeString& outText) const {
    attributes_.Read(inName, outText);
    if (adapter::UnitsOf(outText).find(u',') == std::u16string_view::npos) return;
    // Never deleted: a host's own static objects may read while the process ends.
    static const auto* const comma = new ZORUnicodeString(",");
    static const auto* const point = new ZORUnicodeString(".");
    outText.ReplaceSubString(*comma, *point);
  }
  template <class NameText>
  ZORUnicodeString Text(const NameText& inName) const {
    ZORUnicodeString text;
    ReadText(inName, text);
    return text;
  }

 private:
  adapter::AttributeSource<DOM_Node> attributes_;
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
