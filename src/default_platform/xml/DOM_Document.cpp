#include "platform/xml/DOM_Document.h"

#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/XMLChars.h"
#include "platform/xml/DOM_DOMException.h"

namespace {

DOM_Tree& TreeToChange(const DOM_Node& inHandle) {
  if (inHandle.isNull())
    throw DOM_DOMException(DOM_DOMException::NULL_HANDLE_ERR, "a change through a null handle");
  return *DOM_HandleAccess::TreeOf(inHandle);
}

// Raises INVALID_CHARACTER_ERR for what is not a name.
void RequireXMLName(std::u16string_view inName) {
  if (!IsXMLName(inName))
    throw DOM_DOMException(DOM_DOMException::INVALID_CHARACTER_ERR, "not a name of XML");
}

DOM_Node NewNode(const DOM_Node& inDocument, int inKind, const DOMString& inText) {
  DOM_Tree& tree = TreeToChange(inDocument);
  return DOM_HandleAccess::Handle(
      &tree, tree.NewDetached(inKind, 0, DOM_HandleAccess::TextFor(tree, inText)));
}

}  // namespace

DOM_Document::DOM_Document() = default;

DOM_Document::DOM_Document(const DOM_Node& inNode)
    : DOM_Node(inNode.getNodeType() == DOCUMENT_NODE ? inNode : DOM_Node()) {}

DOM_Document DOM_Document::createDocument() {
  return DOM_HandleAccess::DocumentOf(DOM_Tree::Create());
}

DOM_Element DOM_Document::getDocumentElement() const {
  if (isNull()) return DOM_Element();
  return DOM_Element(DOM_HandleAccess::Handle(tree_, tree_->FirstChildOfKind(node_, ELEMENT_NODE)));
}

DOM_Node DOM_Document::getDoctype() const {
  if (isNull()) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->FirstChildOfKind(node_, DOCUMENT_TYPE_NODE));
}

DOM_Element DOM_Document::createElement(const DOMString& inName) {
  DOM_Tree& tree = TreeToChange(*this);
  const std::u16string_view name = DOM_HandleAccess::Units(inName);
  RequireXMLName(name);
  return DOM_Element(
      DOM_HandleAccess::Handle(&tree, tree.NewDetached(ELEMENT_NODE, tree.InternName(name), 0)));
}

DOM_Node DOM_Document::createTextNode(const DOMString& inText) {
  return NewNode(*this, TEXT_NODE, inText);
}

DOM_Node DOM_Document::createCDATASection(const DOMString& inText) {
  return NewNode(*this, CDATA_SECTION_NODE, inText);
}

DOM_Node DOM_Document::createComment(const DOMString& inText) {
  return NewNode(*this, COMMENT_NODE, inText);
}

DOM_Node DOM_Document::createProcessingInstruction(const DOMString& inTarget,
                                                   const DOMString& inData) {
  DOM_Tree& tree = TreeToChange(*this);
  const std::u16string_view target = DOM_HandleAccess::Units(inTarget);
  RequireXMLName(target);
  if (IsReservedTarget(target))
    throw DOM_DOMException(DOM_DOMException::INVALID_CHARACTER_ERR,
                           "\"xml\" is not a target of processing instructions");
  return DOM_HandleAccess::Handle(
      &tree, tree.NewDetached(PROCESSING_INSTRUCTION_NODE, tree.InternName(target),
                              DOM_HandleAccess::TextFor(tree, inData)));
}

DOM_Node DOM_Document::createDocumentFragment() {
  DOM_Tree& tree = TreeToChange(*this);
  return DOM_HandleAccess::Handle(&tree, tree.NewDetached(DOCUMENT_FRAGMENT_NODE, 0, 0));
}

DOM_Node DOM_Document::importNode(const DOM_Node& inNode, bool inDeep) {
  DOM_Tree& tree = TreeToChange(*this);
  if (inNode.isNull())
    throw DOM_DOMException(DOM_DOMException::NULL_HANDLE_ERR, "a null node to import");
  const int kind = inNode.getNodeType();
  if (kind == DOCUMENT_NODE || kind == DOCUMENT_TYPE_NODE || kind == ATTRIBUTE_NODE)
    throw DOM_DOMException(DOM_DOMException::NOT_SUPPORTED_ERR,
                           "a document, document type or attribute cannot be imported");
  return DOM_HandleAccess::Handle(&tree, tree.Copy(*DOM_HandleAccess::TreeOf(inNode),
                                                   DOM_HandleAccess::NodeOf(inNode), inDeep));
}

// ---- elements

DOM_Element::DOM_Element() = default;

DOM_Element::DOM_Element(const DOM_Node& inNode)
    : DOM_Node(inNode.getNodeType() == ELEMENT_NODE ? inNode : DOM_Node()) {}

DOMString DOM_Element::getTagName() const { return getNodeName(); }

DOMString DOM_Element::getAttribute(const DOMString& inName) const {
  static const DOMString* const empty = new DOMString("");
  if (isNull()) return *empty;
  const DOM_Tree::Attribute attribute = tree_->FindAttribute(node_, DOM_HandleAccess::View(inName));
  if (attribute == 0) return *empty;
  return DOM_HandleAccess::String(tree_, tree_->Text(tree_->AttributeAt(attribute).value));
}

void DOM_Element::setAttribute(const DOMString& inName, const DOMString& inValue) {
  DOM_Tree& tree = TreeToChange(*this);
  const std::u16string_view name = DOM_HandleAccess::Units(inName);
  RequireXMLName(name);
  tree.SetAttribute(node_, name, DOM_HandleAccess::TextFor(tree, inValue));
}

void DOM_Element::removeAttribute(const DOMString& inName) {
  TreeToChange(*this).RemoveAttribute(node_, DOM_HandleAccess::View(inName));
}
