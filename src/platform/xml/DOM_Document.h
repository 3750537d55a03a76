// A handle of a document.
#ifndef ZOR_PLATFORM_XML_DOM_DOCUMENT_H
#define ZOR_PLATFORM_XML_DOM_DOCUMENT_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/xml/DOM_Element.h"

/// A document lives as long as a handle of it, of one of its nodes or of one of its strings. Nodes
/// that were made but never put into the tree go when their last handle goes; nodes that were taken
/// out of it go with the document.
class ZOR_PLATFORM_EXPORT DOM_Document : public DOM_Node {
 public:
  DOM_Document();

  DOM_Element getDocumentElement() const;  ///< the root element, null when there is none
  /// A new element of this document, without parent. A name that XML does not allow raises
  /// INVALID_CHARACTER_ERR.
  DOM_Element createElement(const DOMString& inName);
  /// A copy, in this document, of a node of any document (this one too); without parent. The source
  /// is not changed. Raises NOT_SUPPORTED_ERR for a document, a document type or an attribute.
  DOM_Node importNode(const DOM_Node& inNode, bool inDeep);

#if ZOR_PLATFORM_ADDITIONS
  /// A cast: null when the node is not a document.
  explicit DOM_Document(const DOM_Node& inNode);
  /// A new document without a root.
  static DOM_Document createDocument();
  DOM_Node getDoctype() const;  ///< null when there is none

  // More new nodes of this document, without parent, as createElement makes them.
  DOM_Node createTextNode(const DOMString& inText);
  DOM_Node createCDATASection(const DOMString& inText);
  DOM_Node createComment(const DOMString& inText);
  DOM_Node createProcessingInstruction(const DOMString& inTarget, const DOMString& inData);
  DOM_Node createDocumentFragment();
#endif
};

#endif
