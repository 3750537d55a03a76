#include "platform/xml/DOM_Element.h"

#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/XMLNames.h"
#include "platform/xml/DOM_DOMException.h"

namespace {
DOM_Tree& TreeToChange(const DOM_Element& inElement) {
  if (inElement.isNull())
    throw DOM_DOMException(DOM_DOMException::NULL_HANDLE_ERR, "a change through a null handle");
  return *DOM_HandleAccess::TreeOf(inElement);
}
}  // namespace

DOM_Element::DOM_Element() = default;

DOM_Element::DOM_Element(const DOM_Node& inNode)
    : DOM_Node(inNode.getNodeType() == ELEMENT_NODE ? inNode : DOM_Node()) {}

DOMString DOM_Element::getTagName() const { return getNodeName(); }

DOMString DOM_Element::getAttribute(const DOMString& inName) const {
  static const DOMString* const empty = new DOMString("");
  if (isNull()) return *empty;
  const DOM_Tree::Attribute attribute = tree_->FindAttribute(node_, DOM_HandleAccess::View(inName));
  if (attribute == 0) return *empty;
  return DOM_HandleAccess::String(tree_, tree_->AttributeAt(attribute).value);
}

void DOM_Element::setAttribute(const DOMString& inName, const DOMString& inValue) {
  DOM_Tree& tree = TreeToChange(*this);
  const std::u16string_view name = DOM_HandleAccess::View(inName);
  RequireXMLName(name);
  tree.SetAttribute(node_, name, DOM_HandleAccess::TextFor(tree, inValue));
}

void DOM_Element::removeAttribute(const DOMString& inName) {
  TreeToChange(*this).RemoveAttribute(node_, DOM_HandleAccess::View(inName));
}
