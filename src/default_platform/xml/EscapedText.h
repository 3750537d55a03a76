// The text of a serialised node.
#ifndef ZOR_DEFAULT_PLATFORM_XML_ESCAPEDTEXT_H
#define ZOR_DEFAULT_PLATFORM_XML_ESCAPEDTEXT_H

#include <array>
#include <cstddef>
#include <cstring>
#include <string_view>

#include "default_platform/xml/DOM_HandleAccess.h"

/// Raised for what no XML text can carry.
struct NotSerialisable {};

/// How a code unit is written.
enum class Treatment : unsigned char { kCopy, kEscape, kRefuse };

/// The treatment of the ASCII units in one context. Beyond ASCII all contexts are alike.
using AsciiTreatments = std::array<Treatment, 128>;

constexpr AsciiTreatments Treatments(std::u16string_view inEscaped, bool inRefusesReturn) {
  AsciiTreatments treatments{};
  for (char16_t unit = 0; unit < 0x20; ++unit) treatments[unit] = Treatment::kRefuse;
  for (const char16_t unit : {u'\t', u'\n', u'\r'}) treatments[unit] = Treatment::kCopy;
  if (inRefusesReturn) treatments[u'\r'] = Treatment::kRefuse;
  for (const char16_t unit : inEscaped) treatments[unit] = Treatment::kEscape;
  return treatments;
}

/// "&amp;" or the like.
std::string_view EscapeOf(char16_t inUnit);

/// UTF-8 that grows; becomes a string without being copied. Its code units are counted too: a
/// string has at most 4,294,967,295, and NotSerialisable is raised for more.
class EscapedText {
 public:
  /// Appends ASCII as it is.
  void Append(std::string_view inAscii) {
    std::memcpy(Reserve(inAscii.size()), inAscii.data(), inAscii.size());
    at_ += inAscii.size();
  }
  /// Appends UTF-8 of inUnits code units as it is.
  void Append(std::string_view inUtf8, std::size_t inUnits) {
    beyondUnits_ += inUtf8.size() - inUnits;
    Append(inUtf8);
  }
  void Append(TextView inText, const AsciiTreatments& inTreatments);
  DOMString Finish();

 private:
  char* Reserve(std::size_t inCount) {
    if (static_cast<std::size_t>(end_ - at_) < inCount) Grow(inCount);
    return at_;
  }
  std::size_t Used() const { return static_cast<std::size_t>(at_ - bytes_.get()); }
  void Grow(std::size_t inCount);
  void Resize(std::size_t inCount);
  char* WriteCharacter(const char*& ioFrom, const char* inEnd, char* outTo);
  char* WriteCharacter(const char16_t*& ioFrom, const char16_t* inEnd, char* outTo);
  template <class Unit>
  void AppendUnits(std::basic_string_view<Unit> inText, const AsciiTreatments& inTreatments);

  MallocedBytes bytes_;
  char* at_ = nullptr;
  char* end_ = nullptr;
  std::size_t beyondUnits_ = 0;  // how many more bytes there are than units
};

#endif
