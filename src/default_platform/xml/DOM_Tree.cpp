#include "default_platform/xml/DOM_Tree.h"

#include <atomic>
#include <utility>

namespace {
std::uint64_t NextSerial() {
  static std::atomic<std::uint64_t> last{0};
  return ++last;
}

// Shorter lists are walked each time, which costs less than an index of them.
constexpr std::uint32_t kMaxWalk = 24;

constexpr std::size_t kImportedTexts = 1024;
}  // namespace

DOM_Tree::DOM_Tree() : serial_(NextSerial()), names_(texts_) {
  NewNode(DOM_Node::DOCUMENT_NODE, 0, 0);
}

DOM_Tree::Node DOM_Tree::FirstChildOfKind(Node inParent, int inKind) const {
  Node child = FirstChild(inParent);
  while (child != 0 && At(child).kind != inKind) child = At(child).next;
  return child;
}

// ---- positions

const PositionIndexes::Children* DOM_Tree::IndexOf(Node inParent) {
  const bool isIndexed = At(inParent).flags & kIndexed;
  const PositionIndexes::Children* const known = isIndexed ? indexes_.Find(inParent) : nullptr;
  if (known != nullptr) return known;
  Node child = FirstChild(inParent);
  for (std::uint32_t steps = 0; child != 0 && steps < kMaxWalk; ++steps) child = At(child).next;
  if (child == 0) return nullptr;
  PositionIndexes::Children children;
  for (child = FirstChild(inParent); child != 0; child = At(child).next) children.push_back(child);
  nodes_[inParent].flags |= kIndexed;
  return &indexes_.Keep(inParent, std::move(children));
}

std::uint32_t DOM_Tree::CountOf(Node inParent) {
  const PositionIndexes::Children* const index = IndexOf(inParent);
  if (index != nullptr) return static_cast<std::uint32_t>(index->size());
  std::uint32_t count = 0;
  for (Node child = FirstChild(inParent); child != 0; child = At(child).next) ++count;
  return count;
}

DOM_Tree::Node DOM_Tree::ChildAt(Node inParent, std::uint32_t inPosition) {
  const PositionIndexes::Children* const index = IndexOf(inParent);
  if (index != nullptr) return inPosition < index->size() ? (*index)[inPosition] : 0;
  Node child = FirstChild(inParent);
  while (child != 0 && inPosition-- > 0) child = At(child).next;
  return child;
}

std::uint32_t DOM_Tree::AttributeCount(Node inElement) {
  if (cursor_.element == inElement && cursor_.count != 0) return cursor_.count;
  std::uint32_t count = 0;
  for (Attribute at = At(inElement).firstAttribute; at != 0; at = attributes_[at].next) ++count;
  if (cursor_.element != inElement) cursor_ = {inElement, 0, At(inElement).firstAttribute, 0};
  cursor_.count = count;
  return count;
}

DOM_Tree::Attribute DOM_Tree::AttributeAtPosition(Node inElement, std::uint32_t inPosition) {
  if (cursor_.element != inElement || inPosition < cursor_.position)
    cursor_ = {inElement, 0, At(inElement).firstAttribute,
               cursor_.element == inElement ? cursor_.count : 0};
  std::uint32_t position = cursor_.position;
  Attribute attribute = cursor_.attribute;
  while (attribute != 0 && position < inPosition) {
    attribute = attributes_[attribute].next;
    ++position;
  }
  if (attribute == 0) return 0;  // the cursor stays where it is of use
  cursor_.position = position;
  cursor_.attribute = attribute;
  return attribute;
}

// Elements have few attributes, whose names are compared faster than one is looked up.
DOM_Tree::Attribute DOM_Tree::FindAttribute(Node inElement, TextView inName) const {
  Attribute attribute = At(inElement).firstAttribute;
  while (attribute != 0 && !IsSameText(TextView(NameUnits(attributes_[attribute].name)), inName))
    attribute = attributes_[attribute].next;
  return attribute;
}

// ---- making

inline DOM_Tree::Attribute DOM_Tree::TakeAttribute() {
  if (freeAttribute_ == 0) return attributes_.Add();
  const Attribute attribute = freeAttribute_;
  freeAttribute_ = attributes_[attribute].next;
  return attribute;
}

DOM_Tree::Node DOM_Tree::NewDetached(int inKind, Name inName, TextRef inText) {
  const Node node = NewNode(inKind, inName, inText);
  const DetachedNodes::Group group = detached_.NewGroup();
  nodes_[node].flags = kDetached;
  detached_.AddNode(node, group);
  ListRoot(node, group);
  return node;
}

