#include "platform/system/ZORUnicodeString.h"

#include <algorithm>
#include <cstring>
#include <string_view>
#include <utility>

#include "default_platform/xml/Latin1.h"
#include "foundation/Utf8.h"
#include "platform/system/ZORString.h"
#include "platform/system/ZORToken.h"

namespace {

constexpr std::size_t kNotFound = std::u16string_view::npos;

// The first position from inFrom on that holds a unit. Whole blocks are tested without a branch for
// each unit, which compilers turn into vector instructions.
std::size_t FindUnit(std::u16string_view inText, char16_t inUnit, std::size_t inFrom) {
  constexpr std::size_t kBlock = 16;
  for (; inFrom + kBlock <= inText.size(); inFrom += kBlock) {
    const char16_t* const block = inText.data() + inFrom;
    unsigned hits = 0;
    for (std::size_t i = 0; i < kBlock; ++i) hits |= block[i] == inUnit;
    if (hits) break;
  }
  for (; inFrom < inText.size(); ++inFrom)
    if (inText[inFrom] == inUnit) return inFrom;
  return kNotFound;
}

std::size_t FindText(std::u16string_view inText, std::u16string_view inSought, std::size_t inFrom) {
  if (inSought.empty() || inText.size() < inSought.size()) return kNotFound;
  const std::u16string_view starts = inText.substr(0, inText.size() - inSought.size() + 1);
  while ((inFrom = FindUnit(starts, inSought[0], inFrom)) != kNotFound) {
    if (std::memcmp(inText.data() + inFrom, inSought.data(), inSought.size() * sizeof(char16_t)) ==
        0)
      return inFrom;
    ++inFrom;
  }
  return kNotFound;
}

int Position(std::size_t inFound) { return inFound == kNotFound ? -1 : static_cast<int>(inFound); }

void CopyUnits(std::u16string_view inFrom, char16_t* outTo) {
  if (!inFrom.empty()) std::memmove(outTo, inFrom.data(), inFrom.size() * sizeof(char16_t));
}

}  // namespace

// ---- code units

// All of a short text's room is copied: a count that the compiler knows takes no call.
inline void ZORUnicodeString::Units::TakeFrom(Units& ioOther) noexcept {
  size_ = ioOther.size_;
  if (ioOther.data_ == ioOther.inline_) {
    std::memcpy(inline_, ioOther.inline_, sizeof(inline_));
  } else {
    data_ = ioOther.data_;
    capacity_ = ioOther.capacity_;
    ioOther.data_ = ioOther.inline_;
    ioOther.capacity_ = kInline;
  }
  ioOther.Cut(0);
}

inline void ZORUnicodeString::Units::Release() noexcept {
  if (data_ == inline_) return;
  delete[] data_;
  data_ = inline_;
  capacity_ = kInline;
}

inline ZORUnicodeString::Units::Units(const Units& inOther) {
  if (inOther.data_ == inOther.inline_) {
    std::memcpy(inline_, inOther.inline_, sizeof(inline_));
    size_ = inOther.size_;
  } else {
    Assign(inOther);
  }
}

inline ZORUnicodeString::Units::Units(Units&& ioOther) noexcept { TakeFrom(ioOther); }

inline ZORUnicodeString::Units& ZORUnicodeString::Units::operator=(const Units& inOther) {
  Assign(inOther);
  return *this;
}

inline ZORUnicodeString::Units& ZORUnicodeString::Units::operator=(Units&& ioOther) noexcept {
  if (this == &ioOther) return *this;
  Release();
  TakeFrom(ioOther);
  return *this;
}

inline ZORUnicodeString::Units::~Units() { Release(); }

inline void ZORUnicodeString::Units::Cut(std::size_t inCount) {
  size_ = inCount;
  data_[inCount] = u'\0';
}

