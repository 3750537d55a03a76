#include "platform/xml/DOMString.h"

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <new>
#include <stdexcept>
#include <utility>

#include "default_platform/xml/DOM_HandleAccess.h"
#include "foundation/Utf8.h"

namespace {

// The head of a text that strings own themselves. Counted atomically: such a string may be a
// constant of the process that several threads copy.
struct OwnedHead {
  std::atomic<std::uint32_t> handles;
};

std::size_t OwnedBytes(std::uint32_t inCount) {
  return sizeof(OwnedHead) + sizeof(DOM_Text) + inCount * sizeof(char16_t);
}

OwnedHead* HeadOf(const DOM_Text* inText) {
  return reinterpret_cast<OwnedHead*>(const_cast<DOM_Text*>(inText)) - 1;
}

DOM_Text* OwnedCopy(const ZORUC2Bytes* inUnits, std::size_t inCount) {
  if (inCount > std::numeric_limits<std::uint32_t>::max())
    throw std::length_error("a text is longer than 4,294,967,295 units");
  DOM_Text* const text = NewOwnedText(static_cast<std::uint32_t>(inCount));
  std::copy(inUnits, inUnits + inCount, text->Units());
  return text;
}

}  // namespace

DOM_Text* NewOwnedText(std::uint32_t inCount) {
  void* const block = std::malloc(OwnedBytes(inCount));
  if (block == nullptr) throw std::bad_alloc();
  OwnedHead* const head = new (block) OwnedHead{1};
  return new (head + 1) DOM_Text{inCount};
}

DOM_Text* ResizeOwnedText(DOM_Text* inOwned, std::uint32_t inCount) {
  void* const block = std::realloc(HeadOf(inOwned), OwnedBytes(inCount));
  if (block == nullptr) throw std::bad_alloc();
  DOM_Text* const text = reinterpret_cast<DOM_Text*>(static_cast<OwnedHead*>(block) + 1);
  text->head = inCount;
  return text;
}

void ReleaseOwnedText(const DOM_Text* inOwned) {
  OwnedHead* const head = HeadOf(inOwned);
  if (head->handles.fetch_sub(1, std::memory_order_acq_rel) == 1) std::free(head);
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
    HeadOf(text_)->handles.fetch_add(1, std::memory_order_relaxed);
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
  return tree_ == nullptr ? text_->Units() : tree_->Widen(*text_);
}

bool DOMString::equals(const DOMString& inOther) const {
  return IsSameText(DOM_HandleAccess::View(*this), DOM_HandleAccess::View(inOther));
}

bool DOMString::equals(const char* inAscii) const {
  return IsSameText(DOM_HandleAccess::View(*this),
                    TextView(inAscii == nullptr ? std::string_view() : inAscii));
}

ZORUnicodeString DOMString::DOMStringToZORUnicodeString() const {
  constexpr std::size_t kShort = 256;
  ZORUnicodeString text;
  const TextView view = DOM_HandleAccess::View(*this);
  if (view.IsWide()) {
    text.BuildFromUTF16(view.Units().data(), view.Length());
  } else if (view.Length() <= kShort) {
    char16_t units[kShort];
    view.CopyTo(units);
    text.BuildFromUTF16(units, view.Length());
  } else {
    text.BuildFromUTF16(view.ToUtf16().data(), view.Length());
  }
  return text;
}
