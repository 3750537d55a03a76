// Changes of a tree: what they may do, and what becomes of the nodes concerned.
#include <utility>

#include "default_platform/xml/DOM_Tree.h"
#include "platform/xml/DOM_DOMException.h"

// ---- links

void DOM_Tree::LinkLast(Node inParent, Node inChild) {
  NodeRecord& parent = nodes_[inParent];
  NodeRecord& child = nodes_[inChild];
  child.parent = inParent;
  child.previous = parent.children.last;
  child.next = 0;
  (parent.children.last == 0 ? parent.children.first : nodes_[parent.children.last].next) = inChild;
  parent.children.last = inChild;
  indexes_.Append(inParent, inChild);
}

void DOM_Tree::LinkBefore(Node inParent, Node inChild, Node inBefore) {
  if (inBefore == 0) return LinkLast(inParent, inChild);
  NodeRecord& child = nodes_[inChild];
  NodeRecord& after = nodes_[inBefore];
  child.parent = inParent;
  child.previous = after.previous;
  child.next = inBefore;
  (after.previous == 0 ? nodes_[inParent].children.first : nodes_[after.previous].next) = inChild;
  after.previous = inChild;
  indexes_.Drop(inParent);
}

void DOM_Tree::Unlink(Node inChild) {
  NodeRecord& child = nodes_[inChild];
  NodeRecord& parent = nodes_[child.parent];
  (child.previous == 0 ? parent.children.first : nodes_[child.previous].next) = child.next;
  (child.next == 0 ? parent.children.last : nodes_[child.next].previous) = child.previous;
  indexes_.Drop(child.parent);
  child.parent = 0;
  child.previous = 0;
  child.next = 0;
}

// ---- checks

namespace {
[[noreturn]] void RefusePlace(const char* inReason) {
  throw DOM_DOMException(DOM_DOMException::HIERARCHY_REQUEST_ERR, inReason);
}
}  // namespace

bool DOM_Tree::IsWithin(Node inNode, Node inRoot) const {
  while (inNode != 0 && inNode != inRoot) inNode = At(inNode).parent;
  return inNode != 0;
}

void DOM_Tree::CheckKinds(Node inParent, Node inChild) const {
  const int child = At(inChild).kind;
  const bool inDocument = inParent == kDocument;
  switch (child) {
    case DOM_Node::ELEMENT_NODE:
    case DOM_Node::COMMENT_NODE:
    case DOM_Node::PROCESSING_INSTRUCTION_NODE:
      return;
    case DOM_Node::TEXT_NODE:
    case DOM_Node::CDATA_SECTION_NODE:
      if (inDocument) RefusePlace("a document takes no text");
      return;
    case DOM_Node::DOCUMENT_TYPE_NODE:
      if (!inDocument) RefusePlace("only a document takes a document type");
      return;
    default:
      RefusePlace("a node of this kind cannot be a child");
  }
}

void DOM_Tree::CheckDocumentChildren(Node inChild, Node inBefore, Node inReplaced) const {
  const int kind = At(inChild).kind;
  if (kind != DOM_Node::ELEMENT_NODE && kind != DOM_Node::DOCUMENT_TYPE_NODE) return;
  bool isBehind = false;  // whether the children met stand behind the place of the new one
  for (Node at = FirstChild(kDocument); at != 0; at = At(at).next) {
    isBehind = isBehind || at == inBefore;
    if (at == inChild || at == inReplaced) continue;
    if (At(at).kind == kind) RefusePlace("a document has only one of these");
    if (kind == DOM_Node::ELEMENT_NODE && At(at).kind == DOM_Node::DOCUMENT_TYPE_NODE && isBehind)
      RefusePlace("the root cannot stand before the document type");
    if (kind == DOM_Node::DOCUMENT_TYPE_NODE && At(at).kind == DOM_Node::ELEMENT_NODE && !isBehind)
      RefusePlace("the document type cannot stand behind the root");
  }
}

