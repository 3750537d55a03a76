#include "default_platform/xml/TreeWriter.h"

#include <algorithm>
#include <array>
#include <string_view>
#include <vector>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/WrittenText.h"
#include "default_platform/xml/XMLNames.h"

namespace {

/// What is to be done with a code unit.
enum Treatment : unsigned char { kCopy, kEscape, kRefuse };

/// The treatment of the ASCII units in one context. Beyond ASCII all contexts are alike.
using AsciiTreatments = std::array<Treatment, 128>;

constexpr AsciiTreatments Treatments(std::u16string_view inEscaped, bool inRefusesReturn) {
  AsciiTreatments treatments{};
  for (char16_t unit = 0; unit < 0x20; ++unit) treatments[unit] = kRefuse;
  for (const char16_t unit : {u'\t', u'\n', u'\r'}) treatments[unit] = kCopy;
  if (inRefusesReturn) treatments[u'\r'] = kRefuse;
  for (const char16_t unit : inEscaped) treatments[unit] = kEscape;
  return treatments;
}

constexpr AsciiTreatments kInText = Treatments(u"&<>\r", false);
constexpr AsciiTreatments kInAttribute = Treatments(u"&<>\"\t\n\r", false);
constexpr AsciiTreatments kInSection = Treatments(u"\r", false);
// A reader turns a carriage return into a line feed, and nothing can be escaped here.
constexpr AsciiTreatments kVerbatim = Treatments(u"", true);

std::string_view EscapeOf(char16_t inUnit) {
  switch (inUnit) {
    case u'&':
      return "&amp;";
    case u'<':
      return "&lt;";
    case u'>':
      return "&gt;";
    case u'"':
      return "&quot;";
    case u'\t':
      return "&#9;";
    case u'\n':
      return "&#10;";
    default:
      return "&#13;";
  }
}

constexpr std::size_t kBlock = 8;

// Whether eight units are ASCII that stays as it is everywhere. Without branches, so that compilers
// make vector instructions of it.
bool IsPlainBlock(const char16_t* inUnits) {
  unsigned int hits = 0;
  for (std::size_t i = 0; i < kBlock; ++i) {
    const char16_t unit = inUnits[i];
    hits |= static_cast<unsigned int>(unit < 0x20) | static_cast<unsigned int>(unit >= 0x80) |
            static_cast<unsigned int>(unit == u'&') | static_cast<unsigned int>(unit == u'<') |
            static_cast<unsigned int>(unit == u'>') | static_cast<unsigned int>(unit == u'"');
  }
  return hits == 0;
}

// Takes a character beyond ASCII.
char32_t TakeCharacter(const char16_t*& ioFrom, const char16_t* inEnd) {
  const char16_t unit = *ioFrom++;
  if (unit < 0xD800 || (unit >= 0xE000 && unit < 0xFFFE)) return unit;
  const bool isPair = unit < 0xDC00 && ioFrom != inEnd && *ioFrom >= 0xDC00 && *ioFrom < 0xE000;
  if (!isPair) throw NotWritable();
  return 0x10000 + ((unit - char32_t{0xD800}) << 10) + (*ioFrom++ - char32_t{0xDC00});
}

/// Writes into a WideText or a Utf8Parts.
template <class Buffer>
class TreeWriter {
 public:
  explicit TreeWriter(const DOM_Tree& inTree)
      : tree_(inTree), isNameKnown_(inTree.NameEnd(), false) {}

  void WriteNodes(DOM_Tree::Node inRoot);
  void WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute);
  auto Finish() { return buffer_.Finish(); }

 private:
  void Start(DOM_Tree::Node inNode);
  void End(DOM_Tree::Node inNode);
  void StartElement(DOM_Tree::Node inNode);
  void WriteSection(std::u16string_view inText);
  void WriteComment(std::u16string_view inText);
  void WriteInstruction(const DOM_Tree::NodeRecord& inRecord);
  void WriteDoctype(const DOM_Tree::NodeRecord& inRecord);
  void WriteIdLiteral(const DOM_Text& inText);
  void WriteName(DOM_Tree::Name inName);
  void WriteMarkup(std::string_view inAscii);
  void WriteEscaped(std::u16string_view inText, const AsciiTreatments& inTreatments);

  const DOM_Tree& tree_;
  Buffer buffer_;
  std::vector<bool> isNameKnown_;  // whether a name was found to be one of XML 1.0
};

