#include "platform/xml/DOM_NamedNodeMap.h"

#include "default_platform/system/Utf8.h"
#include "default_platform/xml/DOM_HandleAccess.h"

DOM_NamedNodeMap::DOM_NamedNodeMap() = default;

DOM_NamedNodeMap::DOM_NamedNodeMap(const DOM_Node& inElement) : element_(inElement) {}

bool DOM_NamedNodeMap::isNull() const { return element_.isNull(); }

unsigned int DOM_NamedNodeMap::getLength() const {
  if (isNull()) return 0;
  return DOM_HandleAccess::TreeOf(element_)->AttributeCount(DOM_HandleAccess::NodeOf(element_));
}

DOM_Node DOM_NamedNodeMap::item(unsigned int inPosition) const {
  if (isNull()) return DOM_Node();
  DOM_Tree* const tree = DOM_HandleAccess::TreeOf(element_);
  const DOM_Tree::Node element = DOM_HandleAccess::NodeOf(element_);
  return DOM_HandleAccess::Handle(tree, element, tree->AttributeAtPosition(element, inPosition));
}

DOM_Node DOM_NamedNodeMap::getNamedItem(const DOMString& inName) const {
  if (isNull()) return DOM_Node();
  DOM_Tree* const tree = DOM_HandleAccess::TreeOf(element_);
  const DOM_Tree::Node element = DOM_HandleAccess::NodeOf(element_);
  return DOM_HandleAccess::Handle(tree, element,
                                  tree->FindAttribute(element, DOM_HandleAccess::View(inName)));
}

DOM_Node DOM_NamedNodeMap::getNamedItem(const char* inName) const {
  const std::string_view name = inName == nullptr ? std::string_view() : inName;
  if (!ZORDefault::IsAscii(name)) return getNamedItem(DOMString(inName));
  if (isNull()) return DOM_Node();
  DOM_Tree* const tree = DOM_HandleAccess::TreeOf(element_);
  const DOM_Tree::Node element = DOM_HandleAccess::NodeOf(element_);
  return DOM_HandleAccess::Handle(tree, element, tree->FindAttribute(element, name));
}
