#include "platform/xml/ZORXMLParser.h"

#include <algorithm>
#include <limits>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/EscapedText.h"
#include "default_platform/xml/XMLChars.h"
#include "foundation/Utf8.h"

namespace {

constexpr AsciiTreatments kInText = Treatments(u"&<>\r", false);
constexpr AsciiTreatments kInAttribute = Treatments(u"&<>\"\t\n\r", false);
constexpr AsciiTreatments kInSection = Treatments(u"\r", false);
// A parser turns a carriage return into a line feed, and nothing can be escaped here.
constexpr AsciiTreatments kVerbatim = Treatments(u"", true);

constexpr std::size_t kAroundName = 3;  // bytes of " Name=\"" but the name's

class TreeWriter {
 public:
  explicit TreeWriter(const DOM_Tree& inTree) : tree_(inTree), names_(inTree.NameEnd()) {}

  void WriteNodes(DOM_Tree::Node inRoot);
  void WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute);
  DOMString Finish() { return text_.Finish(); }

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

  /// A name as UTF-8, as an attribute begins: " Name=\"".
  struct NameText {
    std::string start;
    std::size_t units = 0;
  };
  const NameText& TextOf(DOM_Tree::Name inName);

  const DOM_Tree& tree_;
  EscapedText text_;
  std::vector<NameText> names_;  // those met so far
};

void TreeWriter::WriteNodes(DOM_Tree::Node inRoot) {
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

void TreeWriter::Start(DOM_Tree::Node inNode) {
  const DOM_Tree::NodeRecord& record = tree_.At(inNode);
  switch (record.kind) {
    case DOM_Node::ELEMENT_NODE:
      return StartElement(inNode);
    case DOM_Node::TEXT_NODE:
      return text_.Append(tree_.Text(record.text)->View(), kInText);
    case DOM_Node::CDATA_SECTION_NODE:
      return WriteSection(tree_.Text(record.text)->View().ToUtf16());
    case DOM_Node::COMMENT_NODE:
      return WriteComment(tree_.Text(record.text)->View().ToUtf16());
    case DOM_Node::PROCESSING_INSTRUCTION_NODE:
      return WriteInstruction(record);
    case DOM_Node::DOCUMENT_TYPE_NODE:
      return WriteDoctype(record);
    default:
      return;  // a document or fragment has no text of its own
  }
}

void TreeWriter::StartElement(DOM_Tree::Node inNode) {
  const DOM_Tree::NodeRecord& record = tree_.At(inNode);
  text_.Append("<");
  WriteName(record.name);
  for (DOM_Tree::Attribute at = record.firstAttribute; at != 0; at = tree_.AttributeAt(at).next) {
    const DOM_Tree::AttributeRecord& attribute = tree_.AttributeAt(at);
    const NameText& name = TextOf(attribute.name);
    text_.Append(name.start, name.units + kAroundName);
    text_.Append(tree_.Text(attribute.value)->View(), kInAttribute);
    text_.Append("\"");
  }
  text_.Append(tree_.FirstChild(inNode) == 0 ? "/>" : ">");
}

void TreeWriter::End(DOM_Tree::Node inNode) {
  if (tree_.At(inNode).kind != DOM_Node::ELEMENT_NODE) return;
  text_.Append("</");
  WriteName(tree_.At(inNode).name);
  text_.Append(">");
}

void TreeWriter::WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute) {
  WriteName(inAttribute.name);
  text_.Append("=\"");
  text_.Append(tree_.Text(inAttribute.value)->View(), kInAttribute);
  text_.Append("\"");
}

// A document of XML 1.1 may have names that the text, which declares no version, cannot carry.
const TreeWriter::NameText& TreeWriter::TextOf(DOM_Tree::Name inName) {
  NameText& name = names_[inName];
  if (!name.start.empty()) return name;
  const std::u16string_view units = tree_.NameUnits(inName);
  if (!IsXMLName(units)) throw NotSerialisable();
  std::string utf8(ZORFoundation::Utf8Length(units), '\0');
  ZORFoundation::EncodeUtf8(units, utf8.data());
  name.units = units.size();
  name.start.append(" ").append(utf8).append("=\"");
  return name;
}

void TreeWriter::WriteName(DOM_Tree::Name inName) {
  const NameText& name = TextOf(inName);
  text_.Append(std::string_view(name.start).substr(1, name.start.size() - kAroundName), name.units);
}