template <class Buffer>
void TreeWriter<Buffer>::WriteNodes(DOM_Tree::Node inRoot) {
  DOM_Tree::Node at = inRoot;
  while (true) {
    Start(at);
    const DOM_Tree::Node child = tree_.FirstChild(at);
    if (child != 0) {
      at = child;
      continue;
    }
    while (at != inRoot && tree_.At(at).next == 0) {
      at = tree_.At(at).parent;
      End(at);
    }
    if (at == inRoot) return;
    at = tree_.At(at).next;
  }
}

template <class Buffer>
void TreeWriter<Buffer>::Start(DOM_Tree::Node inNode) {
  const DOM_Tree::NodeRecord& record = tree_.At(inNode);
  switch (record.kind) {
    case DOM_Node::ELEMENT_NODE:
      return StartElement(inNode);
    case DOM_Node::TEXT_NODE:
      return WriteEscaped(record.text->View(), kInText);
    case DOM_Node::CDATA_SECTION_NODE:
      return WriteSection(record.text->View());
    case DOM_Node::COMMENT_NODE:
      return WriteComment(record.text->View());
    case DOM_Node::PROCESSING_INSTRUCTION_NODE:
      return WriteInstruction(record);
    case DOM_Node::DOCUMENT_TYPE_NODE:
      return WriteDoctype(record);
    default:
      return;  // a document or fragment has no text of its own
  }
}

template <class Buffer>
void TreeWriter<Buffer>::StartElement(DOM_Tree::Node inNode) {
  const DOM_Tree::NodeRecord& record = tree_.At(inNode);
  WriteMarkup("<");
  WriteName(record.name);
  for (DOM_Tree::Attribute at = record.firstAttribute; at != 0; at = tree_.AttributeAt(at).next) {
    WriteMarkup(" ");
    WriteAttribute(tree_.AttributeAt(at));
  }
  WriteMarkup(tree_.FirstChild(inNode) == 0 ? "/>" : ">");
}

template <class Buffer>
void TreeWriter<Buffer>::End(DOM_Tree::Node inNode) {
  if (tree_.At(inNode).kind != DOM_Node::ELEMENT_NODE) return;
  WriteMarkup("</");
  WriteName(tree_.At(inNode).name);
  WriteMarkup(">");
}

template <class Buffer>
void TreeWriter<Buffer>::WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute) {
  WriteName(inAttribute.name);
  WriteMarkup("=\"");
  WriteEscaped(inAttribute.value->View(), kInAttribute);
  WriteMarkup("\"");
}

// A document of XML 1.1 may have names that the text, which declares no version, cannot carry.
template <class Buffer>
void TreeWriter<Buffer>::WriteName(DOM_Tree::Name inName) {
  const std::u16string_view name = tree_.NameText(inName)->View();
  if (!isNameKnown_[inName]) {
    if (!IsXMLName(name)) throw NotWritable();
    isNameKnown_[inName] = true;
  }
  WriteEscaped(name, kVerbatim);
}

template <class Buffer>
void TreeWriter<Buffer>::WriteMarkup(std::string_view inAscii) {
  buffer_.SetEnd(std::copy(inAscii.begin(), inAscii.end(), buffer_.Reserve(inAscii.size())));
}

template <class Buffer>
void TreeWriter<Buffer>::WriteEscaped(std::u16string_view inText,
                                      const AsciiTreatments& inTreatments) {
  using Unit = typename Buffer::Unit;
  const char16_t* from = inText.data();
  const char16_t* const end = from + inText.size();
  Unit* to = buffer_.Reserve(inText.size());
  while (from != end) {
    if (end - from >= static_cast<std::ptrdiff_t>(kBlock) && IsPlainBlock(from)) {
      for (std::size_t i = 0; i < kBlock; ++i) to[i] = static_cast<Unit>(from[i]);
      from += kBlock;
      to += kBlock;
      continue;
    }
    const char16_t* const pause = from + std::min<std::ptrdiff_t>(kBlock, end - from);
    while (from < pause) {
      if (*from >= 0x80) {
        to = Buffer::Put(TakeCharacter(from, end), to);
      } else if (inTreatments[*from] == kCopy) {
        *to++ = static_cast<Unit>(*from++);
      } else {
        if (inTreatments[*from] == kRefuse) throw NotWritable();
        buffer_.SetEnd(to);
        WriteMarkup(EscapeOf(*from++));
        to = buffer_.Reserve(static_cast<std::size_t>(end - from));
      }
    }
  }
  buffer_.SetEnd(to);
}

