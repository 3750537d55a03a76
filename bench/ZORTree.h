// The hash of a document that the XML handles hold, and their texts as views.
#ifndef ZOR_BENCH_ZORTREE_H
#define ZOR_BENCH_ZORTREE_H

#include <string_view>

#include "ResultHash.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_Node.h"

inline std::u16string_view Units(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

inline std::u16string_view Units(const DOMString& inText) {
  return {inText.rawBuffer(), inText.length()};
}

/// Adds a node and all below it.
inline void HashTree(const DOM_Node& inNode, std::size_t inDepth, TreeHash& ioHash) {
  if (inNode.getNodeType() == DOM_Node::TEXT_NODE) {
    ioHash.AddText(inDepth, Units(inNode.getNodeValue()));
    return;
  }
  if (inNode.getNodeType() == DOM_Node::ELEMENT_NODE) {
    ioHash.AddElement(inDepth, Units(inNode.getNodeName()));
    const DOM_NamedNodeMap attributes = inNode.getAttributes();
    for (unsigned int i = 0; i < attributes.getLength(); ++i) {
      const DOM_Node attribute = attributes.item(i);
      ioHash.AddAttribute(Units(attribute.getNodeName()), Units(attribute.getNodeValue()));
    }
  }
  for (DOM_Node child = inNode.getFirstChild(); !child.isNull(); child = child.getNextSibling())
    HashTree(child, inDepth + 1, ioHash);
}

#endif
