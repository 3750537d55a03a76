// Documents as the bytes of a file.
#ifndef ZOR_XML_WRITING_DOCUMENT_BYTES_H
#define ZOR_XML_WRITING_DOCUMENT_BYTES_H

#include <cstddef>
#include <cstdlib>
#include <memory>
#include <string_view>

#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOMString.h"

/// A buffer of UTF-8, zeroed. It comes from calloc, which maps the pages of a large block only as
/// they are written.
class Utf8Bytes {
 public:
  /// The size for any text of a given length.
  static std::size_t MostOf(std::size_t inLength) { return 4 * inLength + 4; }

  Utf8Bytes() = default;
  /// Raises std::bad_alloc when there is no memory.
  explicit Utf8Bytes(std::size_t inSize);
  void Add(const ZORUnicodeString& inText);
  void Add(std::string_view inUtf8);
  /// Converts a long text in slices that fit the cache, without a second copy of it.
  void Add(std::u16string_view inUnits);
  std::string_view View() const { return {bytes_.get(), count_}; }

 private:
  struct Free {
    void operator()(char* inBytes) const { std::free(inBytes); }
  };
  std::unique_ptr<char, Free> bytes_;
  std::size_t count_ = 0;
};

/// A document as UTF-8: declaration and body, with lines inserted after the first ">", or at the
/// start if there is none.
class DocumentBytes {
 public:
  /// @param inBody kept and read where it lies if it is UTF-8 already and nothing is added to it.
  DocumentBytes(const ZORUnicodeString& inDeclaration, const ZORUnicodeString& inLines,
                const DOMString& inBody);
  std::string_view View() const { return view_; }

 private:
  template <class Unit>
  struct Parts;
  void Join(const Parts<char>& inParts, std::string_view inBody);
  void Join(const Parts<char16_t>& inParts);

  DOMString body_;
  Utf8Bytes joined_;
  std::string_view view_;
};

#endif
