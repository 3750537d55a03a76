// From handles to the tree and back.
#ifndef ZOR_DEFAULT_PLATFORM_XML_DOM_HANDLEACCESS_H
#define ZOR_DEFAULT_PLATFORM_XML_DOM_HANDLEACCESS_H

#include <cstdlib>
#include <memory>

#include "default_platform/xml/DOM_Tree.h"
#include "platform/xml/DOMString.h"
#include "platform/xml/DOM_Document.h"

struct FreeBytes {
  void operator()(char* inBytes) const { std::free(inBytes); }
};
using MallocedBytes = std::unique_ptr<char, FreeBytes>;

/// The one door through which the default platform, and tests that count nodes, see what a handle
/// refers to.
class DOM_HandleAccess {
 public:
  static DOM_Tree* TreeOf(const DOM_Node& inHandle) { return inHandle.tree_; }
  static DOM_Tree::Node NodeOf(const DOM_Node& inHandle) { return inHandle.node_; }
  static DOM_Tree::Attribute AttributeOf(const DOM_Node& inHandle) { return inHandle.attribute_; }
  static bool IsElement(const DOM_Node& inHandle) {
    return inHandle.tree_ != nullptr && inHandle.attribute_ == 0 &&
           inHandle.tree_->At(inHandle.node_).kind == DOM_Node::ELEMENT_NODE;
  }

  /// @return a null handle for the node 0.
  static DOM_Node Handle(DOM_Tree* inTree, DOM_Tree::Node inNode) {
    return inNode == 0 ? DOM_Node() : DOM_Node(inTree, inNode, 0);
  }
  static DOM_Node Handle(DOM_Tree* inTree, DOM_Tree::Node inElement,
                         DOM_Tree::Attribute inAttribute) {
    return inAttribute == 0 ? DOM_Node() : DOM_Node(inTree, inElement, inAttribute);
  }
  static DOM_Document DocumentOf(DOM_Tree* inTree) {
    return DOM_Document(DOM_Node(inTree, DOM_Tree::kDocument, 0));
  }

  /// @return the null string for a null text.
  static DOMString String(DOM_Tree* inTree, const DOM_Text* inText) {
    return inText == nullptr ? DOMString() : DOMString(inTree, inText);
  }
  static TextView View(const DOMString& inText) {
    if (inText.text_ == nullptr) return std::u16string_view();
    return inText.tree_ == nullptr ? TextView(Units(inText)) : inText.text_->View();
  }
  static std::u16string_view Units(const DOMString& inText) {
    return {inText.rawBuffer(), inText.length()};
  }
  static TextRef TextFor(DOM_Tree& ioTree, const DOMString& inText) {
    return ioTree.AddText(View(inText));
  }
  static void CopyTo(ZORUnicodeString& outText, TextView inView);
  /// Makes a string of well-formed UTF-8, which is widened when its code units are asked for.
  /// @param inUnits the number of its code units.
  static DOMString StringOfUtf8(MallocedBytes inBytes, std::size_t inCount, std::uint32_t inUnits);
};

#endif
