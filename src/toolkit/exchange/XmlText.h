// XML text, written piece by piece; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_XML_TEXT_H
#define ZOR_TOOLKIT_EXCHANGE_XML_TEXT_H

#include <charconv>
#include <initializer_list>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "foundation/Utf8.h"

namespace ZORToolkit {

/// UTF-8 as the text of an element or the value of an attribute. What XML cannot carry becomes
/// U+FFFD.
inline std::string XmlEscaped(std::string_view inText) {
  std::string text;
  text.reserve(inText.size());
  char bytes[4];
  for (std::size_t i = 0; i < inText.size();) {
    const char32_t character = ZORFoundation::NextCharacter(inText, i);
    if (character == '&')
      text += "&amp;";
    else if (character == '<')
      text += "&lt;";
    else if (character == '>')
      text += "&gt;";
    else if (character == '"')
      text += "&quot;";
    else if (character == '\r')
      text += "&#13;";
    else if ((character < 0x20 && character != '\t' && character != '\n') || character == 0xFFFE ||
             character == 0xFFFF)
      text += "\xEF\xBF\xBD";
    else
      text.append(bytes, ZORFoundation::EncodeCharacter(character, bytes));
  }
  return text;
}

/// The shortest text of a finite number that reads back as the same.
inline std::string NumberText(double inNumber) {
  char digits[32];
  const auto end = std::to_chars(digits, digits + sizeof digits, inNumber + 0.0).ptr;
  return std::string(digits, end);
}

class XmlText {
 public:
  typedef std::initializer_list<std::pair<const char*, std::string>> Attributes;

  explicit XmlText(bool inIsWhole = true) {
    if (inIsWhole) text_ = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n";
  }

  XmlText& Open(const char* inName, Attributes inAttributes = {}) {
    Begin(inName, inAttributes, ">\n");
    open_.emplace_back(inName);
    return *this;
  }
  XmlText& Close() {
    const std::string name = open_.back();
    open_.pop_back();
    Indent();
    text_.append("</").append(name).append(">\n");
    return *this;
  }
  XmlText& Empty(const char* inName, Attributes inAttributes = {}) {
    Begin(inName, inAttributes, "/>\n");
    return *this;
  }
  XmlText& Leaf(const char* inName, std::string_view inText) {
    Indent();
    text_.append("<").append(inName).append(">").append(XmlEscaped(inText));
    text_.append("</").append(inName).append(">\n");
    return *this;
  }
  XmlText& Leaf(const char* inName, double inNumber) {
    return Leaf(inName, std::string_view(NumberText(inNumber)));
  }
  std::string Take() { return std::move(text_); }

 private:
  void Indent() { text_.append(2 * open_.size(), ' '); }
  void Begin(const char* inName, Attributes inAttributes, const char* inEnd) {
    Indent();
    text_.append("<").append(inName);
    for (const auto& [name, value] : inAttributes)
      text_.append(" ").append(name).append("=\"").append(XmlEscaped(value)).append("\"");
    text_.append(inEnd);
  }

  std::string text_;
  std::vector<std::string> open_;
};

}  // namespace ZORToolkit

#endif
