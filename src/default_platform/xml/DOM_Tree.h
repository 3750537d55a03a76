// The nodes of one document.
#ifndef ZOR_DEFAULT_PLATFORM_XML_DOM_TREE_H
#define ZOR_DEFAULT_PLATFORM_XML_DOM_TREE_H

#include <cstdint>
#include <limits>
#include <memory>
#include <stdexcept>
#include <vector>

#include "default_platform/xml/DetachedNodes.h"
#include "default_platform/xml/PositionIndexes.h"
#include "default_platform/xml/TextStore.h"
#include "platform/xml/DOM_Node.h"

/// A growing array of records addressed by 32-bit numbers from 1. References stay valid while it
/// grows, and growing copies nothing.
template <typename Record>
class ChunkedRecords {
 public:
  static constexpr std::uint32_t kChunkBits = 12;
  static constexpr std::uint32_t kChunkSize = 1u << kChunkBits;

  Record& operator[](std::uint32_t inNumber) {
    return chunks_[inNumber >> kChunkBits][inNumber & (kChunkSize - 1)];
  }
  const Record& operator[](std::uint32_t inNumber) const {
    return chunks_[inNumber >> kChunkBits][inNumber & (kChunkSize - 1)];
  }
  /// The number of a new record, one more than that of the last; its content is undefined.
  std::uint32_t Add() {
    if ((end_ >> kChunkBits) >= chunks_.size()) {
      if (end_ > std::numeric_limits<std::uint32_t>::max() - kChunkSize)
        throw std::length_error("a document has more than 4,294,000,000 nodes or attributes");
      chunks_.emplace_back(new Record[kChunkSize]);
    }
    return end_++;
  }
  std::uint32_t End() const { return end_; }

 private:
  std::vector<std::unique_ptr<Record[]>> chunks_;
  std::uint32_t end_ = 1;  // 0 means none
};

/// What a document type declaration says; 0 for what it lacks.
struct DocumentType {
  TextRef publicId = 0;
  TextRef systemId = 0;
  TextRef internalSubset = 0;
};

/// All nodes, attributes and texts of a document, in a few large blocks, addressed by number. The
/// handles are the only ones who count: the tree ends with its last handle or string. Counts are
/// plain numbers, since a document is used by one thread at a time.
///
/// A node is attached when it is, or once was, part of the document's tree; such nodes live as long
/// as the document. A node that was only made is detached: it goes with the last handle on the
/// nodes that can be reached from it (see DetachedNodes).
///
/// Operations trust their arguments; the handles check them. Nothing here recurses.
class DOM_Tree {
 public:
  using Node = std::uint32_t;
  using Attribute = std::uint32_t;
  using Name = std::uint32_t;

  static constexpr Node kDocument = 1;

  enum Flag : std::uint8_t {
    kDetached = 1,    // see above
    kListedRoot = 2,  // among the roots of its group
    kFree = 4,        // not a node now
    kIndexed = 8      // indexes_ may hold its children
  };

  struct NodeRecord {
    std::uint32_t kind : 4;  // a DOM_Node::NodeType
    std::uint32_t flags : 4;
    Name name : 24;  // of elements, processing instructions and document types
    Node parent;
    Node previous;  // of a first child: the last child
    Node next;
    Attribute firstAttribute;
    union {
      Node firstChild;  // of the kinds that may have children
      TextRef text;     // of the kinds that have a text
    };
  };
  static_assert(sizeof(NodeRecord) == 24);

  struct AttributeRecord {
    TextRef value;
    Name name;
    Attribute next;
  };
  static_assert(sizeof(AttributeRecord) == 12);

  /// A tree with the document node alone and no handle; the first handle that goes ends it.
  static DOM_Tree* Create() { return new DOM_Tree; }
  DOM_Tree(const DOM_Tree&) = delete;
  DOM_Tree& operator=(const DOM_Tree&) = delete;

  // Handles
  void Hold() { ++handles_; }
  void Release() {
    if (--handles_ == 0) delete this;
  }
  void HoldNode(Node inNode) {
    ++handles_;
    if (nodes_[inNode].flags & kDetached) detached_.Hold(inNode);
  }
  void ReleaseNode(Node inNode) {
    if ((nodes_[inNode].flags & kDetached) && detached_.Release(inNode))
      Reclaim(detached_.GroupOf(inNode));
    Release();
  }

