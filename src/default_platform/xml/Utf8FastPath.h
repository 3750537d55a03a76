// The fast path: UTF-8 documents without a document type, which nearly all are.
#ifndef ZOR_DEFAULT_PLATFORM_XML_UTF8FASTPATH_H
#define ZOR_DEFAULT_PLATFORM_XML_UTF8FASTPATH_H

#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/xml/ByteSearch.h"
#include "default_platform/xml/ByteSource.h"
#include "default_platform/xml/DOM_Tree.h"

/// Raised for a document that the fast path does not read: one in another encoding or with a
/// document type, one past its limits, and any that is not well-formed.
struct NeedsFullScanner {};

/// Reads a document in one pass into a tree, checking all that XML 1.0 asks of well-formed ones.
/// The tree is that of the full scanner. One object reads one document.
class Utf8FastPath {
 public:
  /// @param ioTree a new one; of no use when NeedsFullScanner is raised.
  Utf8FastPath(ByteReader& ioReader, DOM_Tree& ioTree);
  /// Raises NeedsFullScanner, and ZORXMLParseError when the bytes cannot be read.
  void Read();

 private:
  struct Name;
  /// An attribute of the last element of a kind: the next one very likely has the same.
  struct AttributeShape {
    Name* name = nullptr;
    TextSeries values;
  };
  struct Name {
    DOM_Tree::Name number;
    std::string utf8;
    NameStart start;  // of utf8
    std::uint64_t hash;
    std::uint64_t element = 0;  // the last one that had an attribute of this name
    std::vector<AttributeShape> attributes;
    // What followed the last time: the next time it very likely does again.
    Name* firstChild = nullptr;   // the first element in an element of this name
    Name* nextSibling = nullptr;  // the next element after one of this name
    TextSeries firstTexts, nextTexts;
  };
  struct OpenElement {
    DOM_Tree::Node node;
    DOM_Tree::Node lastChild;
    Name* name;
    Name* lastElement;  // among the children

    Name*& NextElement() { return lastElement ? lastElement->nextSibling : name->firstChild; }
    TextSeries& NextTexts() { return lastElement ? lastElement->nextTexts : name->firstTexts; }
  };
  /// Raised where the bytes read so far end.
  struct EndOfWindow {};

  // Bytes
  void ReadMore();
  [[noreturn]] void Stop(const char* inPlace) const;

  // Constructs, each from the current place to its end; nothing is kept of one that is not whole
  void ReadDeclaration();
  void ReadContent();
  void ReadOne();
  void ReadMarkup();
  void ReadStartTag();
  const char* ReadAttributes(const char* inPlace, Name& ioElement);
  void ReadEndTag();
  void ReadText();
  void ReadComment();
  void ReadSection();
  void ReadInstruction();
  void SkipBlanks();

  // Parts of these; each returns where it ends
  const char* NameEnd(const char* inPlace) const;
  inline bool IsNext(const char* inPlace, const Name& inName) const;
  Name& ReadElementName(const char*& ioPlace);
  Name& FindName(const char* inPlace, const char* inEnd);
  void GrowNames();
  inline TextRef ReadValue(const char*& ioPlace, TextSeries& ioSeries);
  TextRef ReadSpecialValue(const char*& ioPlace, const char* inSpecial);
  const char* AppendCharacter(const char* inPlace);
  const char* AppendReference(const char* inPlace);
  void AppendAscii(const char* inPlace, const char* inEnd);
  void AppendNode(int inKind, DOM_Tree::Name inName, TextRef inText);

  ByteReader& reader_;
  DOM_Tree& tree_;
  ShortByteSearch search_;

  std::unique_ptr<char[]> window_;
  std::size_t windowBytes_;
  const char* at_ = nullptr;   // where the construct that is read begins
  const char* end_ = nullptr;  // of the bytes read so far, where a 0 is
  bool isAllRead_ = false;

  std::vector<std::unique_ptr<Name>> names_;
  std::vector<Name*> slots_;  // open addressing; a power of two
  std::vector<OpenElement> open_;
  std::vector<DOM_Tree::AttributeRecord> attributes_;
  std::uint64_t elements_ = 0;
  bool hasRoot_ = false;
  std::u16string text_;  // what is not plain ASCII
};

#endif
