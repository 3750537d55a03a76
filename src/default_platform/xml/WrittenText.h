// The texts that a tree is written into.
#ifndef ZOR_DEFAULT_PLATFORM_XML_WRITTENTEXT_H
#define ZOR_DEFAULT_PLATFORM_XML_WRITTENTEXT_H

#include <algorithm>
#include <cstddef>
#include <limits>
#include <string>
#include <utility>
#include <vector>

#include "default_platform/system/Utf8.h"
#include "default_platform/xml/DOM_HandleAccess.h"

/// Raised while writing, for what no XML text can carry.
struct NotWritable {};

/// One UTF-16 text that grows; becomes a string without being copied.
class WideText {
 public:
  using Unit = char16_t;

  WideText() : text_(NewOwnedText(kFirst)), at_(text_->Units()), end_(at_ + kFirst) {}
  ~WideText() {
    if (text_ != nullptr) ReleaseOwnedText(text_);
  }
  WideText(const WideText&) = delete;
  WideText& operator=(const WideText&) = delete;

  /// Makes room for inCount more UTF-16 units.
  Unit* Reserve(std::size_t inCount) {
    if (static_cast<std::size_t>(end_ - at_) < inCount) Grow(inCount);
    return at_;
  }
  void SetEnd(Unit* inEnd) { at_ = inEnd; }
  /// @return behind the character.
  static Unit* Put(char32_t inCharacter, Unit* outUnits) {
    if (inCharacter >= 0x10000) {
      *outUnits++ = static_cast<Unit>(0xD7C0 + (inCharacter >> 10));
      inCharacter = 0xDC00 + (inCharacter & 0x3FF);
    }
    *outUnits = static_cast<Unit>(inCharacter);
    return outUnits + 1;
  }
  DOMString Finish() {
    DOM_Text* const text = ResizeOwnedText(text_, static_cast<std::uint32_t>(Used()));
    text_ = nullptr;
    return DOM_HandleAccess::Adopt(text);
  }

 private:
  static constexpr std::uint32_t kFirst = 1024;
  static constexpr std::size_t kMost = std::numeric_limits<std::uint32_t>::max();

  std::size_t Used() const { return static_cast<std::size_t>(at_ - text_->Units()); }
  void Grow(std::size_t inCount) {
    const std::size_t used = Used();
    if (inCount > kMost - used) throw NotWritable();
    const std::size_t room = std::min(kMost, std::max(used + inCount, used * 2));
    text_ = ResizeOwnedText(text_, static_cast<std::uint32_t>(room));
    at_ = text_->Units() + used;
    end_ = text_->Units() + room;
  }

  DOM_Text* text_;
  Unit* at_;
  Unit* end_;
};

/// UTF-8 text in parts, which are never moved.
class Utf8Parts {
 public:
  using Unit = char;

  Unit* Reserve(std::size_t inCount) {
    const std::size_t bytes = inCount * kMostBytesOfUnit;
    if (static_cast<std::size_t>(end_ - at_) < bytes) StartPart(bytes);
    return at_;
  }
  void SetEnd(Unit* inEnd) { at_ = inEnd; }
  static Unit* Put(char32_t inCharacter, Unit* outBytes) {
    return ZORDefault::EncodeCharacter(inCharacter, outBytes);
  }
  std::vector<std::string> Finish() {
    EndPart();
    return std::move(parts_);
  }

 private:
  static constexpr std::size_t kMostBytesOfUnit = 3;
  static constexpr std::size_t kPart = std::size_t{1024} * 1024;
  static constexpr std::size_t kFirstPart = std::size_t{4} * 1024;

  void EndPart() {
    if (!parts_.empty()) parts_.back().resize(static_cast<std::size_t>(at_ - parts_.back().data()));
  }
  void StartPart(std::size_t inBytes) {
    EndPart();
    parts_.emplace_back(std::max(parts_.empty() ? kFirstPart : kPart, inBytes), '\0');
    at_ = parts_.back().data();
    end_ = at_ + parts_.back().size();
  }

  std::vector<std::string> parts_;
  Unit* at_ = nullptr;
  Unit* end_ = nullptr;
};

#endif