inline char16_t* ZORUnicodeString::Units::Renew(std::size_t inCount) {
  if (inCount > capacity_) {
    char16_t* const larger = new char16_t[inCount + 1];
    Release();
    data_ = larger;
    capacity_ = inCount;
  }
  Cut(inCount);
  return data_;
}

void ZORUnicodeString::Units::Grow(std::size_t inCapacity) {
  char16_t* const larger = new char16_t[inCapacity + 1];
  std::memcpy(larger, data_, (size_ + 1) * sizeof(char16_t));
  Release();
  data_ = larger;
  capacity_ = inCapacity;
}

inline void ZORUnicodeString::Units::Assign(std::u16string_view inText) {
  if (inText.size() > capacity_) Renew(inText.size());  // no part of this text: it is longer
  CopyUnits(inText, data_);
  Cut(inText.size());
}

inline void ZORUnicodeString::Units::Append(std::u16string_view inTail) {
  const std::size_t size = size_ + inTail.size();
  if (size > capacity_) {
    Units sum;
    sum.Renew(std::max(size, 2 * capacity_));
    CopyUnits(*this, sum.data_);
    CopyUnits(inTail, sum.data_ + size_);
    *this = std::move(sum);
  } else {
    CopyUnits(inTail, data_ + size_);
  }
  Cut(size);
}

void ZORUnicodeString::Units::Replace(std::size_t inPosition, std::size_t inCount,
                                      std::u16string_view inText) {
  if (inCount == inText.size()) return CopyUnits(inText, data_ + inPosition);
  const std::u16string_view all = *this;
  Units replaced;
  replaced.Reserve(size_ - inCount + inText.size());
  replaced.Append(all.substr(0, inPosition));
  replaced.Append(inText);
  replaced.Append(all.substr(inPosition + inCount));
  *this = std::move(replaced);
}

void ZORUnicodeString::Units::Reserve(std::size_t inCount) {
  if (inCount > capacity_) Grow(inCount);
}

// ---- building

ZORUnicodeString::ZORUnicodeString() = default;

ZORUnicodeString::ZORUnicodeString(const char* inNarrow) {
  if (inNarrow) BuildFromUTF8(inNarrow, std::strlen(inNarrow));
}

ZORUnicodeString::ZORUnicodeString(const ZORString& inNarrow) {
  BuildFromUTF8(inNarrow.CastToCharPtr(), static_cast<std::size_t>(inNarrow.GetLengthInChar()));
}

// The narrow form is not copied: it is made again where it is asked for.
ZORUnicodeString::ZORUnicodeString(const ZORUnicodeString& inOther) : units_(inOther.units_) {}

ZORUnicodeString::ZORUnicodeString(ZORUnicodeString&& ioOther) noexcept
    : units_(std::move(ioOther.units_)), narrow_(std::move(ioOther.narrow_)) {}

ZORUnicodeString& ZORUnicodeString::operator=(const ZORUnicodeString& inOther) {
  if (this == &inOther) return *this;
  units_ = inOther.units_;
  narrow_.reset();
  return *this;
}

ZORUnicodeString& ZORUnicodeString::operator=(ZORUnicodeString&& ioOther) noexcept {
  if (this == &ioOther) return *this;
  units_ = std::move(ioOther.units_);
  narrow_ = std::move(ioOther.narrow_);
  return *this;
}

ZORUnicodeString::~ZORUnicodeString() = default;

void ZORUnicodeString::BuildFromUTF16(const ZORUC2Bytes* inUnits, std::size_t inCount) {
  units_.Assign(inUnits ? std::u16string_view(inUnits, inCount) : std::u16string_view());
  narrow_.reset();
}

void ZORUnicodeString::BuildFromUTF8(const char* inBytes, std::size_t inCount) {
  // The bytes may be this string's own narrow form, so that is let go last.
  char16_t* const units = units_.Renew(inBytes ? inCount : 0);
  if (!units_.empty())
    units_.Cut(ZORFoundation::DecodeUtf8(std::string_view(inBytes, inCount), units));
  narrow_.reset();
}

