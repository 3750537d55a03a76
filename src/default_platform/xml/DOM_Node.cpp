#include "platform/xml/DOM_Node.h"

#include <utility>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "foundation/Utf8.h"
#include "platform/xml/DOM_DOMException.h"
#include "platform/xml/DOM_NamedNodeMap.h"
#include "platform/xml/DOM_NodeList.h"

namespace {

// Names of the kinds that have no name of their own. Never deleted: handles may be asked while the
// process ends.
const DOMString& KindName(int inKind) {
  static const DOMString* const text = new DOMString("#text");
  static const DOMString* const section = new DOMString("#cdata-section");
  static const DOMString* const comment = new DOMString("#comment");
  static const DOMString* const document = new DOMString("#document");
  static const DOMString* const fragment = new DOMString("#document-fragment");
  switch (inKind) {
    case DOM_Node::TEXT_NODE:
      return *text;
    case DOM_Node::CDATA_SECTION_NODE:
      return *section;
    case DOM_Node::COMMENT_NODE:
      return *comment;
    case DOM_Node::DOCUMENT_NODE:
      return *document;
    default:
      return *fragment;
  }
}

DOM_Tree::Attribute FindBeyondAscii(const DOM_Tree& inTree, DOM_Tree::Node inElement,
                                    const char* inName) {
  if (ZORFoundation::IsAscii(inName)) return 0;
  return inTree.FindAttribute(inElement, DOM_HandleAccess::View(DOMString(inName)));
}

inline DOM_Tree::Attribute FindNarrow(const DOM_Tree& inTree, DOM_Tree::Node inElement,
                                      const char* inName) {
  if (inName == nullptr) return 0;
  const DOM_Tree::Attribute attribute = inTree.FindAttribute(inElement, inName);
  return attribute != 0 ? attribute : FindBeyondAscii(inTree, inElement, inName);
}

// Most comparisons end at the first character, which no call is worth.
bool IsSameName(std::u16string_view inName, const char* inAscii) {
  for (const char16_t unit : inName)
    if (unit != static_cast<unsigned char>(*inAscii++)) return false;
  return *inAscii == '\0';
}

[[noreturn]] void RefuseNull() {
  throw DOM_DOMException(DOM_DOMException::NULL_HANDLE_ERR, "a change through a null handle");
}

// ---- where a node may go

[[noreturn]] void RefusePlace(const char* inReason) {
  throw DOM_DOMException(DOM_DOMException::HIERARCHY_REQUEST_ERR, inReason);
}

bool IsWithin(const DOM_Tree& inTree, DOM_Tree::Node inNode, DOM_Tree::Node inRoot) {
  while (inNode != 0 && inNode != inRoot) inNode = inTree.At(inNode).parent;
  return inNode != 0;
}

void CheckKinds(const DOM_Tree& inTree, DOM_Tree::Node inParent, DOM_Tree::Node inChild) {
  const auto child = inTree.At(inChild).kind;
  const bool inDocument = inParent == DOM_Tree::kDocument;
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

void CheckDocumentChildren(const DOM_Tree& inTree, DOM_Tree::Node inChild, DOM_Tree::Node inBefore,
                           DOM_Tree::Node inReplaced) {
  const auto kind = inTree.At(inChild).kind;
  if (kind != DOM_Node::ELEMENT_NODE && kind != DOM_Node::DOCUMENT_TYPE_NODE) return;
  bool isAfter = false;  // whether the children met come after the new one
  for (DOM_Tree::Node at = inTree.FirstChild(DOM_Tree::kDocument); at != 0;
       at = inTree.At(at).next) {
    isAfter = isAfter || at == inBefore;
    if (at == inChild || at == inReplaced) continue;
    if (inTree.At(at).kind == kind) RefusePlace("a document has only one of these");
    if (kind == DOM_Node::ELEMENT_NODE && inTree.At(at).kind == DOM_Node::DOCUMENT_TYPE_NODE &&
        isAfter)
      RefusePlace("the root cannot stand before the document type");
    if (kind == DOM_Node::DOCUMENT_TYPE_NODE && inTree.At(at).kind == DOM_Node::ELEMENT_NODE &&
        !isAfter)
      RefusePlace("the document type cannot come after the root");
  }
}

void CheckInsertion(const DOM_Tree& inTree, DOM_Tree::Node inParent, DOM_Tree::Node inChild,
                    DOM_Tree::Node inBefore, DOM_Tree::Node inReplaced) {
  if (!DOM_Tree::MayHaveChildren(inTree.At(inParent).kind))
    RefusePlace("this node takes no children");
  if (inTree.At(inChild).kind != DOM_Node::DOCUMENT_FRAGMENT_NODE) {
    CheckKinds(inTree, inParent, inChild);
    if (inParent == DOM_Tree::kDocument)
      CheckDocumentChildren(inTree, inChild, inBefore, inReplaced);
  } else {
    unsigned int elements = 0;
    for (DOM_Tree::Node at = inTree.FirstChild(inChild); at != 0; at = inTree.At(at).next) {
      CheckKinds(inTree, inParent, at);
      if (inParent == DOM_Tree::kDocument) CheckDocumentChildren(inTree, at, inBefore, inReplaced);
      if (inTree.At(at).kind == DOM_Node::ELEMENT_NODE) ++elements;
    }
    if (inParent == DOM_Tree::kDocument && elements > 1)
      RefusePlace("a document has only one root");
  }
  // A node without children can contain the parent only by being the parent.
  if (inChild == inParent ||
      (inTree.FirstChild(inChild) != 0 && IsWithin(inTree, inParent, inChild)))
    RefusePlace("a node cannot be put into itself");
  if (inBefore != 0 && inTree.At(inBefore).parent != inParent)
    throw DOM_DOMException(DOM_DOMException::NOT_FOUND_ERR, "not a child of this node");
}

}  // namespace

DOM_Node::DOM_Node() : tree_(nullptr), node_(0), attribute_(0) {}

DOM_Node::DOM_Node(DOM_Tree* inTree, std::uint32_t inNode, std::uint32_t inAttribute)
    : tree_(inTree), node_(inNode), attribute_(inAttribute) {
  if (tree_ != nullptr) tree_->HoldNode(node_);
}

DOM_Node::DOM_Node(const DOM_Node& inOther)
    : DOM_Node(inOther.tree_, inOther.node_, inOther.attribute_) {}

DOM_Node::DOM_Node(DOM_Node&& ioOther) noexcept
    : tree_(std::exchange(ioOther.tree_, nullptr)),
      node_(std::exchange(ioOther.node_, 0)),
      attribute_(std::exchange(ioOther.attribute_, 0)) {}

DOM_Node& DOM_Node::operator=(const DOM_Node& inOther) { return *this = DOM_Node(inOther); }

DOM_Node& DOM_Node::operator=(DOM_Node&& ioOther) noexcept {
  if (this == &ioOther) return *this;
  DOM_Tree* const tree = tree_;
  const std::uint32_t node = node_;
  tree_ = std::exchange(ioOther.tree_, nullptr);
  node_ = std::exchange(ioOther.node_, 0);
  attribute_ = std::exchange(ioOther.attribute_, 0);
  if (tree != nullptr) tree->ReleaseNode(node);
  return *this;
}

DOM_Node::~DOM_Node() {
  if (tree_ != nullptr) tree_->ReleaseNode(node_);
}

bool DOM_Node::isNull() const { return tree_ == nullptr; }

bool DOM_Node::operator==(const DOM_Node& inOther) const {
  return tree_ == inOther.tree_ && node_ == inOther.node_ && attribute_ == inOther.attribute_;
}

bool DOM_Node::operator!=(const DOM_Node& inOther) const { return !(*this == inOther); }

// ---- asking

short DOM_Node::getNodeType() const {
  if (tree_ == nullptr) return NULL_NODE;
  return attribute_ != 0 ? static_cast<short>(ATTRIBUTE_NODE)
                         : static_cast<short>(tree_->At(node_).kind);
}

DOMString DOM_Node::getNodeName() const {
  if (tree_ == nullptr) return DOMString();
  const std::uint32_t name =
      attribute_ != 0 ? tree_->AttributeAt(attribute_).name : tree_->At(node_).name;
  if (name == 0) return KindName(static_cast<int>(tree_->At(node_).kind));
  return DOM_HandleAccess::String(tree_, tree_->NameText(name));
}

DOMString DOM_Node::getNodeValue() const {
  if (tree_ == nullptr) return DOMString();
  if (attribute_ != 0)
    return DOM_HandleAccess::String(tree_, tree_->Text(tree_->AttributeAt(attribute_).value));
  const DOM_Tree::NodeRecord& record = tree_->At(node_);
  return DOM_HandleAccess::String(
      tree_, DOM_Tree::HasText(record.kind) ? tree_->Text(record.text) : nullptr);
}

DOM_Node DOM_Node::getParentNode() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->At(node_).parent);
}

