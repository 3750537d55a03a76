// A document's tree as it lies in memory, for whoever reads all of a large one.
#ifndef ZOR_DEFAULT_PLATFORM_TREE_READER_H
#define ZOR_DEFAULT_PLATFORM_TREE_READER_H

#include <array>

#include "default_platform/xml/DOM_HandleAccess.h"

namespace ZORDefault {

/// Reads elements, attributes and texts without making a handle or a string of each: an element is
/// a number, a name is a number, a text is its characters as they are stored. Numbers and texts are
/// valid as long as the reader, which keeps the document alive; changes of the document are seen.
class TreeReader {
 public:
  using Element = DOM_Tree::Node;  ///< 0 for none
  using Name = DOM_Tree::Name;

  /// @param inNode any node of the document, not null.
  explicit TreeReader(const DOM_Node& inNode)
      : handle_(inNode), tree_(DOM_HandleAccess::TreeOf(inNode)) {}

  /// One more than the largest number of an element, or of a name.
  Element ElementEnd() const { return tree_->NodeEnd(); }
  Name NameEnd() const { return tree_->NameEnd(); }
  std::u16string_view NameText(Name inName) const { return tree_->NameUnits(inName); }
  Name NameOf(Element inElement) const { return tree_->At(inElement).name; }

  static Element ElementOf(const DOM_Node& inNode) { return DOM_HandleAccess::NodeOf(inNode); }
  DOM_Node Handle(Element inElement) const { return DOM_HandleAccess::Handle(tree_, inElement); }

  /// Calls inVisit(Element, Name) for each child element in document order.
  template <class Visit>
  void ForEachChild(Element inElement, const Visit& inVisit) const {
    for (DOM_Tree::Node child = tree_->FirstChild(inElement); child != 0;) {
      const DOM_Tree::NodeRecord& record = tree_->At(child);
      if (record.kind == DOM_Node::ELEMENT_NODE) inVisit(child, record.name);
      child = record.next;
    }
  }

  /// Where an element lies, its first attribute, and the text of that; null where there is none. What
  /// comes next in the document mostly lies behind them.
  std::array<const char*, 3> PlacesOf(Element inElement) const {
    const DOM_Tree::AttributeRecord* const attribute = FirstAttribute(inElement);
    const DOM_Text* const text = attribute == nullptr ? nullptr : &TextOf(*attribute);
    return {reinterpret_cast<const char*>(&tree_->At(inElement)),
            reinterpret_cast<const char*>(attribute), reinterpret_cast<const char*>(text)};
  }

  // The same step by step, for whoever walks two trees side by side
  Element FirstElement(Element inParent) const { return ElementFrom(tree_->FirstChild(inParent)); }
  Element NextElement(Element inElement) const { return ElementFrom(tree_->At(inElement).next); }
  const DOM_Tree::AttributeRecord* FirstAttribute(Element inElement) const {
    return AttributeAt(tree_->At(inElement).firstAttribute);
  }
  const DOM_Tree::AttributeRecord* Next(const DOM_Tree::AttributeRecord& inAttribute) const {
    return AttributeAt(inAttribute.next);
  }
  const DOM_Text& TextOf(const DOM_Tree::AttributeRecord& inAttribute) const {
    return *tree_->Text(inAttribute.value);
  }

  /// Calls inVisit(Name, const DOM_Text&) for each attribute in document order. Texts of one
  /// document are Latin-1 where every character fits, so equal ones are equal bytes.
  template <class Visit>
  void ForEachAttribute(Element inElement, const Visit& inVisit) const {
    for (DOM_Tree::Attribute at = tree_->At(inElement).firstAttribute; at != 0;) {
      const DOM_Tree::AttributeRecord& record = tree_->AttributeAt(at);
      inVisit(record.name, *tree_->Text(record.value));
      at = record.next;
    }
  }

 private:
  Element ElementFrom(DOM_Tree::Node inNode) const {
    while (inNode != 0 && tree_->At(inNode).kind != DOM_Node::ELEMENT_NODE)
      inNode = tree_->At(inNode).next;
    return inNode;
  }
  const DOM_Tree::AttributeRecord* AttributeAt(DOM_Tree::Attribute inAttribute) const {
    return inAttribute == 0 ? nullptr : &tree_->AttributeAt(inAttribute);
  }

  DOM_Node handle_;
  DOM_Tree* tree_;
};

}  // namespace ZORDefault

#endif