void ZORUnicodeString::BuildFromLatin1(const char* inBytes, std::size_t inCount) {
  WidenLatin1(std::string_view(inBytes, inCount), units_.Renew(inCount));
  narrow_.reset();
}

ZORUnicodeString& ZORUnicodeString::Append(const ZORUnicodeString& inTail) {
  units_.Append(inTail.units_);
  narrow_.reset();
  return *this;
}

ZORUnicodeString& ZORUnicodeString::operator+=(const ZORUnicodeString& inTail) {
  return Append(inTail);
}

ZORUnicodeString& ZORUnicodeString::operator+=(ZORUnicodeChar inTail) {
  const char16_t unit = inTail.ConvertToUC2Bytes();
  units_.Append(std::u16string_view(&unit, 1));
  narrow_.reset();
  return *this;
}

ZORUnicodeString& ZORUnicodeString::AppendUTF16(const ZORUC2Bytes* inUnits, std::size_t inCount) {
  if (inUnits) units_.Append(std::u16string_view(inUnits, inCount));
  narrow_.reset();
  return *this;
}

void ZORUnicodeString::Reserve(std::size_t inCount) { units_.Reserve(inCount); }

ZORUnicodeString& ZORUnicodeString::Insert(int inPosition, const ZORUnicodeString& inText) {
  units_.Replace(static_cast<std::size_t>(std::clamp(inPosition, 0, GetLengthInChar())), 0,
                 inText.units_);
  narrow_.reset();
  return *this;
}

ZORUnicodeString ZORUnicodeString::Strip(int inMode, ZORUnicodeChar inCharacter) const {
  const bool leading = inMode == kStripLeading || inMode == kStripBoth;
  const bool trailing = inMode == kStripTrailing || inMode == kStripBoth;
  const char16_t unit = inCharacter.ConvertToUC2Bytes();
  std::size_t begin = 0;
  std::size_t end = units_.size();
  while (leading && begin < end && units_[begin] == unit) ++begin;
  while (trailing && end > begin && units_[end - 1] == unit) --end;
  ZORUnicodeString stripped;
  stripped.units_.Assign(std::u16string_view(units_).substr(begin, end - begin));
  return stripped;
}

int ZORUnicodeString::ReplaceSubString(const ZORUnicodeString& inOld,
                                       const ZORUnicodeString& inNew) {
  const std::size_t found = FindText(units_, inOld.units_, 0);
  if (found == kNotFound) return -1;
  units_.Replace(found, inOld.units_.size(), inNew.units_);
  narrow_.reset();
  return Position(found);
}

int ZORUnicodeString::GetLengthInChar() const { return static_cast<int>(units_.size()); }

int ZORUnicodeString::SearchSubString(const ZORUnicodeString& inText, int inStart,
                                      int inMode) const {
  if (inStart < 0 || inStart >= GetLengthInChar() || inText.units_.empty()) return -1;
  const std::size_t start = static_cast<std::size_t>(inStart);
  if (inMode == kSearchForward) return Position(FindText(units_, inText.units_, start));
  if (inMode == kSearchBackward)
    return Position(std::u16string_view(units_).rfind(inText.units_, start));
  return -1;
}

ZORUnicodeString ZORUnicodeString::SubString(int inStart, int inLength) const {
  ZORUnicodeString part;
  if (inStart < 0 || inStart >= GetLengthInChar()) return part;
  const std::size_t length = inLength < 0 ? kNotFound : static_cast<std::size_t>(inLength);
  part.units_.Assign(std::u16string_view(units_).substr(static_cast<std::size_t>(inStart), length));
  return part;
}

const ZORUC2Bytes* ZORUnicodeString::ConvertToUCChar() const {
  return units_.empty() ? nullptr : units_.data();
}