DOM_Node DOM_Node::getFirstChild() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->FirstChild(node_));
}

DOM_Node DOM_Node::getLastChild() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->LastChild(node_));
}

DOM_Node DOM_Node::getPreviousSibling() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->PreviousSibling(node_));
}

DOM_Node DOM_Node::getNextSibling() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->At(node_).next);
}

bool DOM_Node::hasChildNodes() const {
  return tree_ != nullptr && attribute_ == 0 && tree_->FirstChild(node_) != 0;
}

DOM_NodeList DOM_Node::getChildNodes() const {
  return attribute_ != 0 ? DOM_NodeList() : DOM_NodeList(*this);
}

DOM_NamedNodeMap DOM_Node::getAttributes() const {
  return getNodeType() == ELEMENT_NODE ? DOM_NamedNodeMap(*this) : DOM_NamedNodeMap();
}

DOM_Document DOM_Node::getOwnerDocument() const {
  if (tree_ == nullptr || node_ == DOM_Tree::kDocument) return DOM_Document();
  return DOM_HandleAccess::DocumentOf(tree_);
}

DOM_Node DOM_Node::getFirstElementChild() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->ElementFrom(tree_->FirstChild(node_)));
}

DOM_Node DOM_Node::getNextElementSibling() const {
  if (tree_ == nullptr || attribute_ != 0) return DOM_Node();
  return DOM_HandleAccess::Handle(tree_, tree_->ElementFrom(tree_->At(node_).next));
}