// What a section cannot hold stands between two sections.
template <class Buffer>
void TreeWriter<Buffer>::WriteSection(std::u16string_view inText) {
  constexpr std::string_view kStart = "<![CDATA[";
  constexpr std::string_view kEnd = "]]>";
  WriteMarkup(kStart);
  while (true) {
    const std::size_t stop = std::min(inText.find(u"]]>"), inText.find(u'\r'));
    if (stop == std::u16string_view::npos) break;
    const bool isEnd = inText[stop] == u']';
    const std::size_t count = stop + (isEnd ? 2 : 0);
    WriteEscaped(inText.substr(0, count), kInSection);
    WriteMarkup(kEnd);
    if (!isEnd) WriteMarkup(EscapeOf(u'\r'));
    WriteMarkup(kStart);
    inText.remove_prefix(isEnd ? count : count + 1);
  }
  WriteEscaped(inText, kInSection);
  WriteMarkup(kEnd);
}

template <class Buffer>
void TreeWriter<Buffer>::WriteComment(std::u16string_view inText) {
  if (inText.find(u"--") != std::u16string_view::npos || inText.ends_with(u'-'))
    throw NotWritable();
  WriteMarkup("<!--");
  WriteEscaped(inText, kVerbatim);
  WriteMarkup("-->");
}

template <class Buffer>
void TreeWriter<Buffer>::WriteInstruction(const DOM_Tree::NodeRecord& inRecord) {
  const std::u16string_view data = inRecord.text->View();
  // A reader takes white space before the data as the separator.
  if (data.find(u"?>") != std::u16string_view::npos || data.find_first_of(u" \t\n") == 0)
    throw NotWritable();
  WriteMarkup("<?");
  WriteName(inRecord.name);
  if (!data.empty()) WriteMarkup(" ");
  WriteEscaped(data, kVerbatim);
  WriteMarkup("?>");
}

template <class Buffer>
void TreeWriter<Buffer>::WriteDoctype(const DOM_Tree::NodeRecord& inRecord) {
  const DocumentType& doctype = tree_.Doctype();
  WriteMarkup("<!DOCTYPE ");
  WriteName(inRecord.name);
  if (doctype.publicId != nullptr) {
    WriteMarkup(" PUBLIC ");
    WriteIdLiteral(*doctype.publicId);
    WriteMarkup(" ");
  } else if (doctype.systemId != nullptr) {
    WriteMarkup(" SYSTEM ");
  }
  if (doctype.systemId != nullptr) WriteIdLiteral(*doctype.systemId);
  if (doctype.internalSubset != nullptr) {
    WriteMarkup(" [");
    WriteEscaped(doctype.internalSubset->View(), kVerbatim);
    WriteMarkup("]");
  }
  WriteMarkup(">");
}

template <class Buffer>
void TreeWriter<Buffer>::WriteIdLiteral(const DOM_Text& inText) {
  const std::string_view quote = inText.View().find(u'"') == std::u16string_view::npos ? "\"" : "'";
  WriteMarkup(quote);
  WriteEscaped(inText.View(), kVerbatim);
  WriteMarkup(quote);
}

}  // namespace

bool IsWritableEncoding(const ZORUnicodeString& inName) {
  constexpr std::u16string_view kKnown[] = {u"utf-8", u"utf-16"};
  std::u16string name(inName.ConvertToUCChar(), static_cast<std::size_t>(inName.GetLengthInChar()));
  for (char16_t& unit : name)
    if (unit >= u'A' && unit <= u'Z') unit |= 0x20;
  return std::find(std::begin(kKnown), std::end(kKnown), name) != std::end(kKnown);
}

namespace {
template <class Buffer>
auto Written(const DOM_Node& inNode) {
  const DOM_Tree& tree = *DOM_HandleAccess::TreeOf(inNode);
  TreeWriter<Buffer> writer(tree);
  const DOM_Tree::Attribute attribute = DOM_HandleAccess::AttributeOf(inNode);
  if (attribute != 0)
    writer.WriteAttribute(tree.AttributeAt(attribute));
  else
    writer.WriteNodes(DOM_HandleAccess::NodeOf(inNode));
  return writer.Finish();
}
}  // namespace

bool WriteTree(const DOM_Node& inNode, DOMString& outText) {
  try {
    outText = Written<WideText>(inNode);
    return true;
  } catch (const NotWritable&) {
    return false;
  }
}

bool WriteTree(const DOM_Node& inNode, std::vector<std::string>& outParts) {
  try {
    outParts = Written<Utf8Parts>(inNode);
    return true;
  } catch (const NotWritable&) {
    return false;
  }
}
