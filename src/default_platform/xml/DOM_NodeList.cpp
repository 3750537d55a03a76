#include "platform/xml/DOM_NodeList.h"

#include "default_platform/xml/DOM_HandleAccess.h"

DOM_NodeList::DOM_NodeList() = default;

DOM_NodeList::DOM_NodeList(const DOM_Node& inParent) : parent_(inParent) {}

bool DOM_NodeList::isNull() const { return parent_.isNull(); }

unsigned int DOM_NodeList::getLength() const {
  if (isNull()) return 0;
  return DOM_HandleAccess::TreeOf(parent_)->ChildCount(DOM_HandleAccess::NodeOf(parent_));
}

DOM_Node DOM_NodeList::item(unsigned int inPosition) const {
  if (isNull()) return DOM_Node();
  DOM_Tree* const tree = DOM_HandleAccess::TreeOf(parent_);
  return DOM_HandleAccess::Handle(tree,
                                  tree->ChildAt(DOM_HandleAccess::NodeOf(parent_), inPosition));
}