const char* ZORUnicodeString::ConvertToChar() const {
  if (units_.empty()) return "";
  if (!narrow_) {
    auto narrow = std::make_unique<std::string>(ZORFoundation::Utf8Length(units_), '\0');
    ZORFoundation::EncodeUtf8(units_, narrow->data());
    narrow_ = std::move(narrow);
  }
  return narrow_->c_str();
}

ZORString ZORUnicodeString::ConvertToString() const {
  const char* const narrow = ConvertToChar();
  return ZORString(narrow, narrow_ ? static_cast<int>(narrow_->size()) : 0);
}

HRESULT ZORUnicodeString::ConvertToUTF8(char* outBytes, std::size_t* outCount) const {
  if (!outBytes || !outCount) return E_INVALIDARG;
  *outCount = ZORFoundation::EncodeUtf8(units_, outBytes);
  return S_OK;
}

HRESULT ZORUnicodeString::ConvertToWChar(wchar_t* outWide) const {
  if (!outWide) return E_INVALIDARG;
  if constexpr (sizeof(wchar_t) == sizeof(char16_t)) {
    for (std::size_t position = 0; position < units_.size();) {
      const std::size_t begin = position;
      const char32_t character = ZORFoundation::NextCharacter(units_, position);
      if (position == begin + 2) *outWide++ = static_cast<wchar_t>(units_[begin]);
      *outWide++ = static_cast<wchar_t>(position == begin + 2 ? units_[begin + 1] : character);
    }
  } else {
    for (std::size_t position = 0; position < units_.size();)
      *outWide++ = static_cast<wchar_t>(ZORFoundation::NextCharacter(units_, position));
  }
  *outWide = L'\0';
  return S_OK;
}

bool operator==(const ZORUnicodeString& inA, const ZORUnicodeString& inB) {
  const std::u16string_view a = inA.units_, b = inB.units_;
  return a.size() == b.size() && std::memcmp(a.data(), b.data(), a.size() * sizeof(char16_t)) == 0;
}

bool operator!=(const ZORUnicodeString& inA, const ZORUnicodeString& inB) { return !(inA == inB); }

bool operator==(const ZORUnicodeString& inA, const char* inB) {
  if (!inB) return inA.units_.empty();
  for (std::size_t i = 0;; ++i) {
    const unsigned char byte = static_cast<unsigned char>(inB[i]);
    if (byte >= 0x80) return inA == ZORUnicodeString(inB);
    if (byte == 0) return i == inA.units_.size();
    if (i == inA.units_.size() || inA.units_[i] != byte) return false;
  }
}

bool operator!=(const ZORUnicodeString& inA, const char* inB) { return !(inA == inB); }

ZORUnicodeString operator+(const ZORUnicodeString& inA, const ZORUnicodeString& inB) {
  ZORUnicodeString sum;
  sum.units_.Reserve(inA.units_.size() + inB.units_.size());
  sum.units_.Append(inA.units_);
  sum.units_.Append(inB.units_);
  return sum;
}

ZORUnicodeString operator+(const ZORUnicodeString& inA, const char* inB) {
  return inA + ZORUnicodeString(inB);
}

namespace {

std::u16string_view UnitsOf(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

}  // namespace

ZORToken::ZORToken(const ZORUnicodeString& inText) : text_(inText) {}

ZORUnicodeString ZORToken::GetNextToken(const ZORUnicodeString& inSeparators) {
  const std::u16string_view text = UnitsOf(text_);
  const std::u16string_view separators = UnitsOf(inSeparators);
  const std::size_t begin = std::min(
      text.find_first_not_of(separators, static_cast<std::size_t>(position_)), text.size());
  const std::size_t end = std::min(text.find_first_of(separators, begin), text.size());
  position_ = static_cast<int>(end);
  ZORUnicodeString token;
  if (begin < end) token.BuildFromUTF16(text.data() + begin, end - begin);
  return token;
}

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