// What a section cannot hold is written between two sections.
void TreeWriter::WriteSection(std::u16string_view inText) {
  constexpr std::string_view kStart = "<![CDATA[";
  constexpr std::string_view kEnd = "]]>";
  text_.Append(kStart);
  while (true) {
    const std::size_t stop = std::min(inText.find(u"]]>"), inText.find(u'\r'));
    if (stop == std::u16string_view::npos) break;
    const bool isEnd = inText[stop] == u']';
    const std::size_t count = stop + (isEnd ? 2 : 0);
    text_.Append(inText.substr(0, count), kInSection);
    text_.Append(kEnd);
    if (!isEnd) text_.Append(EscapeOf(u'\r'));
    text_.Append(kStart);
    inText.remove_prefix(isEnd ? count : count + 1);
  }
  text_.Append(inText, kInSection);
  text_.Append(kEnd);
}

void TreeWriter::WriteComment(std::u16string_view inText) {
  if (inText.find(u"--") != std::u16string_view::npos || inText.ends_with(u'-'))
    throw NotSerialisable();
  text_.Append("<!--");
  text_.Append(inText, kVerbatim);
  text_.Append("-->");
}

void TreeWriter::WriteInstruction(const DOM_Tree::NodeRecord& inRecord) {
  const std::u16string data = tree_.Text(inRecord.text)->View().ToUtf16();
  // A parser would take leading white space for the separator.
  if (data.find(u"?>") != std::u16string::npos || data.find_first_of(u" \t\n") == 0)
    throw NotSerialisable();
  text_.Append("<?");
  WriteName(inRecord.name);
  if (!data.empty()) text_.Append(" ");
  text_.Append(std::u16string_view(data), kVerbatim);
  text_.Append("?>");
}

void TreeWriter::WriteDoctype(const DOM_Tree::NodeRecord& inRecord) {
  const DocumentType& doctype = tree_.Doctype();
  text_.Append("<!DOCTYPE ");
  WriteName(inRecord.name);
  if (doctype.publicId != 0) {
    text_.Append(" PUBLIC ");
    WriteIdLiteral(*tree_.Text(doctype.publicId));
    text_.Append(" ");
  } else if (doctype.systemId != 0) {
    text_.Append(" SYSTEM ");
  }
  if (doctype.systemId != 0) WriteIdLiteral(*tree_.Text(doctype.systemId));
  if (doctype.internalSubset != 0) {
    text_.Append(" [");
    text_.Append(tree_.Text(doctype.internalSubset)->View(), kVerbatim);
    text_.Append("]");
  }
  text_.Append(">");
}

void TreeWriter::WriteIdLiteral(const DOM_Text& inText) {
  const std::u16string text = inText.View().ToUtf16();
  const std::string_view quote = text.find(u'"') == std::u16string::npos ? "\"" : "'";
  text_.Append(quote);
  text_.Append(std::u16string_view(text), kVerbatim);
  text_.Append(quote);
}

bool IsKnownEncoding(const ZORUnicodeString& inName) {
  constexpr std::u16string_view kKnown[] = {u"utf-8", u"utf-16"};
  std::u16string name(inName.ConvertToUCChar(), static_cast<std::size_t>(inName.GetLengthInChar()));
  for (char16_t& unit : name)
    if (unit >= u'A' && unit <= u'Z') unit |= 0x20;
  return std::find(std::begin(kKnown), std::end(kKnown), name) != std::end(kKnown);
}

}  // namespace

// There is nothing to prepare: what reads documents is loaded when one needs it.
HRESULT ZORXMLParser::Initialize() { return S_OK; }

HRESULT ZORXMLParser::CreateMemBufInputSource(const unsigned char* inBytes, unsigned int inCount,
                                              const ZORUnicodeString& inIdentifier,
                                              unsigned char inAdopt, InputSource*& outSource) {
  outSource = nullptr;
  if ((inBytes == nullptr && inCount != 0) || inCount > std::numeric_limits<std::int32_t>::max())
    return E_INVALIDARG;
  outSource = new MemorySource(inBytes, inCount, inIdentifier, inAdopt != 0);
  return S_OK;
}

HRESULT ZORXMLParser::WriteXML(const DOM_Node& inNode, const ZORUnicodeString& inEncoding,
                               DOMString& outText) {
  if (inNode.isNull() || !IsKnownEncoding(inEncoding)) return E_INVALIDARG;
  const DOM_Tree& tree = *DOM_HandleAccess::TreeOf(inNode);
  try {
    TreeWriter writer(tree);
    const DOM_Tree::Attribute attribute = DOM_HandleAccess::AttributeOf(inNode);
    if (attribute != 0)
      writer.WriteAttribute(tree.AttributeAt(attribute));
    else
      writer.WriteNodes(DOM_HandleAccess::NodeOf(inNode));
    outText = writer.Finish();
    return S_OK;
  } catch (const NotSerialisable&) {
    return E_FAIL;
  }
}
