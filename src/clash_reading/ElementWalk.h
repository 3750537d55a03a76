// Walking the element children of a node by name.
#ifndef ZOR_CLASH_READING_ELEMENT_WALK_H
#define ZOR_CLASH_READING_ELEMENT_WALK_H

#include <algorithm>
#include <cstddef>

#include "ZORLyraGeneralServices.h"
#include "platform/xml/DOM_Node.h"

/// Whether a document's text is a given one. Nothing is copied: every child of every walk is asked.
inline bool IsText(const DOMString& inText, const char* inAscii) { return inText.equals(inAscii); }
inline bool IsText(const DOMString& inText, const ZORUnicodeString& inOther) {
  const std::size_t length = inText.length();
  return length == static_cast<std::size_t>(inOther.GetLengthInChar()) &&
         std::equal(inText.rawBuffer(), inText.rawBuffer() + length, inOther.ConvertToUCChar());
}

/// Whether a node is an element of a name; the name is a ZORUnicodeString or ASCII text.
template <class NameText>
bool IsElementNamed(const DOM_Node& inNode, const NameText& inName) {
  return inNode.getNodeType() == DOM_Node::ELEMENT_NODE && IsText(inNode.getNodeName(), inName);
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

/// Whether a node is in the tree of its document: not made and kept outside, nor taken out.
inline bool IsInDocument(const DOM_Node& inNode) {
  DOM_Node top = inNode;
  for (DOM_Node up = top.getParentNode(); !up.isNull(); up = top.getParentNode()) top = up;
  return top.getNodeType() == DOM_Node::DOCUMENT_NODE;
}

#endif
