// The scanning of before: bytes are decoded to UTF-16, from which Xerces-C's scanner for well-formed
// text reads; what it reports fills the tree.
#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <bit>
#include <cstring>
#include <stdexcept>
#include <unordered_map>
#include <xercesc/framework/XMLErrorCodes.hpp>
#include <xercesc/internal/XMLScanner.hpp>
#include <xercesc/parsers/SAXParser.hpp>
#include <xercesc/sax/HandlerBase.hpp>
#include <xercesc/sax/InputSource.hpp>
#include <xercesc/util/BinInputStream.hpp>
#include <xercesc/util/XMLUni.hpp>

#include "FormerTree.h"
#include "XercesTree.h"
#include "default_platform/xml/full_scanner/ScannerMemory.h"
#include "foundation/Utf8.h"

namespace former {
namespace {

struct OtherDocument : std::runtime_error {
  OtherDocument() : std::runtime_error("no plain document") {}
};

/// How many bytes at the end of a text begin a character without ending it.
std::size_t UnfinishedBytes(std::string_view inText) {
  for (std::size_t count = 1; count <= std::min<std::size_t>(3, inText.size()); ++count) {
    const auto byte = static_cast<unsigned char>(inText[inText.size() - count]);
    if (byte < 0x80) return 0;
    if (byte < 0xC0) continue;
    // The ones at the head of a lead byte count the character's bytes.
    return static_cast<std::size_t>(std::countl_one(byte)) > count ? count : 0;
  }
  return 0;
}

// A block at a time without branches, which compilers turn into vector instructions.
bool HasReplacement(std::u16string_view inText) {
  constexpr std::size_t kBlock = 64;
  while (inText.size() >= kBlock) {
    unsigned int hits = 0;
    for (std::size_t i = 0; i < kBlock; ++i)
      hits |= inText[i] == ZORFoundation::kReplacementCharacter;
    if (hits) return true;
    inText.remove_prefix(kBlock);
  }
  return inText.find(ZORFoundation::kReplacementCharacter) != std::u16string_view::npos;
}

/// The UTF-8 text of a file as UTF-16.
class Utf16Stream : public xercesc::BinInputStream {
 public:
  explicit Utf16Stream(int inFile) : file_(inFile), bytes_(new char[kMaxBytes]) {}
  XMLFilePos curPos() const override { return bytesRead_; }
  XMLSize_t readBytes(XMLByte* const outBytes, const XMLSize_t inMax) override {
    const XMLSize_t count =
        Read(reinterpret_cast<char16_t*>(outBytes), inMax / sizeof(char16_t)) * sizeof(char16_t);
    bytesRead_ += count;
    return count;
  }
  const XMLCh* getContentType() const override { return nullptr; }

 private:
  static constexpr std::size_t kMaxBytes = std::size_t{24} * 1024;  // of one read

  std::size_t Read(char16_t* outUnits, std::size_t inMax) {
    const std::string_view bytes = NextBytes(std::min(inMax, kMaxBytes));
    if (bytes.empty()) return 0;
    const std::size_t count = ZORFoundation::DecodeUtf8(bytes, outUnits);
    if (HasReplacement({outUnits, count})) throw OtherDocument();
    return count;
  }
  // Whole characters only; the start of one whose end has not been read stays for the next time.
  std::string_view NextBytes(std::size_t inMax) {
    std::size_t count = filled_ - used_;
    std::memmove(bytes_.get(), bytes_.get() + used_, count);
    std::size_t unfinished = 0;
    do {
      const ssize_t added = read(file_, bytes_.get() + count, inMax - count);
      if (added < 0 || (added == 0 && count != 0)) throw OtherDocument();
      count += static_cast<std::size_t>(added);
      unfinished = UnfinishedBytes({bytes_.get(), count});
    } while (count != 0 && unfinished == count);
    filled_ = count;
    used_ = count - unfinished;
    return {bytes_.get(), used_};
  }

  int file_;
  std::unique_ptr<char[]> bytes_;
  std::size_t filled_ = 0;
  std::size_t used_ = 0;
  XMLFilePos bytesRead_ = 0;
};

class Utf16Entity : public xercesc::InputSource {
 public:
  explicit Utf16Entity(int inFile) : file_(inFile) {
    setEncoding(std::endian::native == std::endian::little
                    ? xercesc::XMLUni::fgUTF16LEncodingString
                    : xercesc::XMLUni::fgUTF16BEncodingString);
  }
  xercesc::BinInputStream* makeStream() const override { return new Utf16Stream(file_); }

