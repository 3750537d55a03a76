#include "default_platform/xml/EscapedText.h"

#include <algorithm>
#include <cstdlib>
#include <limits>
#include <new>
#include <type_traits>
#include <utility>

#include "foundation/Utf8.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace {

constexpr std::size_t kFirstSize = 2048;
constexpr std::ptrdiff_t kBlock = 8;

#ifdef __SSE2__

__m128i EightBytes(const char* inLatin1) {
  return _mm_loadl_epi64(reinterpret_cast<const __m128i*>(inLatin1));
}

// Units that are no bytes become 0 or 255.
__m128i EightBytes(const char16_t* inUnits) {
  const __m128i units = _mm_loadu_si128(reinterpret_cast<const __m128i*>(inUnits));
  return _mm_packus_epi16(units, units);
}

// Copies eight units; whether they are ASCII that needs no escape in any context.
template <class Unit>
bool CopyPlainBlock(const Unit* inUnits, char* outBytes) {
  const __m128i bytes = EightBytes(inUnits);
  const auto isByte = [&](char inByte) { return _mm_cmpeq_epi8(bytes, _mm_set1_epi8(inByte)); };
  const __m128i isLow = _mm_cmplt_epi8(bytes, _mm_set1_epi8(' '));  // or beyond ASCII: negative
  const __m128i isSpecial =
      _mm_or_si128(_mm_or_si128(isByte('&'), isByte('<')), _mm_or_si128(isByte('>'), isByte('"')));
  _mm_storel_epi64(reinterpret_cast<__m128i*>(outBytes), bytes);
  return (_mm_movemask_epi8(_mm_or_si128(isLow, isSpecial)) & 0xFF) == 0;
}

#else

template <class Unit>
bool CopyPlainBlock(const Unit* inUnits, char* outBytes) {
  bool isPlain = true;
  for (std::ptrdiff_t i = 0; i < kBlock; ++i) {
    const auto unit = static_cast<std::make_unsigned_t<Unit>>(inUnits[i]);
    isPlain &=
        unit >= 0x20 && unit < 0x80 && unit != '&' && unit != '<' && unit != '>' && unit != '"';
    outBytes[i] = static_cast<char>(unit);
  }
  return isPlain;
}

#endif

}  // namespace

std::string_view EscapeOf(char16_t inUnit) {
  switch (inUnit) {
    case u'&':
      return "&amp;";
    case u'<':
      return "&lt;";
    case u'>':
      return "&gt;";
    case u'"':
      return "&quot;";
    case u'\t':
      return "&#9;";
    case u'\n':
      return "&#10;";
    default:
      return "&#13;";
  }
}

DOMString EscapedText::Finish() {
  const std::size_t used = Used();
  const std::size_t units = used - beyondUnits_;
  if (units > std::numeric_limits<std::uint32_t>::max()) throw NotSerialisable();
  if (used != 0) Resize(used);
  return DOM_HandleAccess::StringOfUtf8(std::move(bytes_), used, static_cast<std::uint32_t>(units));
}

void EscapedText::Grow(std::size_t inCount) {
  const std::size_t used = Used();
  Resize(std::max({kFirstSize, used + inCount, used * 2}));
  at_ = bytes_.get() + used;
}

// The C library moves large blocks without copying them.
void EscapedText::Resize(std::size_t inCount) {
  char* const bytes = static_cast<char*>(std::realloc(bytes_.get(), inCount));
  if (bytes == nullptr) throw std::bad_alloc();
  static_cast<void>(bytes_.release());
  bytes_.reset(bytes);
  end_ = bytes + inCount;
}

// The next two write one character beyond ASCII and move its position past it.
char* EscapedText::WriteCharacter(const char*& ioFrom, const char*, char* outTo) {
  ++beyondUnits_;
  return ZORFoundation::EncodeCharacter(static_cast<unsigned char>(*ioFrom++), outTo);
}

char* EscapedText::WriteCharacter(const char16_t*& ioFrom, const char16_t* inEnd, char* outTo) {
  const char16_t* const from = ioFrom;
  std::size_t units = 1;
  char32_t character = *from;
  if (ZORFoundation::IsHighSurrogate(character) && from + 1 != inEnd &&
      ZORFoundation::IsLowSurrogate(from[1])) {
    character = 0x10000 + ((character - 0xD800) << 10) + (from[1] - 0xDC00u);
    units = 2;
  } else if ((character >= 0xD800 && character < 0xE000) || character >= 0xFFFE) {
    throw NotSerialisable();
  }
  ioFrom += units;
  char* const end = ZORFoundation::EncodeCharacter(character, outTo);
  beyondUnits_ += static_cast<std::size_t>(end - outTo) - units;
  return end;
}

void EscapedText::Append(TextView inText, const AsciiTreatments& inTreatments) {
  if (inText.IsWide())
    AppendUnits(inText.Units(), inTreatments);
  else
    AppendUnits(inText.Latin1(), inTreatments);
}

template <class Unit>
void EscapedText::AppendUnits(std::basic_string_view<Unit> inText,
                              const AsciiTreatments& inTreatments) {
  constexpr std::size_t kMostBytes = sizeof(Unit) + 1;  // of a unit
  const Unit* from = inText.data();
  const Unit* const end = from + inText.size();
  char* to = Reserve(kMostBytes * inText.size());
  while (from != end) {
    // Most texts are made of blocks that need no escape. There is room for each as it is.
    while (end - from >= kBlock && CopyPlainBlock(from, to)) {
      to += kBlock;
      from += kBlock;
    }
    const Unit* const pause = from + std::min(kBlock, end - from);
    while (from < pause) {
      const auto unit = static_cast<std::make_unsigned_t<Unit>>(*from);
      if (unit >= 0x80) {
        to = WriteCharacter(from, end, to);
      } else if (inTreatments[unit] == Treatment::kCopy) {
        *to++ = static_cast<char>(unit);
        ++from;
      } else {
        if (inTreatments[unit] == Treatment::kRefuse) throw NotSerialisable();
        at_ = to;
        Append(EscapeOf(unit));
        ++from;
        to = Reserve(kMostBytes * static_cast<std::size_t>(end - from));
      }
    }
  }
  at_ = to;
}
