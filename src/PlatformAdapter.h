// What the library uses of a platform beyond what every host has.
#ifndef ZOR_PLATFORM_ADAPTER_H
#define ZOR_PLATFORM_ADAPTER_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string_view>
#include <utility>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"

/// Each function calls a fast operation of the platform if its headers declare one, and falls back
/// on what every host has if not. They are templates so that an undeclared operation is not
/// compiled. Nothing else in the library uses the additions of ZORPlatformAdditions.h.
namespace adapter {

/// Modes of SearchSubString and Strip.
constexpr int kSearchForward = 1;
constexpr int kStripBothEnds = 4;

inline std::u16string_view UnitsOf(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}
inline std::u16string_view UnitsOf(const DOMString& inText) {
  return {inText.rawBuffer(), inText.length()};
}

/// A text as UTF-8 if the platform keeps it so, valid as long as the text; else none.
template <class Text>
std::optional<std::string_view> Utf8Of(const Text& inText) {
  if constexpr (requires(std::size_t & outCount) { inText.rawUTF8(outCount); }) {
    std::size_t count = 0;
    if (const char* const bytes = inText.rawUTF8(count)) return std::string_view(bytes, count);
  }
  return std::nullopt;
}

template <class String>
void AppendUnits(String& ioText, std::u16string_view inUnits) {
  if constexpr (requires { ioText.AppendUTF16(inUnits.data(), inUnits.size()); }) {
    ioText.AppendUTF16(inUnits.data(), inUnits.size());
  } else {
    String tail;
    tail.BuildFromUTF16(inUnits.data(), inUnits.size());
    ioText.Append(tail);
  }
}

/// Reserves capacity for a length in all; an optimisation only.
template <class String>
void Reserve(String& ioText, std::size_t inLength) {
  if constexpr (requires { ioText.Reserve(inLength); }) ioText.Reserve(inLength);
}

/// Compares without copying: readers call this for every child of every walk.
template <class Text>
bool IsText(const Text& inText, const char* inAscii) {
  if constexpr (requires { inText.equals(inAscii); }) {
    return inText.equals(inAscii);
  } else {
    const std::string_view ascii(inAscii);
    const std::u16string_view units = UnitsOf(inText);
    return std::equal(units.begin(), units.end(), ascii.begin(), ascii.end());
  }
}
inline bool IsText(const DOMString& inText, const ZORUnicodeString& inOther) {
  return UnitsOf(inText) == UnitsOf(inOther);
}

template <class Node>
bool HasName(const Node& inNode, const char* inAscii) {
  if constexpr (requires { inNode.hasName(inAscii); })
    return inNode.hasName(inAscii);
  else
    return IsText(inNode.getNodeName(), inAscii);
}
template <class Node>
bool HasName(const Node& inNode, const ZORUnicodeString& inName) {
  return IsText(inNode.getNodeName(), inName);
}

/// The node itself or else the first element after it among its siblings.
template <class Node>
Node ElementFrom(Node inNode) {
  while (!inNode.isNull() && inNode.getNodeType() != Node::ELEMENT_NODE)
    inNode = inNode.getNextSibling();
  return inNode;
}
template <class Node>
Node FirstElementChild(const Node& inParent) {
  if constexpr (requires { inParent.getFirstElementChild(); })
    return inParent.getFirstElementChild();
  else
    return ElementFrom(inParent.getFirstChild());
}
template <class Node>
Node NextElementSibling(const Node& inNode) {
  if constexpr (requires { inNode.getNextElementSibling(); })
    return inNode.getNextElementSibling();
  else
    return ElementFrom(inNode.getNextSibling());
}

/// The attributes of an element that outlives this: looked up once for all that are read, or the
/// element itself where the platform reads them from there.
template <class Node>
class AttributeSource {
 public:
  explicit AttributeSource(const Node& inElement) : source_(From(inElement)) {}
  /// Empties the text where there is no such attribute.
  void Read(const char* inName, ZORUnicodeString& outText) const {
    if constexpr (kIsElement)
      source_.getAttributeText(inName, outText);
    else
      outText = source_.getNamedItem(inName).getNodeValue().DOMStringToZORUnicodeString();
  }

 private:
  static constexpr bool kIsElement = requires(const Node& inElement, ZORUnicodeString& outText) {
    inElement.getAttributeText("", outText);
  };
  static decltype(auto) From(const Node& inElement) {
    if constexpr (kIsElement)
      return (inElement);
    else
      return inElement.getAttributes();
  }
  using Source = decltype(From(std::declval<const Node&>()));

  Source source_;
};

/// A number that changes with the node's document. None if the platform does not count changes, so
/// that nothing may be cached from one call to the next.
template <class Node>
std::optional<std::uint64_t> ChangeCount(const Node& inNode) {
  if constexpr (requires { inNode.getChangeCount(); })
    return inNode.getChangeCount();
  else
    return std::nullopt;
}

/// Whether two handles are known to refer to one node.
template <class Node>
bool AreSame(const Node& inA, const Node& inB) {
  if constexpr (requires { inA == inB; })
    return inA == inB;
  else
    return inA.isNull() && inB.isNull();
}

}  // namespace adapter

#endif