 private:
  int file_;
};

std::u16string_view View(const char16_t* inText) {
  return inText == nullptr ? std::u16string_view() : std::u16string_view(inText);
}

bool IsSame(std::u16string_view inKnown, const char16_t* inText) {
  for (const char16_t unit : inKnown)
    if (*inText++ != unit) return false;
  return *inText == 0;
}

class Scanner : private xercesc::SAXParser {
 public:
  Scanner(ScannerMemory& ioMemory, Tree& ioTree)
      : xercesc::SAXParser(nullptr, &ioMemory), tree_(ioTree) {
    useScanner(xercesc::XMLUni::fgWFXMLScanner);
    setValidationScheme(Val_Never);
    setDoNamespaces(false);
    setDoSchema(false);
    setLoadExternalDTD(false);
    setLoadSchema(false);
    setDisableDefaultEntityResolution(true);
    setExitOnFirstFatalError(true);
    setDocumentHandler(&unused_);
    setErrorHandler(&unused_);
    ioMemory.SetPlace(getScanner().getLocator());
  }
  void Scan(int inFile) { parse(Utf16Entity(inFile)); }

 private:
  using AttributeList = xercesc::RefVectorOf<xercesc::XMLAttr>;
  struct AttributeShape {
    std::uint32_t name = 0;
    TextSeries values;
  };
  struct ElementShape {
    std::uint32_t name = 0;
    std::vector<AttributeShape> attributes;
  };
  struct RecentShape {
    const xercesc::XMLElementDecl* kind = nullptr;
    ElementShape* shape = nullptr;
  };

  void startElement(const xercesc::XMLElementDecl& inElement, const unsigned int,
                    const XMLCh* const, const AttributeList& inAttributes, const XMLSize_t inCount,
                    const bool inIsEmpty, const bool) override {
    FlushText();
    ElementShape& shape = ShapeOf(inElement);
    const std::uint32_t element = tree_.Append(current_, kElement, shape.name, nullptr);
    AddAttributes(element, shape, inAttributes, inCount);
    if (!inIsEmpty) current_ = element;
  }
  void endElement(const xercesc::XMLElementDecl&, const unsigned int, const bool,
                  const XMLCh* const) override {
    FlushText();
    current_ = tree_.nodes[current_].parent;
  }
  void docCharacters(const XMLCh* const inText, const XMLSize_t inCount,
                     const bool inIsSection) override {
    if (inIsSection) throw OtherDocument();
    if (current_ != 1) text_.append(inText, inCount);
  }
  void docComment(const XMLCh* const inText) override {
    FlushText();
    tree_.Append(current_, kOther, 0, tree_.texts.Add(View(inText)));
  }
  void docPI(const XMLCh* const inTarget, const XMLCh* const inData) override {
    FlushText();
    tree_.Append(current_, kOther, tree_.names.Intern(View(inTarget)),
                 tree_.texts.Add(View(inData)));
  }
  void error(const unsigned int, const XMLCh* const, const ErrTypes inType, const XMLCh* const,
             const XMLCh* const, const XMLCh* const, const XMLFileLoc, const XMLFileLoc) override {
    if (inType == ErrType_Fatal) throw OtherDocument();
  }

  ElementShape& ShapeOf(const xercesc::XMLElementDecl& inElement) {
    const auto place = reinterpret_cast<std::uintptr_t>(&inElement);
    RecentShape& recent = recent_[((place >> 5) ^ (place >> 11)) % recent_.size()];
    if (recent.kind == &inElement) return *recent.shape;
    ElementShape& shape = shapes_[&inElement];
    if (shape.name == 0) shape.name = tree_.names.Intern(View(inElement.getFullName()));
    recent = {&inElement, &shape};
    return shape;
  }
  void AddAttributes(std::uint32_t inElement, ElementShape& ioShape,
                     const AttributeList& inAttributes, XMLSize_t inCount) {
    if (ioShape.attributes.size() < inCount) ioShape.attributes.resize(inCount);
    std::uint32_t last = 0;
    for (XMLSize_t position = 0; position < inCount; ++position) {
      const xercesc::XMLAttr& attribute = *inAttributes.elementAt(position);
      AttributeShape& shape = ioShape.attributes[position];
      if (shape.name == 0 || !IsSame(tree_.names.TextOf(shape.name)->View(), attribute.getName()))
        shape = {tree_.names.Intern(View(attribute.getName())), {}};
      const std::u16string_view value = View(attribute.getValue());
      last =
          tree_.AppendAttribute(inElement, last, shape.name, tree_.texts.Add(value, shape.values));
    }
  }
  void FlushText() {
    if (text_.empty()) return;
    tree_.Append(current_, kText, 0, tree_.texts.Add(text_));
    text_.clear();
  }

  Tree& tree_;
  xercesc::HandlerBase unused_;
  std::uint32_t current_ = 1;
  std::u16string text_;
  std::unordered_map<const xercesc::XMLElementDecl*, ElementShape> shapes_;
  std::array<RecentShape, 64> recent_;
};

}  // namespace

std::unique_ptr<Tree> Load(const std::string& inPath) {
  InitializeXerces();
  const int file = open(inPath.c_str(), O_RDONLY | O_CLOEXEC);
  if (file < 0) throw std::runtime_error("cannot open " + inPath);
  auto tree = std::make_unique<Tree>();
  ScannerMemory memory;
  Scanner(memory, *tree).Scan(file);
  close(file);
  return tree;
}

}  // namespace former
