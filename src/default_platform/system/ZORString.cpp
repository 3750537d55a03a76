#include "platform/system/ZORString.h"

#include <utility>

ZORString::ZORString() = default;

ZORString::ZORString(const char* inText) : text_(inText ? inText : "") {}

ZORString::ZORString(const char* inText, int inLength) {
  if (inText && inLength > 0) text_.assign(inText, static_cast<std::size_t>(inLength));
}

ZORString::ZORString(const ZORString& inOther) = default;

ZORString::ZORString(ZORString&& ioOther) noexcept : text_(std::move(ioOther.text_)) {
  ioOther.text_.clear();
}

ZORString& ZORString::operator=(const ZORString& inOther) = default;

ZORString& ZORString::operator=(ZORString&& ioOther) noexcept {
  if (this == &ioOther) return *this;
  text_ = std::move(ioOther.text_);
  ioOther.text_.clear();
  return *this;
}

ZORString::~ZORString() = default;

const char* ZORString::CastToCharPtr() const { return text_.c_str(); }

int ZORString::GetLengthInChar() const { return static_cast<int>(text_.size()); }

ZORChar ZORString::operator[](int inPosition) const {
  if (inPosition < 0 || inPosition >= GetLengthInChar()) return ZORChar();
  return ZORChar(text_[static_cast<std::size_t>(inPosition)]);
}

ZORString& ZORString::Append(const ZORString& inTail) {
  text_ += inTail.text_;
  return *this;
}

bool operator==(const ZORString& inA, const ZORString& inB) { return inA.text_ == inB.text_; }
bool operator!=(const ZORString& inA, const ZORString& inB) { return !(inA == inB); }