bool DOM_Node::hasName(const char* inAscii) const {
  if (inAscii == nullptr || !DOM_HandleAccess::IsElement(*this))
    return getNodeName().equals(inAscii);
  return IsSameName(tree_->NameUnits(tree_->At(node_).name), inAscii);
}

void DOM_Node::getAttributeText(const char* inName, ZORUnicodeString& outText) const {
  const DOM_Tree::Attribute attribute =
      DOM_HandleAccess::IsElement(*this) ? FindNarrow(*tree_, node_, inName) : 0;
  if (attribute == 0)
    outText.BuildFromUTF16(nullptr, 0);
  else
    DOM_HandleAccess::CopyTo(outText, tree_->Text(tree_->AttributeAt(attribute).value)->View());
}

std::uint64_t DOM_Node::getChangeCount() const {
  return tree_ == nullptr ? 0 : tree_->ChangeCount();
}

// ---- changing

void DOM_Node::setNodeValue(const DOMString& inValue) {
  if (tree_ == nullptr) RefuseNull();
  if (attribute_ != 0)
    tree_->SetAttributeValue(node_, attribute_, DOM_HandleAccess::TextFor(*tree_, inValue));
  else if (DOM_Tree::HasText(tree_->At(node_).kind))
    tree_->SetText(node_, DOM_HandleAccess::TextFor(*tree_, inValue));
}