  // Asking
  const NodeRecord& At(Node inNode) const { return nodes_[inNode]; }
  const AttributeRecord& AttributeAt(Attribute inAttribute) const {
    return attributes_[inAttribute];
  }
  static bool HasText(int inKind);  ///< whether nodes of a kind carry a text of their own
  static bool MayHaveChildren(int inKind);
  Node FirstChild(Node inNode) const {
    return MayHaveChildren(At(inNode).kind) ? At(inNode).firstChild : 0;
  }
  Node LastChild(Node inNode) const {
    const Node first = FirstChild(inNode);
    return first == 0 ? 0 : At(first).previous;
  }
  Node PreviousSibling(Node inNode) const {
    const Node previous = At(inNode).previous;
    return previous != 0 && At(previous).next != 0 ? previous : 0;
  }
  /// The node after inNode in document order within inRoot and all below it; 0 at the end.
  Node NextWithin(Node inNode, Node inRoot) const;
  std::uint32_t ChildCount(Node inParent) { return CountOf(inParent); }
  Node ChildAt(Node inParent, std::uint32_t inPosition);
  std::uint32_t AttributeCount(Node inElement);
  Attribute AttributeAtPosition(Node inElement, std::uint32_t inPosition);
  Attribute FindAttribute(Node inElement, TextView inName) const;
  /// Finds nothing by a name that is not ASCII.
  /// @param inAscii zero-terminated.
  Attribute FindAttribute(Node inElement, const char* inAscii) const {
    Attribute attribute = At(inElement).firstAttribute;
    if (attribute == 0) return 0;
    const Name name = names_.FindAscii(inAscii);
    if (name == 0) return 0;
    while (attribute != 0 && attributes_[attribute].name != name)
      attribute = attributes_[attribute].next;
    return attribute;
  }
  /// A node itself or else the first element after it among its siblings; 0 when there is none.
  Node ElementFrom(Node inNode) const {
    while (inNode != 0 && At(inNode).kind != DOM_Node::ELEMENT_NODE) inNode = At(inNode).next;
    return inNode;
  }
  Node FirstChildOfKind(Node inParent, int inKind) const;
  const DOM_Text* NameText(Name inName) const { return names_.TextOf(inName); }
  std::u16string_view NameUnits(Name inName) const { return names_.UnitsOf(inName); }
  const DOM_Text* Text(TextRef inText) const { return inText == 0 ? nullptr : &texts_[inText]; }
  const char16_t* Widen(const DOM_Text& inText) { return texts_.Widen(inText); }
  Name NameEnd() const { return names_.End(); }  ///< one more than the largest
  Node NodeEnd() const { return nodes_.End(); }
  const DocumentType& Doctype() const { return doctype_; }
  std::uint64_t ChangeCount() const { return changes_; }

  // Making parts; a node made here has no parent
  Name InternName(std::u16string_view inName) { return names_.Intern(inName); }
  TextRef AddText(TextView inText) { return texts_.Add(inText); }
  TextRef AddText(std::string_view inLatin1, TextSeries& ioSeries) {
    return texts_.Add(inLatin1, ioSeries);
  }
  Node NewDetached(int inKind, Name inName, TextRef inText);
  /// A detached copy of a node of this or another tree.
  Node Copy(const DOM_Tree& inSource, Node inNode, bool inDeep);

  // Filling a new document in document order, without checks and without counting changes
  /// @param inLast the parent's last child so far, 0 for none.
  Node AppendNew(Node inParent, Node inLast, int inKind, Name inName, TextRef inText);
  /// Ends the children of a parent.
  void EndChildren(Node inParent, Node inLast) {
    if (inLast != 0) nodes_[nodes_[inParent].firstChild].previous = inLast;
  }
  /// @param inLast the element's last attribute so far, 0 for none.
  Attribute AppendNewAttribute(Node inElement, Attribute inLast, Name inName, TextRef inValue);
  /// The attributes of an element that has none yet; what they say of a next one does not count.
  void SetNewAttributes(Node inElement, const std::vector<AttributeRecord>& inAttributes);
  void SetDoctype(const DocumentType& inDoctype) { doctype_ = inDoctype; }

  // Changing
  /// Puts a node (or a fragment's children) before inBefore, or last when that is 0.
  void Insert(Node inParent, Node inChild, Node inBefore);
  /// Takes a node away from its parent.
  void Remove(Node inChild);
  void SetText(Node inNode, TextRef inText);
  void SetAttributeValue(Node inElement, Attribute inAttribute, TextRef inValue);
  void SetAttribute(Node inElement, std::u16string_view inName, TextRef inValue);
  void RemoveAttribute(Node inElement, TextView inName);

 private:
  DOM_Tree();
  ~DOM_Tree() = default;

  Node TakeNode();
  Attribute TakeAttribute();
  Node NewNode(int inKind, Name inName, TextRef inText);
  NodeRecord& CopyOne(const DOM_Tree& inSource, const NodeRecord& inFrom,
                      DetachedNodes::Group inGroup, Node& outCopy);
  void CopyAttributes(const NodeRecord& inFrom, NodeRecord& outTo);
  void ImportAttributes(const DOM_Tree& inSource, const NodeRecord& inFrom, NodeRecord& outTo);
  Name NameFrom(const DOM_Tree& inSource, Name inName);
  TextRef TextFrom(const DOM_Tree& inSource, TextRef inText);
  void ImportFrom(const DOM_Tree& inSource);