void DOM_Tree::CheckInsertion(Node inParent, Node inChild, Node inBefore, Node inReplaced) const {
  if (!MayHaveChildren(At(inParent).kind)) RefusePlace("this node takes no children");
  if (At(inChild).kind != DOM_Node::DOCUMENT_FRAGMENT_NODE) {
    CheckKinds(inParent, inChild);
    if (inParent == kDocument) CheckDocumentChildren(inChild, inBefore, inReplaced);
  } else {
    unsigned int elements = 0;
    for (Node at = FirstChild(inChild); at != 0; at = At(at).next) {
      CheckKinds(inParent, at);
      if (inParent == kDocument) CheckDocumentChildren(at, inBefore, inReplaced);
      if (At(at).kind == DOM_Node::ELEMENT_NODE) ++elements;
    }
    if (inParent == kDocument && elements > 1) RefusePlace("a document has only one root");
  }
  // A node without children can only be its own ancestor by being the parent itself.
  if (inChild == inParent || (FirstChild(inChild) != 0 && IsWithin(inParent, inChild)))
    RefusePlace("a node cannot be put into itself");
  if (inBefore != 0 && At(inBefore).parent != inParent)
    throw DOM_DOMException(DOM_DOMException::NOT_FOUND_ERR, "not a child of this node");
}

// ---- attached and detached nodes

void DOM_Tree::AttachSubtree(Node inRoot) {
  for (Node at = inRoot; at != 0; at = NextWithin(at, inRoot)) {
    if (!(nodes_[at].flags & kDetached)) continue;
    nodes_[at].flags = 0;
    detached_.RemoveNode(at);
  }
}

// A root of a group may since have been put into another tree of the group, or have been attached.
bool DOM_Tree::IsRootOf(Node inNode, DetachedNodes::Group inGroup) const {
  return (At(inNode).flags & kListedRoot) && detached_.GroupOf(inNode) == inGroup;
}

void DOM_Tree::ListRoot(Node inNode, DetachedNodes::Group inGroup) {
  std::vector<Node>& roots = detached_.RootsOf(inGroup);
  if (roots.size() > 2 * std::size_t{detached_.SizeOf(inGroup)} + 16)
    std::erase_if(roots, [&](Node inRoot) { return !IsRootOf(inRoot, inGroup); });
  roots.push_back(inNode);
  nodes_[inNode].flags |= kListedRoot;
}

std::vector<DOM_Tree::Node> DOM_Tree::ParentlessRoots(DetachedNodes::Group inGroup) const {
  std::vector<Node> roots;
  for (const Node root : detached_.RootsOf(inGroup))
    if (IsRootOf(root, inGroup) && At(root).parent == 0) roots.push_back(root);
  return roots;
}

void DOM_Tree::AttachGroup(DetachedNodes::Group inGroup) {
  for (const Node root : ParentlessRoots(inGroup)) AttachSubtree(root);
}

void DOM_Tree::EndGroupWhenUnused(DetachedNodes::Group inGroup) {
  if (detached_.SizeOf(inGroup) == 0)
    detached_.FreeGroup(inGroup);
  else if (detached_.HandlesOf(inGroup) == 0)
    Reclaim(inGroup);
}

void DOM_Tree::MergeGroups(Node inParent, Node inChild) {
  DetachedNodes::Group stays = detached_.GroupOf(inParent);
  DetachedNodes::Group goes = detached_.GroupOf(inChild);
  if (stays == goes) return;
  // Moving the smaller one keeps the sum of all moves at n log n.
  if (detached_.SizeOf(stays) < detached_.SizeOf(goes)) std::swap(stays, goes);
  for (const Node root : detached_.RootsOf(goes))
    if (IsRootOf(root, goes)) ListRoot(root, stays);
  for (const Node root : ParentlessRoots(goes))
    for (Node at = root; at != 0; at = NextWithin(at, root)) detached_.MoveNode(at, stays);
  detached_.FreeGroup(goes);
}

void DOM_Tree::Join(Node inParent, Node inChild) {
  const bool isParentDetached = nodes_[inParent].flags & kDetached;
  const bool isChildDetached = nodes_[inChild].flags & kDetached;
  if (isParentDetached && isChildDetached) return MergeGroups(inParent, inChild);
  if (!isParentDetached && !isChildDetached) return;
  // Handles on attached nodes are not counted one by one, so where both meet all become attached.
  const DetachedNodes::Group group = detached_.GroupOf(isChildDetached ? inChild : inParent);
  if (isChildDetached)
    AttachSubtree(inChild);
  else
    AttachGroup(group);
  EndGroupWhenUnused(group);
}

