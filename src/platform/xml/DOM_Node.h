// A handle of a node of a document.
#ifndef ZOR_PLATFORM_XML_DOM_NODE_H
#define ZOR_PLATFORM_XML_DOM_NODE_H

#include <cstdint>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/xml/DOMString.h"

class DOM_Document;
class DOM_NamedNodeMap;
class DOM_NodeList;
class DOM_Tree;

/// A small counted reference to a node: copied freely; keeps the node's document alive; null when
/// it refers to nothing. Every question to a null handle has an answer: null handles, null strings,
/// empty lists, 0. A change through a null handle, or one that the document refuses, raises
/// DOM_DOMException and changes nothing. A document and its handles are used by one thread at a
/// time.
class ZOR_PLATFORM_EXPORT DOM_Node {
 public:
  enum NodeType {
#if ZOR_PLATFORM_ADDITIONS
    NULL_NODE = 0,  ///< what a null handle answers
#endif
    ELEMENT_NODE = 1,
    ATTRIBUTE_NODE = 2,
    TEXT_NODE = 3,
    CDATA_SECTION_NODE = 4,
    ENTITY_REFERENCE_NODE = 5,
    ENTITY_NODE = 6,
    PROCESSING_INSTRUCTION_NODE = 7,
    COMMENT_NODE = 8,
    DOCUMENT_NODE = 9,
    DOCUMENT_TYPE_NODE = 10,
    DOCUMENT_FRAGMENT_NODE = 11
  };

  DOM_Node();
  DOM_Node(const DOM_Node& inOther);
  DOM_Node(DOM_Node&& ioOther) noexcept;
  DOM_Node& operator=(const DOM_Node& inOther);
  DOM_Node& operator=(DOM_Node&& ioOther) noexcept;
  ~DOM_Node();

  bool isNull() const;

  // Asking
  short getNodeType() const;
  /// Tag name of an element, name of an attribute, target of a processing instruction, else "#text"
  /// and the like.
  DOMString getNodeName() const;
  /// Value of an attribute, text of a text node, comment, CDATA section or processing instruction;
  /// else null.
  DOMString getNodeValue() const;
  /// Null for an attribute, a document, a fragment and a node without parent.
  DOM_Node getParentNode() const;
  DOM_Node getFirstChild() const;
  DOM_Node getLastChild() const;
  DOM_Node getPreviousSibling() const;
  DOM_Node getNextSibling() const;
  bool hasChildNodes() const;
  /// The children, as a list that follows later changes. Both its questions take amortised constant
  /// time.
  DOM_NodeList getChildNodes() const;
  DOM_NamedNodeMap getAttributes() const;  ///< empty for all but elements
  /// The document of the node; null for a document itself.
  DOM_Document getOwnerDocument() const;

  // Changing
  /// Sets the value of an attribute, text, comment, CDATA section or processing instruction; other
  /// kinds ignore it.
  void setNodeValue(const DOMString& inValue);
  /// Adds a node as the last child; a node that has a parent leaves it first; a fragment gives its
  /// children.
  /// @return inChild. Raises HIERARCHY_REQUEST_ERR, WRONG_DOCUMENT_ERR or NULL_HANDLE_ERR.
  DOM_Node appendChild(const DOM_Node& inChild);
  /// A copy in the same document, without parent; an element's attributes are always copied. Null
  /// for a null handle. Raises NOT_SUPPORTED_ERR for a document, a document type or an attribute.
  /// @param inDeep whether all descendants are copied too, whatever their depth: nothing recurses.
  DOM_Node cloneNode(bool inDeep) const;

#if ZOR_PLATFORM_ADDITIONS
  /// Same node of the same document; two null handles are equal.
  bool operator==(const DOM_Node& inOther) const;
  bool operator!=(const DOM_Node& inOther) const;
  /// As getFirstChild and getNextSibling, passing over all that is no element.
  DOM_Node getFirstElementChild() const;
  DOM_Node getNextElementSibling() const;
  /// Whether the node's name is this text, without making a string of it.
  bool hasName(const char* inAscii) const;
  /// Puts the value of an attribute into a text, without making a handle or a string of it; empties
  /// it when the node has no such attribute.
  void getAttributeText(const char* inName, ZORUnicodeString& outText) const;
  /// How many changes have been made to the node's document so far. The same number twice means
  /// that no node in it has come, gone, moved or changed its value in between. Making a node or a
  /// copy that stays outside the tree, and changing such nodes, does not count.
  std::uint64_t getChangeCount() const;
  /// As appendChild, before a child of this node (last when inBefore is null). Also raises
  /// NOT_FOUND_ERR.
  DOM_Node insertBefore(const DOM_Node& inChild, const DOM_Node& inBefore);
  /// @return inOld, now without parent.
  DOM_Node replaceChild(const DOM_Node& inNew, const DOM_Node& inOld);
  /// @return inChild, now without parent. Raises NOT_FOUND_ERR.
  DOM_Node removeChild(const DOM_Node& inChild);
#endif

 protected:
  friend class DOM_HandleAccess;
  DOM_Node(DOM_Tree* inTree, std::uint32_t inNode, std::uint32_t inAttribute);

  DOM_Tree* tree_;           // null for a null handle
  std::uint32_t node_;       // the node, or the element that owns the attribute
  std::uint32_t attribute_;  // 0 unless the node is an attribute
};

#endif