DOM_Tree::Attribute DOM_Tree::AppendNewAttribute(Node inElement, Attribute inLast, Name inName,
                                                 TextRef inValue) {
  const Attribute attribute = TakeAttribute();
  attributes_[attribute] = {inValue, inName, 0};
  (inLast == 0 ? nodes_[inElement].firstAttribute : attributes_[inLast].next) = attribute;
  return attribute;
}

// ---- copying

void DOM_Tree::ImportFrom(const DOM_Tree& inSource) {
  if (&inSource == this || importSerial_ == inSource.serial_) return;
  importSerial_ = inSource.serial_;
  importedNames_.clear();
  importedTexts_.assign(kImportedTexts, {});
}

inline DOM_Tree::Name DOM_Tree::NameFrom(const DOM_Tree& inSource, Name inName) {
  if (&inSource == this || inName == 0) return inName;
  if (inName >= importedNames_.size()) importedNames_.resize(inSource.NameEnd());
  Name& name = importedNames_[inName];
  if (name == 0) name = names_.Intern(inSource.NameUnits(inName));
  return name;
}

inline TextRef DOM_Tree::TextFrom(const DOM_Tree& inSource, TextRef inText) {
  if (&inSource == this) return inText;
  ImportedText& known = importedTexts_[inText % kImportedTexts];
  if (known.from != inText) known = {inText, texts_.AddStored(inSource.texts_[inText].View())};
  return known.here;
}

void DOM_Tree::ImportAttributes(const DOM_Tree& inSource, const NodeRecord& inFrom,
                                NodeRecord& outTo) {
  Attribute* link = &outTo.firstAttribute;
  for (Attribute at = inFrom.firstAttribute; at != 0;) {
    const AttributeRecord attribute = inSource.attributes_[at];
    const TextRef value = TextFrom(inSource, attribute.value);
    const Name name = NameFrom(inSource, attribute.name);
    *link = TakeAttribute();
    AttributeRecord& record = attributes_[*link];
    record = {value, name, 0};
    link = &record.next;
    at = attribute.next;
  }
}

inline void DOM_Tree::CopyAttributes(const NodeRecord& inFrom, NodeRecord& outTo) {
  Attribute* link = &outTo.firstAttribute;
  const auto append = [&](Attribute inNew, const AttributeRecord& inAttribute) {
    AttributeRecord& record = attributes_[inNew];
    record = {inAttribute.value, inAttribute.name, 0};
    *link = inNew;
    link = &record.next;
  };
  // Those of the last copy that was freed, mostly.
  Attribute at = inFrom.firstAttribute;
  Attribute free = freeAttribute_;
  while (at != 0 && free != 0) {
    const AttributeRecord& attribute = attributes_[at];
    append(std::exchange(free, attributes_[free].next), attribute);
    at = attribute.next;
  }
  freeAttribute_ = free;
  for (; at != 0; at = attributes_[at].next) append(attributes_.Add(), attributes_[at]);
}

inline DOM_Tree::NodeRecord& DOM_Tree::CopyOne(const DOM_Tree& inSource, const NodeRecord& inFrom,
                                               DetachedNodes::Group inGroup, Node& outCopy) {
  const TextRef text = HasText(inFrom.kind) ? TextFrom(inSource, inFrom.text) : 0;
  outCopy = NewNode(inFrom.kind, NameFrom(inSource, inFrom.name), text);
  NodeRecord& copy = nodes_[outCopy];
  copy.flags = kDetached;
  detached_.AddNode(outCopy, inGroup);
  if (&inSource == this)
    CopyAttributes(inFrom, copy);
  else
    ImportAttributes(inSource, inFrom, copy);
  return copy;
}

DOM_Tree::Node DOM_Tree::Copy(const DOM_Tree& inSource, Node inNode, bool inDeep) {
  ImportFrom(inSource);
  const DetachedNodes::Group group = detached_.NewGroup();
  Node root = 0;
  NodeRecord& rootRecord = CopyOne(inSource, inSource.At(inNode), group, root);
  ListRoot(root, group);
  Node parent = root;                   // the copy of the parent of what is copied next
  Node last = 0;                        // the last child of that copy so far
  Node* link = &rootRecord.firstChild;  // where the next copy is put
  Node from = inDeep ? inSource.FirstChild(inNode) : 0;
  while (from != 0) {
    const NodeRecord& source = inSource.At(from);
    NodeRecord& record = CopyOne(inSource, source, group, *link);
    const Node copy = *link;
    record.parent = parent;
    record.previous = last == 0 ? copy : last;
    if (MayHaveChildren(source.kind) && source.firstChild != 0) {
      parent = copy;
      last = 0;
      link = &record.firstChild;
      from = source.firstChild;
      continue;
    }
    last = copy;
    link = &record.next;
    from = source.next;
    for (const NodeRecord* up = &source; from == 0;) {
      EndChildren(parent, last);
      if (up->parent == inNode) break;
      last = parent;
      NodeRecord& lastRecord = nodes_[last];
      parent = lastRecord.parent;
      link = &lastRecord.next;
      up = &inSource.At(up->parent);
      from = up->next;
    }
  }
  return root;
}