DOM_Node DOM_Node::appendChild(const DOM_Node& inChild) {
  return insertBefore(inChild, DOM_Node());
}

DOM_Node DOM_Node::insertBefore(const DOM_Node& inChild, const DOM_Node& inBefore) {
  if (tree_ == nullptr || inChild.tree_ == nullptr) RefuseNull();
  if (tree_ != inChild.tree_)
    throw DOM_DOMException(DOM_DOMException::WRONG_DOCUMENT_ERR, "a node of another document");
  if (attribute_ != 0 || inChild.attribute_ != 0)
    throw DOM_DOMException(DOM_DOMException::HIERARCHY_REQUEST_ERR,
                           "an attribute has no children and is no child");
  if (!inBefore.isNull() && (inBefore.tree_ != tree_ || inBefore.attribute_ != 0))
    throw DOM_DOMException(DOM_DOMException::NOT_FOUND_ERR, "not a child of this node");
  const DOM_Node child(inChild);  // inChild may be what keeps a node alive that moves
  CheckInsertion(*tree_, node_, child.node_, inBefore.node_, 0);
  tree_->Insert(node_, child.node_, inBefore.node_);
  return child;
}

DOM_Node DOM_Node::replaceChild(const DOM_Node& inNew, const DOM_Node& inOld) {
  if (tree_ == nullptr || inNew.tree_ == nullptr || inOld.tree_ == nullptr) RefuseNull();
  if (tree_ != inNew.tree_)
    throw DOM_DOMException(DOM_DOMException::WRONG_DOCUMENT_ERR, "a node of another document");
  if (attribute_ != 0 || inNew.attribute_ != 0)
    throw DOM_DOMException(DOM_DOMException::HIERARCHY_REQUEST_ERR,
                           "an attribute has no children and is no child");
  if (inOld.tree_ != tree_ || inOld.attribute_ != 0 || tree_->At(inOld.node_).parent != node_)
    throw DOM_DOMException(DOM_DOMException::NOT_FOUND_ERR, "not a child of this node");
  const DOM_Node old(inOld);
  if (inNew == old) return old;
  CheckInsertion(*tree_, node_, inNew.node_, old.node_, old.node_);
  tree_->Insert(node_, inNew.node_, old.node_);
  tree_->Remove(old.node_);
  return old;
}

DOM_Node DOM_Node::removeChild(const DOM_Node& inChild) {
  if (tree_ == nullptr || inChild.tree_ == nullptr) RefuseNull();
  if (tree_ != inChild.tree_ || attribute_ != 0 || inChild.attribute_ != 0 ||
      tree_->At(inChild.node_).parent != node_)
    throw DOM_DOMException(DOM_DOMException::NOT_FOUND_ERR, "not a child of this node");
  const DOM_Node child(inChild);
  tree_->Remove(child.node_);
  return child;
}

DOM_Node DOM_Node::cloneNode(bool inDeep) const {
  if (tree_ == nullptr) return DOM_Node();
  const int kind = getNodeType();
  if (kind == DOCUMENT_NODE || kind == DOCUMENT_TYPE_NODE || kind == ATTRIBUTE_NODE)
    throw DOM_DOMException(DOM_DOMException::NOT_SUPPORTED_ERR,
                           "a document, document type or attribute cannot be copied");
  return DOM_HandleAccess::Handle(tree_, tree_->Copy(*tree_, node_, inDeep));
}

// ---- lists

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
  if (isNull()) return DOM_Node();
  DOM_Tree* const tree = DOM_HandleAccess::TreeOf(element_);
  const DOM_Tree::Node element = DOM_HandleAccess::NodeOf(element_);
  return DOM_HandleAccess::Handle(tree, element, FindNarrow(*tree, element, inName));
}

// ---- refusals

DOM_DOMException::DOM_DOMException(ExceptionCode inCode, const std::string& inReason)
    : std::runtime_error(inReason), code(inCode) {}

DOM_DOMException::~DOM_DOMException() = default;
