#include "platform/xml/ZORXMLParser.h"

#include <algorithm>
#include <array>
#include <limits>
#include <string_view>
#include <type_traits>
#include <vector>

#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/XMLChars.h"

namespace {

/// Raised within this file only, for what no XML text can carry.
struct NotSerialisable {};

/// How a code unit is written.
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
// A parser turns a carriage return into a line feed, and nothing can be escaped here.
constexpr AsciiTreatments kVerbatim = Treatments(u"", true);

std::u16string_view EscapeOf(char16_t inUnit) {
  switch (inUnit) {
    case u'&':
      return u"&amp;";
    case u'<':
      return u"&lt;";
    case u'>':
      return u"&gt;";
    case u'"':
      return u"&quot;";
    case u'\t':
      return u"&#9;";
    case u'\n':
      return u"&#10;";
    default:
      return u"&#13;";
  }
}

/// A text that grows; becomes a string without being copied.
class TextBuffer {
 public:
  TextBuffer() : text_(NewOwnedText(kFirstSize)), at_(text_->Units()), end_(at_ + kFirstSize) {}
  ~TextBuffer() {
    if (text_ != nullptr) ReleaseOwnedText(text_);
  }
  TextBuffer(const TextBuffer&) = delete;
  TextBuffer& operator=(const TextBuffer&) = delete;

  /// Makes room for inCount more units.
  char16_t* Reserve(std::size_t inCount) {
    if (static_cast<std::size_t>(end_ - at_) < inCount) Grow(inCount);
    return at_;
  }
  void SetEnd(char16_t* inEnd) { at_ = inEnd; }
  void Append(std::u16string_view inText) {
    at_ = std::copy(inText.begin(), inText.end(), Reserve(inText.size()));
  }
  DOMString Finish() {
    DOM_Text* const text = ResizeOwnedText(text_, static_cast<std::uint32_t>(Used()));
    text_ = nullptr;
    return DOM_HandleAccess::Adopt(text);
  }

 private:
  static constexpr std::uint32_t kFirstSize = 1024;
  static constexpr std::size_t kMaxSize = std::numeric_limits<std::uint32_t>::max();

  std::size_t Used() const { return static_cast<std::size_t>(at_ - text_->Units()); }
  void Grow(std::size_t inCount) {
    const std::size_t used = Used();
    if (inCount > kMaxSize - used) throw NotSerialisable();
    const std::size_t room = std::min(kMaxSize, std::max(used + inCount, used * 2));
    text_ = ResizeOwnedText(text_, static_cast<std::uint32_t>(room));
    at_ = text_->Units() + used;
    end_ = text_->Units() + room;
  }

  DOM_Text* text_;
  char16_t* at_;
  char16_t* end_;
};

class TreeWriter {
 public:
  explicit TreeWriter(const DOM_Tree& inTree)
      : tree_(inTree), isNameChecked_(inTree.NameEnd(), false) {}

  void WriteNodes(DOM_Tree::Node inRoot);
  void WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute);
  DOMString Finish() { return buffer_.Finish(); }

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
  void WriteEscaped(TextView inText, const AsciiTreatments& inTreatments);
  template <class Unit>
  void WriteUnits(std::basic_string_view<Unit> inText, const AsciiTreatments& inTreatments);

  const DOM_Tree& tree_;
  TextBuffer buffer_;
  std::vector<bool> isNameChecked_;  // names known to be names of XML 1.0
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
      return WriteEscaped(tree_.Text(record.text)->View(), kInText);
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
  buffer_.Append(u"<");
  WriteName(record.name);
  for (DOM_Tree::Attribute at = record.firstAttribute; at != 0; at = tree_.AttributeAt(at).next) {
    buffer_.Append(u" ");
    WriteAttribute(tree_.AttributeAt(at));
  }
  buffer_.Append(tree_.FirstChild(inNode) == 0 ? u"/>" : u">");
}

void TreeWriter::End(DOM_Tree::Node inNode) {
  if (tree_.At(inNode).kind != DOM_Node::ELEMENT_NODE) return;
  buffer_.Append(u"</");
  WriteName(tree_.At(inNode).name);
  buffer_.Append(u">");
}

void TreeWriter::WriteAttribute(const DOM_Tree::AttributeRecord& inAttribute) {
  WriteName(inAttribute.name);
  buffer_.Append(u"=\"");
  WriteEscaped(tree_.Text(inAttribute.value)->View(), kInAttribute);
  buffer_.Append(u"\"");
}

// A document of XML 1.1 may have names that the text, which declares no version, cannot carry.
void TreeWriter::WriteName(DOM_Tree::Name inName) {
  const std::u16string_view name = tree_.NameUnits(inName);
  if (!isNameChecked_[inName]) {
    if (!IsXMLName(name)) throw NotSerialisable();
    isNameChecked_[inName] = true;
  }
  buffer_.Append(name);
}

constexpr std::size_t kBlock = 8;

// Whether eight units are ASCII that needs no escape in any context. Free of branches, so that it
// vectorises.
template <class Unit>
bool NeedsNoEscape(const Unit* inUnits) {
  unsigned int hits = 0;
  for (std::size_t i = 0; i < kBlock; ++i) {
    const auto unit = static_cast<std::make_unsigned_t<Unit>>(inUnits[i]);
    hits |= static_cast<unsigned int>(unit < 0x20) | static_cast<unsigned int>(unit >= 0x80) |
            static_cast<unsigned int>(unit == u'&') | static_cast<unsigned int>(unit == u'<') |
            static_cast<unsigned int>(unit == u'>') | static_cast<unsigned int>(unit == u'"');
  }
  return hits == 0;
}

