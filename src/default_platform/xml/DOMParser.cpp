#include "platform/xml/DOMParser.h"

#include <memory>
#include <vector>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "default_platform/xml/FullScanner.h"
#include "default_platform/xml/Utf8FastPath.h"
#include "foundation/PluginLoader.h"
#include "platform/xml/ZORXMLParseError.h"

namespace {

// Null for a document that the full scanner must read, which alone says what is wrong with one, and
// where.
DOM_Document ReadUtf8(ByteReader& ioReader) {
  const DOM_Document document = DOM_Document::createDocument();
  try {
    Utf8FastPath(ioReader, *DOM_HandleAccess::TreeOf(document)).Read();
    return document;
  } catch (const NeedsFullScanner&) {
    return DOM_Document();
  }
}

/// Fills a tree with what the full scanner reports.
class TreeFiller final : public ScanSink {
 public:
  explicit TreeFiller(DOM_Tree& ioTree) : tree_(ioTree) {}

  Name InternName(std::u16string_view inName) override { return tree_.InternName(inName); }
  void StartElement(Name inName) override {
    Append(DOM_Node::ELEMENT_NODE, inName, 0);
    open_.push_back({open_.back().lastChild, 0});
    lastAttribute_ = 0;
  }
  void AddAttribute(Name inName, std::u16string_view inValue) override {
    lastAttribute_ =
        tree_.AppendNewAttribute(open_.back().node, lastAttribute_, inName, tree_.AddText(inValue));
  }
  void EndElement() override {
    tree_.EndChildren(open_.back().node, open_.back().lastChild);
    open_.pop_back();
  }
  void AddLeaf(int inKind, Name inName, std::u16string_view inText) override {
    Append(inKind, inName, tree_.AddText(inText));
  }
  void SetDoctype(const Doctype& inDoctype) override {
    if (!hasDoctype_) Append(DOM_Node::DOCUMENT_TYPE_NODE, inDoctype.name, 0);
    hasDoctype_ = true;
    tree_.SetDoctype({TextOrNone(inDoctype.publicId), TextOrNone(inDoctype.systemId),
                      TextOrNone(inDoctype.internalSubset)});
  }

 private:
  struct OpenNode {
    DOM_Tree::Node node;
    DOM_Tree::Node lastChild;
  };
  void Append(int inKind, Name inName, TextRef inText) {
    OpenNode& parent = open_.back();
    parent.lastChild = tree_.AppendNew(parent.node, parent.lastChild, inKind, inName, inText);
  }
  TextRef TextOrNone(std::u16string_view inText) {
    return inText.data() == nullptr ? 0 : tree_.AddText(inText);
  }

  DOM_Tree& tree_;
  std::vector<OpenNode> open_{{DOM_Tree::kDocument, 0}};
  DOM_Tree::Attribute lastAttribute_ = 0;
  bool hasDoctype_ = false;
};

ScanAnyDocument* FullScanner(const std::string& inName) {
  std::string reason;
  static void* scanner = nullptr;
  if (scanner == nullptr)
    scanner = ZORFoundation::FindPluginFunction(kFullScannerFile, kFullScannerName, reason);
  if (scanner == nullptr) throw ZORXMLParseError(inName, 0, 0, reason);
  return reinterpret_cast<ScanAnyDocument*>(scanner);
}

DOM_Document ReadDocument(ByteReader& ioReader, const std::string& inName) {
  if (ioReader.IsEmpty()) return DOM_Document::createDocument();
  const DOM_Document plain = ReadUtf8(ioReader);
  if (!plain.isNull()) return plain;
  ScanAnyDocument* const scan = FullScanner(inName);
  ioReader.Rewind();
  const DOM_Document document = DOM_Document::createDocument();
  TreeFiller filler(*DOM_HandleAccess::TreeOf(document));
  ScanFailure failure;
  if (!scan(ioReader, inName.c_str(), filler, failure))
    throw ZORXMLParseError(inName, failure.line, failure.column, failure.reason);
  filler.EndElement();  // the document's own children
  return document;
}

std::string Message(const std::string& inSource, std::uint64_t inLine, std::uint64_t inColumn,
                    const std::string& inReason) {
  std::string place = inSource;
  if (inLine != 0) place.append(":").append(std::to_string(inLine));
  if (inColumn != 0) place.append(":").append(std::to_string(inColumn));
  return place.append(": ").append(inReason);
}

}  // namespace

DOMParser::DOMParser(XMLValidator*) {}

DOMParser::~DOMParser() = default;

void DOMParser::setDoValidation(bool) {}

void DOMParser::parse(const char* inPath) {
  const std::unique_ptr<ByteReader> reader = OpenFile(inPath);
  document_ = ReadDocument(*reader, inPath);
}

void DOMParser::parse(const InputSource& inSource) {
  const auto* const source = dynamic_cast<const MemorySource*>(&inSource);
  if (source == nullptr) throw ZORXMLParseError("", 0, 0, "a source that this parser cannot read");
  document_ = ReadDocument(*OpenMemory(*source), source->Identifier().ConvertToChar());
}

DOM_Document DOMParser::getDocument() const { return document_; }

ZORXMLParseError::ZORXMLParseError(const std::string& inSource, std::uint64_t inLine,
                                   std::uint64_t inColumn, const std::string& inReason)
    : std::runtime_error(Message(inSource, inLine, inColumn, inReason)),
      source(inSource),
      line(inLine),
      column(inColumn),
      reason(inReason) {}

ZORXMLParseError::~ZORXMLParseError() = default;
