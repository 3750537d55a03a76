#include "xml_writing/DocumentBytes.h"

#include <algorithm>
#include <cstring>
#include <new>
#include <optional>
#include <string>

#include "PlatformAdapter.h"

Utf8Bytes::Utf8Bytes(std::size_t inSize) : bytes_(static_cast<char*>(std::calloc(inSize, 1))) {
  if (bytes_ == nullptr) throw std::bad_alloc();
}

void Utf8Bytes::Add(const ZORUnicodeString& inText) {
  std::size_t count = 0;
  inText.ConvertToUTF8(bytes_.get() + count_, &count);
  count_ += count;
}

void Utf8Bytes::Add(std::string_view inUtf8) {
  std::memcpy(bytes_.get() + count_, inUtf8.data(), inUtf8.size());
  count_ += inUtf8.size();
}

void Utf8Bytes::Add(std::u16string_view inUnits) {
  constexpr std::size_t kSlice = std::size_t{64} * 1024;
  ZORUnicodeString slice;
  while (!inUnits.empty()) {
    std::size_t count = std::min(inUnits.size(), kSlice);
    const bool splitsPair = count < inUnits.size() && (inUnits[count - 1] & 0xFC00) == 0xD800;
    if (splitsPair) --count;
    slice.BuildFromUTF16(inUnits.data(), count);
    Add(slice);
    inUnits.remove_prefix(count);
  }
}

namespace {

void AppendTo(ZORUnicodeString& ioHead, std::u16string_view inUnits) {
  adapter::AppendUnits(ioHead, inUnits);
}
void AppendTo(ZORUnicodeString& ioHead, std::string_view inUtf8) {
  ioHead.Append(ZORUnicodeString(std::string(inUtf8).c_str()));  // XML has no zero characters
}

std::size_t LengthOf(const ZORUnicodeString& inText) {
  return static_cast<std::size_t>(inText.GetLengthInChar());
}

}  // namespace

/// All up to the inserted lines, and what follows them in the body.
template <class Unit>
struct DocumentBytes::Parts {
  Parts(const ZORUnicodeString& inDeclaration, const ZORUnicodeString& inLines,
        std::basic_string_view<Unit> inBody)
      : rest(inBody) {
    const std::u16string_view declaration = adapter::UnitsOf(inDeclaration);
    const std::size_t split = declaration.find(u'>') + 1;  // 0 where there is none
    const std::size_t first = split > 0 ? 0 : inBody.find(Unit{'>'}) + 1;
    AppendTo(head, declaration.substr(0, first > 0 ? declaration.size() : split));
    AppendTo(head, inBody.substr(0, first));
    head.Append(inLines);
    if (first == 0) AppendTo(head, declaration.substr(split));
    rest.remove_prefix(first);
  }

  ZORUnicodeString head;
  std::basic_string_view<Unit> rest;
};

DocumentBytes::DocumentBytes(const ZORUnicodeString& inDeclaration, const ZORUnicodeString& inLines,
                             const DOMString& inBody)
    : body_(inBody) {
  if (const std::optional<std::string_view> utf8 = adapter::Utf8Of(body_))
    Join(Parts<char>(inDeclaration, inLines, *utf8), *utf8);
  else
    Join(Parts<char16_t>(inDeclaration, inLines, adapter::UnitsOf(body_)));
}

void DocumentBytes::Join(const Parts<char>& inParts, std::string_view inBody) {
  Utf8Bytes head(Utf8Bytes::MostOf(LengthOf(inParts.head)));
  head.Add(inParts.head);
  if (inBody.substr(0, inBody.size() - inParts.rest.size()) == head.View()) {
    view_ = inBody;
    return;
  }
  joined_ = Utf8Bytes(head.View().size() + inParts.rest.size() + 1);
  joined_.Add(head.View());
  joined_.Add(inParts.rest);
  view_ = joined_.View();
}

void DocumentBytes::Join(const Parts<char16_t>& inParts) {
  joined_ = Utf8Bytes(Utf8Bytes::MostOf(LengthOf(inParts.head) + inParts.rest.size()));
  joined_.Add(inParts.head);
  joined_.Add(inParts.rest);
  view_ = joined_.View();
}
