#include "platform/xml/DOMString.h"

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <memory>
#include <mutex>
#include <new>
#include <stdexcept>
#include <utility>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "foundation/Utf8.h"

namespace {

// A text that strings own themselves. Counted atomically: such a string may be a constant of the
// process that several threads copy.
struct OwnedText {
  std::atomic<std::uint32_t> handles{1};
  bool isUtf8 = false;
  DOM_Text text;  // of UTF-16; its units follow
};

// A serialised document: large, and mostly taken as UTF-8 by who asked for it.
struct Utf8Text : OwnedText {
  MallocedBytes bytes;
  std::size_t count = 0;
  std::once_flag isWidened;
  std::unique_ptr<char16_t[]> units;
};

OwnedText* OwnedOf(const DOM_Text* inText) {
  char* const text = reinterpret_cast<char*>(const_cast<DOM_Text*>(inText));
  return reinterpret_cast<OwnedText*>(text - offsetof(OwnedText, text));
}

// Null for a text that is kept as UTF-16.
Utf8Text* Utf8Of(const DOM_Text* inText) {
  OwnedText* const owned = OwnedOf(inText);
  return owned->isUtf8 ? static_cast<Utf8Text*>(owned) : nullptr;
}

DOM_Text* NewOwnedText(std::uint32_t inCount) {
  void* const block = std::malloc(sizeof(OwnedText) + inCount * sizeof(char16_t));
  if (block == nullptr) throw std::bad_alloc();
  OwnedText* const owned = new (block) OwnedText;
  owned->text.head = inCount;
  return &owned->text;
}

DOM_Text* OwnedCopy(const ZORUC2Bytes* inUnits, std::size_t inCount) {
  if (inCount > std::numeric_limits<std::uint32_t>::max())
    throw std::length_error("a text is longer than 4,294,967,295 units");
  DOM_Text* const text = NewOwnedText(static_cast<std::uint32_t>(inCount));
  std::copy(inUnits, inUnits + inCount, text->Units());
  return text;
}

void ReleaseOwnedText(const DOM_Text* inText) {
  if (OwnedOf(inText)->handles.fetch_sub(1, std::memory_order_acq_rel) != 1) return;
  if (Utf8Text* const text = Utf8Of(inText))
    delete text;
  else
    std::free(OwnedOf(inText));
}

const char16_t* UnitsOf(Utf8Text& ioText) {
  std::call_once(ioText.isWidened, [&] {
    ioText.units.reset(new char16_t[ioText.count]);
    ZORFoundation::DecodeUtf8({ioText.bytes.get(), ioText.count}, ioText.units.get());
  });
  return ioText.units.get();
}

const char16_t* UnitsOf(const DOM_Text& inOwned) {
  Utf8Text* const text = Utf8Of(&inOwned);
  return text == nullptr ? inOwned.Units() : UnitsOf(*text);
}

}  // namespace

DOMString DOM_HandleAccess::StringOfUtf8(MallocedBytes inBytes, std::size_t inCount,
                                         std::uint32_t inUnits) {
  auto* const text = new Utf8Text;
  text->isUtf8 = true;
  text->text.head = inUnits;
  text->bytes = std::move(inBytes);
  text->count = inCount;
  return DOMString(nullptr, &text->text);
}

DOMString::DOMString() : text_(nullptr), tree_(nullptr) {}

DOMString::DOMString(const char* inNarrow) : DOMString() {
  if (inNarrow == nullptr) return;
  const std::size_t count = std::strlen(inNarrow);
  if (!ZORFoundation::IsAscii({inNarrow, count})) {
    const ZORUnicodeString text(inNarrow);
    text_ = OwnedCopy(text.ConvertToUCChar(), static_cast<std::size_t>(text.GetLengthInChar()));
    return;
  }
  DOM_Text* const text = NewOwnedText(static_cast<std::uint32_t>(count));
  std::copy(inNarrow, inNarrow + count, text->Units());
  text_ = text;
}

DOMString::DOMString(const ZORUC2Bytes* inUnits, unsigned int inCount) : DOMString() {
  if (inUnits != nullptr) text_ = OwnedCopy(inUnits, inCount);
}

DOMString::DOMString(DOM_Tree* inTree, const DOM_Text* inText) : text_(inText), tree_(inTree) {
  if (tree_ != nullptr) tree_->Hold();
}

DOMString::DOMString(const DOMString& inOther) : text_(inOther.text_), tree_(inOther.tree_) {
  if (tree_ != nullptr)
    tree_->Hold();
  else if (text_ != nullptr)
    OwnedOf(text_)->handles.fetch_add(1, std::memory_order_relaxed);
}

DOMString::DOMString(DOMString&& ioOther) noexcept
    : text_(std::exchange(ioOther.text_, nullptr)), tree_(std::exchange(ioOther.tree_, nullptr)) {}

DOMString& DOMString::operator=(DOMString inOther) noexcept {
  std::swap(text_, inOther.text_);
  std::swap(tree_, inOther.tree_);
  return *this;
}

DOMString::~DOMString() {
  if (tree_ != nullptr)
    tree_->Release();
  else if (text_ != nullptr)
    ReleaseOwnedText(text_);
}

bool DOMString::isNull() const { return text_ == nullptr; }

unsigned int DOMString::length() const {
  if (text_ == nullptr) return 0;
  return tree_ == nullptr ? text_->head : text_->Length();
}

const ZORUC2Bytes* DOMString::rawBuffer() const {
  if (length() == 0) return nullptr;
  return tree_ == nullptr ? UnitsOf(*text_) : tree_->Widen(*text_);
}

const char* DOMString::rawUTF8(std::size_t& outCount) const {
  const Utf8Text* const text = text_ == nullptr || tree_ != nullptr ? nullptr : Utf8Of(text_);
  if (text == nullptr) return nullptr;
  outCount = text->count;
  return text->bytes.get();
}

bool DOMString::equals(const DOMString& inOther) const {
  return IsSameText(DOM_HandleAccess::View(*this), DOM_HandleAccess::View(inOther));
}

bool DOMString::equals(const char* inAscii) const {
  return IsSameText(DOM_HandleAccess::View(*this),
                    TextView(inAscii == nullptr ? std::string_view() : inAscii));
}

void DOM_HandleAccess::CopyTo(ZORUnicodeString& outText, TextView inView) {
  if (inView.IsWide())
    outText.BuildFromUTF16(inView.Units().data(), inView.Length());
  else
    outText.BuildFromLatin1(inView.Latin1().data(), inView.Length());
}

ZORUnicodeString DOMString::DOMStringToZORUnicodeString() const {
  ZORUnicodeString text;
  DOM_HandleAccess::CopyTo(text, DOM_HandleAccess::View(*this));
  return text;
}