  void LinkLast(Node inParent, Node inChild);
  void LinkBefore(Node inParent, Node inChild, Node inBefore);
  void Unlink(Node inChild);
  void InsertOne(Node inParent, Node inChild, Node inBefore);
  void Join(Node inParent, Node inChild);
  void MergeGroups(Node inParent, Node inChild);
  void AttachSubtree(Node inRoot);
  void AttachGroup(DetachedNodes::Group inGroup);
  void EndGroupWhenUnused(DetachedNodes::Group inGroup);
  bool IsRootOf(Node inNode, DetachedNodes::Group inGroup) const;
  void ListRoot(Node inNode, DetachedNodes::Group inGroup);
  std::vector<Node> ParentlessRoots(DetachedNodes::Group inGroup) const;
  void Reclaim(DetachedNodes::Group inGroup) noexcept;
  void FreeSubtree(Node inRoot);
  void FreeOne(Node inNode);
  void NoteChange(Node inNode) {
    if (!(nodes_[inNode].flags & kDetached)) ++changes_;
  }

  std::uint32_t CountOf(Node inParent);
  const PositionIndexes::Children* IndexOf(Node inParent);

  /// The attribute last asked for by position, from where the next one is found.
  struct AttributeCursor {
    Node element = 0;
    std::uint32_t position = 0;
    Attribute attribute = 0;
    std::uint32_t count = 0;  // of the element's attributes; 0 when not counted
  };

  std::uint64_t handles_ = 0;
  std::uint64_t changes_ = 0;
  const std::uint64_t serial_;  // differs for all trees of the process
  TextStore texts_;
  NameTable names_;
  ChunkedRecords<NodeRecord> nodes_;
  ChunkedRecords<AttributeRecord> attributes_;
  Node freeNode_ = 0;            // chained by previous
  Attribute freeAttribute_ = 0;  // chained by next
  DocumentType doctype_;
  DetachedNodes detached_;
  PositionIndexes indexes_;
  AttributeCursor cursor_;
  // What the names of the tree last copied from are here, 0 for one not met yet, and what some of
  // its texts are: those it repeats are not looked for each time.
  std::uint64_t importSerial_ = 0;
  std::vector<Name> importedNames_;
  struct ImportedText {
    TextRef from = 0;
    TextRef here = 0;
  };
  std::vector<ImportedText> importedTexts_;  // by the last bits of their number there
};

inline DOM_Tree::Node DOM_Tree::NextWithin(Node inNode, Node inRoot) const {
  const Node child = FirstChild(inNode);
  if (child != 0) return child;
  while (inNode != inRoot && At(inNode).next == 0) inNode = At(inNode).parent;
  return inNode == inRoot ? 0 : At(inNode).next;
}

inline DOM_Tree::Node DOM_Tree::TakeNode() {
  if (freeNode_ == 0) return nodes_.Add();
  const Node node = freeNode_;
  freeNode_ = nodes_[node].previous;
  return node;
}

inline DOM_Tree::Node DOM_Tree::NewNode(int inKind, Name inName, TextRef inText) {
  const Node node = TakeNode();
  NodeRecord& record = nodes_[node];
  record = NodeRecord();
  record.kind = static_cast<std::uint32_t>(inKind) & 0xF;
  record.name = inName & (NameTable::kMaxNames - 1);
  if (HasText(inKind)) record.text = inText;
  return node;
}

inline DOM_Tree::Node DOM_Tree::AppendNew(Node inParent, Node inLast, int inKind, Name inName,
                                          TextRef inText) {
  const Node node = NewNode(inKind, inName, inText);
  NodeRecord& record = nodes_[node];
  record.parent = inParent;
  record.previous = inLast == 0 ? node : inLast;
  (inLast == 0 ? nodes_[inParent].firstChild : nodes_[inLast].next) = node;
  return node;
}

inline void DOM_Tree::SetNewAttributes(Node inElement,
                                       const std::vector<AttributeRecord>& inAttributes) {
  Attribute* link = &nodes_[inElement].firstAttribute;
  for (const AttributeRecord& attribute : inAttributes) {
    *link = attributes_.Add();
    AttributeRecord& record = attributes_[*link];
    record = {attribute.value, attribute.name, 0};
    link = &record.next;
  }
}

inline bool DOM_Tree::HasText(int inKind) {
  return inKind == DOM_Node::TEXT_NODE || inKind == DOM_Node::CDATA_SECTION_NODE ||
         inKind == DOM_Node::COMMENT_NODE || inKind == DOM_Node::PROCESSING_INSTRUCTION_NODE;
}

inline bool DOM_Tree::MayHaveChildren(int inKind) {
  return inKind == DOM_Node::ELEMENT_NODE || inKind == DOM_Node::DOCUMENT_NODE ||
         inKind == DOM_Node::DOCUMENT_FRAGMENT_NODE;
}

#endif
