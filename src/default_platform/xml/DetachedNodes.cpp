#include "default_platform/xml/DetachedNodes.h"

#include <utility>

#include "default_platform/xml/DOM_Tree.h"

// Room to free every group is made beforehand: the last handle goes in a destructor.
DetachedNodes::Group DetachedNodes::NewGroup() {
  if (freeGroups_.empty()) {
    if (freeGroups_.capacity() <= groups_.size()) freeGroups_.reserve(2 * groups_.size() + 16);
    groups_.emplace_back();
    return static_cast<Group>(groups_.size() - 1);
  }
  const Group group = freeGroups_.back();
  freeGroups_.pop_back();
  return group;
}

void DetachedNodes::FreeGroup(Group inGroup) noexcept {
  GroupRecord& group = groups_[inGroup];
  group.handles = 0;
  group.nodes = 0;
  group.roots.clear();
  freeGroups_.push_back(inGroup);
}

void DetachedNodes::MoveNode(Node inNode, Group inGroup) {
  Entry& entry = EntryOf(inNode);
  groups_[entry.group].handles -= entry.handles;
  --groups_[entry.group].nodes;
  entry.group = inGroup;
  groups_[inGroup].handles += entry.handles;
  ++groups_[inGroup].nodes;
}

DetachedNodes::Chunk& DetachedNodes::NewChunk(std::uint32_t inNumber) {
  if (inNumber >= chunks_.size()) chunks_.resize(inNumber + 1);
  chunks_[inNumber] = spare_ ? std::move(spare_) : std::make_unique<Chunk>();
  return *chunks_[inNumber];
}

// ---- what the tree does with them

void DOM_Tree::AttachSubtree(Node inRoot) {
  for (Node at = inRoot; at != 0; at = NextWithin(at, inRoot)) {
    if (!(nodes_[at].flags & kDetached)) continue;
    nodes_[at].flags &= kIndexed;
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

// What is freed is no root any more, so each is freed once.
void DOM_Tree::Reclaim(DetachedNodes::Group inGroup) noexcept {
  for (const Node root : detached_.RootsOf(inGroup))
    if (IsRootOf(root, inGroup) && At(root).parent == 0) FreeSubtree(root);
  detached_.FreeGroup(inGroup);
}

// A node that was freed keeps the links by which the next one is found.
void DOM_Tree::FreeSubtree(Node inRoot) {
  for (Node at = inRoot; at != 0; at = NextWithin(at, inRoot)) FreeOne(at);
}

inline void DOM_Tree::FreeOne(Node inNode) {
  NodeRecord& record = nodes_[inNode];
  if (Attribute last = record.firstAttribute; last != 0) {
    while (attributes_[last].next != 0) last = attributes_[last].next;
    attributes_[last].next = freeAttribute_;
    freeAttribute_ = record.firstAttribute;
  }
  if (cursor_.element == inNode) cursor_ = AttributeCursor();
  if (record.flags & kIndexed) indexes_.Drop(inNode);
  detached_.RemoveNode(inNode);
  record.flags = kFree;
  record.previous = freeNode_;
  freeNode_ = inNode;
}