void TreeWriter::WriteEscaped(TextView inText, const AsciiTreatments& inTreatments) {
  if (inText.IsWide())
    WriteUnits(inText.Units(), inTreatments);
  else
    WriteUnits(inText.Latin1(), inTreatments);
}

template <class Unit>
void TreeWriter::WriteUnits(std::basic_string_view<Unit> inText,
                            const AsciiTreatments& inTreatments) {
  const Unit* from = inText.data();
  const Unit* const end = from + inText.size();
  char16_t* to = buffer_.Reserve(inText.size());
  while (from != end) {
    if (end - from >= static_cast<std::ptrdiff_t>(kBlock) && NeedsNoEscape(from)) {
      for (std::size_t i = 0; i < kBlock; ++i)
        to[i] = static_cast<std::make_unsigned_t<Unit>>(from[i]);
      to += kBlock;
      from += kBlock;
      continue;
    }
    const Unit* const pause = from + std::min<std::ptrdiff_t>(kBlock, end - from);
    while (from < pause) {
      const char16_t unit = static_cast<std::make_unsigned_t<Unit>>(*from);
      if (unit < 0x80 ? inTreatments[unit] == kCopy : unit < 0xD800) {
        *to++ = unit;
        ++from;
      } else if (unit >= 0x80) {
        const bool isPair = unit >= 0xD800 && unit < 0xDC00 && from + 1 != end &&
                            from[1] >= 0xDC00 && from[1] < 0xE000;
        if (unit >= 0xFFFE || (unit < 0xE000 && !isPair)) throw NotSerialisable();
        *to++ = unit;
        ++from;
        if (isPair) *to++ = static_cast<char16_t>(*from++);
      } else {
        if (inTreatments[unit] == kRefuse) throw NotSerialisable();
        buffer_.SetEnd(to);
        buffer_.Append(EscapeOf(unit));
        ++from;
        to = buffer_.Reserve(static_cast<std::size_t>(end - from));
      }
    }
  }
  buffer_.SetEnd(to);
}

// What a section cannot hold is written between two sections.
void TreeWriter::WriteSection(std::u16string_view inText) {
  constexpr std::u16string_view kStart = u"<![CDATA[";
  constexpr std::u16string_view kEnd = u"]]>";
  buffer_.Append(kStart);
  while (true) {
    const std::size_t stop = std::min(inText.find(kEnd), inText.find(u'\r'));
    if (stop == std::u16string_view::npos) break;
    const bool isEnd = inText[stop] == u']';
    const std::size_t count = stop + (isEnd ? 2 : 0);
    WriteUnits(inText.substr(0, count), kInSection);
    buffer_.Append(kEnd);
    if (!isEnd) buffer_.Append(EscapeOf(u'\r'));
    buffer_.Append(kStart);
    inText.remove_prefix(isEnd ? count : count + 1);
  }
  WriteUnits(inText, kInSection);
  buffer_.Append(kEnd);
}

void TreeWriter::WriteComment(std::u16string_view inText) {
  if (inText.find(u"--") != std::u16string_view::npos || inText.ends_with(u'-'))
    throw NotSerialisable();
  buffer_.Append(u"<!--");
  WriteUnits(inText, kVerbatim);
  buffer_.Append(u"-->");
}

void TreeWriter::WriteInstruction(const DOM_Tree::NodeRecord& inRecord) {
  const std::u16string data = tree_.Text(inRecord.text)->View().ToUtf16();
  // A parser would take leading white space for the separator.
  if (data.find(u"?>") != std::u16string::npos || data.find_first_of(u" \t\n") == 0)
    throw NotSerialisable();
  buffer_.Append(u"<?");
  WriteName(inRecord.name);
  if (!data.empty()) buffer_.Append(u" ");
  WriteUnits(std::u16string_view(data), kVerbatim);
  buffer_.Append(u"?>");
}

void TreeWriter::WriteDoctype(const DOM_Tree::NodeRecord& inRecord) {
  const DocumentType& doctype = tree_.Doctype();
  buffer_.Append(u"<!DOCTYPE ");
  WriteName(inRecord.name);
  if (doctype.publicId != 0) {
    buffer_.Append(u" PUBLIC ");
    WriteIdLiteral(*tree_.Text(doctype.publicId));
    buffer_.Append(u" ");
  } else if (doctype.systemId != 0) {
    buffer_.Append(u" SYSTEM ");
  }
  if (doctype.systemId != 0) WriteIdLiteral(*tree_.Text(doctype.systemId));
  if (doctype.internalSubset != 0) {
    buffer_.Append(u" [");
    WriteEscaped(tree_.Text(doctype.internalSubset)->View(), kVerbatim);
    buffer_.Append(u"]");
  }
  buffer_.Append(u">");
}

void TreeWriter::WriteIdLiteral(const DOM_Text& inText) {
  const std::u16string text = inText.View().ToUtf16();
  const std::u16string_view quote = text.find(u'"') == std::u16string::npos ? u"\"" : u"'";
  buffer_.Append(quote);
  WriteUnits(std::u16string_view(text), kVerbatim);
  buffer_.Append(quote);
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