// ---- links

// As in pugixml, a first child's previous sibling is the last one, which saves a field.
void DOM_Tree::LinkLast(Node inParent, Node inChild) {
  NodeRecord& child = nodes_[inChild];
  child.parent = inParent;
  child.next = 0;
  const Node first = nodes_[inParent].firstChild;
  if (first == 0) {
    child.previous = inChild;
    nodes_[inParent].firstChild = inChild;
  } else {
    child.previous = nodes_[first].previous;
    nodes_[child.previous].next = inChild;
    nodes_[first].previous = inChild;
  }
  if (nodes_[inParent].flags & kIndexed) indexes_.Append(inParent, inChild);
}

void DOM_Tree::LinkBefore(Node inParent, Node inChild, Node inBefore) {
  if (inBefore == 0) return LinkLast(inParent, inChild);
  NodeRecord& child = nodes_[inChild];
  NodeRecord& after = nodes_[inBefore];
  child.parent = inParent;
  child.previous = after.previous;
  child.next = inBefore;
  Node& link = nodes_[inParent].firstChild == inBefore ? nodes_[inParent].firstChild
                                                       : nodes_[after.previous].next;
  link = inChild;
  after.previous = inChild;
  if (nodes_[inParent].flags & kIndexed) indexes_.Drop(inParent);
}

void DOM_Tree::Unlink(Node inChild) {
  NodeRecord& child = nodes_[inChild];
  NodeRecord& parent = nodes_[child.parent];
  const bool isFirst = parent.firstChild == inChild;
  (isFirst ? parent.firstChild : nodes_[child.previous].next) = child.next;
  if (parent.firstChild != 0)
    nodes_[child.next == 0 ? parent.firstChild : child.next].previous = child.previous;
  if (parent.flags & kIndexed) indexes_.Drop(child.parent);
  child.parent = 0;
  child.previous = 0;
  child.next = 0;
}

// ---- changes

void DOM_Tree::InsertOne(Node inParent, Node inChild, Node inBefore) {
  if (inBefore == inChild) inBefore = At(inChild).next;
  if (At(inChild).parent != 0) Remove(inChild);
  Join(inParent, inChild);
  LinkBefore(inParent, inChild, inBefore);
  NoteChange(inParent);
}

void DOM_Tree::Insert(Node inParent, Node inChild, Node inBefore) {
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

void DOM_Tree::SetText(Node inNode, TextRef inText) {
  nodes_[inNode].text = inText;
  NoteChange(inNode);
}

void DOM_Tree::SetAttributeValue(Node inElement, Attribute inAttribute, TextRef inValue) {
  attributes_[inAttribute].value = inValue;
  NoteChange(inElement);
}

void DOM_Tree::SetAttribute(Node inElement, std::u16string_view inName, TextRef inValue) {
  const Attribute known = FindAttribute(inElement, inName);
  if (known != 0) return SetAttributeValue(inElement, known, inValue);
  Attribute last = At(inElement).firstAttribute;
  while (last != 0 && attributes_[last].next != 0) last = attributes_[last].next;
  AppendNewAttribute(inElement, last, InternName(inName), inValue);
  if (cursor_.element == inElement) cursor_ = AttributeCursor();
  NoteChange(inElement);
}

void DOM_Tree::RemoveAttribute(Node inElement, TextView inName) {
  const Attribute attribute = FindAttribute(inElement, inName);
  if (attribute == 0) return;
  Attribute* link = &nodes_[inElement].firstAttribute;
  while (*link != attribute) link = &attributes_[*link].next;
  *link = attributes_[attribute].next;
  attributes_[attribute].next = 0;  // kept for the handles on it, until the document ends
  if (cursor_.element == inElement) cursor_ = AttributeCursor();
  NoteChange(inElement);
}