void DOM_Tree::Reclaim(DetachedNodes::Group inGroup) {
  for (const Node root : ParentlessRoots(inGroup)) FreeSubtree(root);
  detached_.FreeGroup(inGroup);
}

void DOM_Tree::FreeSubtree(Node inRoot) {
  Node at = inRoot;
  while (at != 0) {
    // Children first: a node goes when it has none left.
    const Node child = FirstChild(at);
    if (child != 0) {
      nodes_[at].children.first = nodes_[child].next;
      at = child;
      continue;
    }
    const Node parent = at == inRoot ? 0 : nodes_[at].parent;
    FreeOne(at);
    at = parent;
  }
}

void DOM_Tree::FreeOne(Node inNode) {
  NodeRecord& record = nodes_[inNode];
  Attribute attribute = record.firstAttribute;
  while (attribute != 0) {
    const Attribute next = attributes_[attribute].next;
    attributes_[attribute].next = freeAttribute_;
    freeAttribute_ = attribute;
    attribute = next;
  }
  if (cursor_.element == inNode) cursor_ = AttributeCursor();
  indexes_.Drop(inNode);
  detached_.RemoveNode(inNode);
  record = NodeRecord();
  record.flags = kFree;
  record.next = freeNode_;
  freeNode_ = inNode;
  ++freeNodeCount_;
}

// ---- changes

void DOM_Tree::InsertOne(Node inParent, Node inChild, Node inBefore) {
  if (inBefore == inChild) inBefore = At(inChild).next;
  if (At(inChild).parent != 0) Remove(inChild);
  Join(inParent, inChild);
  LinkBefore(inParent, inChild, inBefore);
  NoteChange(inParent);
}

void DOM_Tree::Insert(Node inParent, Node inChild, Node inBefore, Node inReplaced) {
  CheckInsertion(inParent, inChild, inBefore, inReplaced);
  if (At(inChild).kind != DOM_Node::DOCUMENT_FRAGMENT_NODE)
    return InsertOne(inParent, inChild, inBefore);
  for (Node at = FirstChild(inChild); at != 0; at = FirstChild(inChild))
    InsertOne(inParent, at, inBefore);
}

void DOM_Tree::Remove(Node inChild) {
  NodeRecord& child = nodes_[inChild];
  NoteChange(child.parent);
  // What leaves a detached tree stays in its group, from which it can no longer be reached.
  if ((child.flags & kDetached) && !(child.flags & kListedRoot))
    ListRoot(inChild, detached_.GroupOf(inChild));
  Unlink(inChild);
}

void DOM_Tree::SetText(Node inNode, const DOM_Text* inText) {
  nodes_[inNode].text = inText;
  NoteChange(inNode);
}

void DOM_Tree::SetAttributeValue(Node inElement, Attribute inAttribute, const DOM_Text* inValue) {
  attributes_[inAttribute].value = inValue;
  NoteChange(inElement);
}

void DOM_Tree::SetAttribute(Node inElement, std::u16string_view inName, const DOM_Text* inValue) {
  const Attribute known = FindAttribute(inElement, inName);
  if (known != 0) return SetAttributeValue(inElement, known, inValue);
  Attribute last = At(inElement).firstAttribute;
  while (last != 0 && attributes_[last].next != 0) last = attributes_[last].next;
  AppendNewAttribute(inElement, last, InternName(inName), inValue);
  if (cursor_.element == inElement) cursor_ = AttributeCursor();
  NoteChange(inElement);
}

void DOM_Tree::RemoveAttribute(Node inElement, std::u16string_view inName) {
  const Attribute attribute = FindAttribute(inElement, inName);
  if (attribute == 0) return;
  Attribute* link = &nodes_[inElement].firstAttribute;
  while (*link != attribute) link = &attributes_[*link].next;
  *link = attributes_[attribute].next;
  attributes_[attribute].next = 0;  // kept for the handles on it, until the document ends
  if (cursor_.element == inElement) cursor_ = AttributeCursor();
  NoteChange(inElement);
}
