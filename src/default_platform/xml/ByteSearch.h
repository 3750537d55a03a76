// Where a value, a text or a name ends, many bytes at a time.
#ifndef ZOR_DEFAULT_PLATFORM_XML_BYTESEARCH_H
#define ZOR_DEFAULT_PLATFORM_XML_BYTESEARCH_H

#include <cstddef>
#include <string_view>
#ifdef __SSE2__
#include <emmintrin.h>
#endif

/// Searches in UTF-8 that a byte 0 ends, which every search stops at. They read up to kPadding
/// bytes past the one they find, so that many must be readable after the 0.
struct ByteSearch {
  static constexpr std::size_t kPadding = 64;

  /// The first byte that is the quote, '&', '<', below ' ' or beyond ASCII.
  const char* (*endOfValue)(const char* inText, char inQuote);
  /// The first byte that is '<', '&', ']', below ' ' but no tab or line feed, or beyond ASCII.
  const char* (*endOfText)(const char* inText);
  /// The first byte that is no ASCII character of a name.
  const char* (*endOfName)(const char* inText);

  static const ByteSearch& Plain();
  static const ByteSearch* Sse2();  ///< null where the processor is another
  static const ByteSearch* Avx2();  ///< null where the processor has none
  static const ByteSearch& Best();
};

#ifdef __SSE2__

/// Bits of the bytes at which a search stops, of sixteen.
namespace sse2 {

inline __m128i Load(const char* inText) {
  return _mm_loadu_si128(reinterpret_cast<const __m128i*>(inText));
}
inline __m128i Equal(__m128i inBytes, char inByte) {
  return _mm_cmpeq_epi8(inBytes, _mm_set1_epi8(inByte));
}
inline unsigned int Bits(__m128i inMask) {
  return static_cast<unsigned int>(_mm_movemask_epi8(inMask));
}

// As signed numbers, bytes beyond ASCII are below ' ' too.
inline unsigned int StopsOfValue(const char* inText, char inQuote) {
  const __m128i bytes = Load(inText);
  return Bits(
      _mm_or_si128(_mm_or_si128(Equal(bytes, inQuote), _mm_cmplt_epi8(bytes, _mm_set1_epi8(' '))),
                   _mm_or_si128(Equal(bytes, '&'), Equal(bytes, '<'))));
}

inline unsigned int StopsOfText(const char* inText) {
  const __m128i bytes = Load(inText);
  const __m128i blank = _mm_or_si128(Equal(bytes, '\t'), Equal(bytes, '\n'));
  const __m128i low = _mm_andnot_si128(blank, _mm_cmplt_epi8(bytes, _mm_set1_epi8(' ')));
  return Bits(_mm_or_si128(_mm_or_si128(Equal(bytes, '<'), low),
                           _mm_or_si128(Equal(bytes, '&'), Equal(bytes, ']'))));
}

inline __m128i IsBetween(__m128i inBytes, char inFirst, char inLast) {
  return _mm_and_si128(_mm_cmpgt_epi8(inBytes, _mm_set1_epi8(static_cast<char>(inFirst - 1))),
                       _mm_cmplt_epi8(inBytes, _mm_set1_epi8(static_cast<char>(inLast + 1))));
}

inline unsigned int StopsOfName(const char* inText) {
  const __m128i bytes = Load(inText);
  // Setting the bit 0x20 makes letters small ones; no other ASCII byte becomes a letter by it.
  const __m128i isLetter = IsBetween(_mm_or_si128(bytes, _mm_set1_epi8(0x20)), 'a', 'z');
  const __m128i isDigit = IsBetween(bytes, '0', ':');
  const __m128i isOther = _mm_or_si128(IsBetween(bytes, '-', '.'), Equal(bytes, '_'));
  return ~Bits(_mm_or_si128(_mm_or_si128(isLetter, isDigit), isOther)) & 0xFFFFu;
}

}  // namespace sse2

#endif

/// Compares a name with what is at a place, of which sixteen bytes must be readable: names are short.
class NameStart {
 public:
  NameStart() = default;
  explicit NameStart(std::string_view inName) : isWhole_(inName.size() <= sizeof(bytes_)) {
    const std::size_t count = inName.copy(bytes_, sizeof(bytes_));
    bits_ = (1u << count) - 1;
  }
  /// Whether these bytes are all of the name, so that no others need to be compared.
  bool IsWhole() const { return isWhole_; }
#ifdef __SSE2__
  bool IsAt(const char* inPlace) const {
    const __m128i equal = _mm_cmpeq_epi8(sse2::Load(inPlace), sse2::Load(bytes_));
    return (sse2::Bits(equal) & bits_) == bits_;
  }
#else
  bool IsAt(const char* inPlace) const {
    for (std::size_t i = 0; (bits_ >> i) != 0; ++i)
      if (inPlace[i] != bytes_[i]) return false;
    return true;
  }
#endif

 private:
  char bytes_[16] = {};
  unsigned int bits_ = 0;  // one for each byte that is of the name
  bool isWhole_ = true;
};

/// The same as the best search; most values and texts end within sixteen bytes, which are looked at
/// without a call.
class ShortByteSearch {
 public:
#ifdef __SSE2__
  const char* EndOfValue(const char* inText, char inQuote) const {
    const unsigned int stops = sse2::StopsOfValue(inText, inQuote);
    return stops != 0 ? inText + __builtin_ctz(stops) : long_.endOfValue(inText + 16, inQuote);
  }
  const char* EndOfText(const char* inText) const {
    const unsigned int stops = sse2::StopsOfText(inText);
    return stops != 0 ? inText + __builtin_ctz(stops) : long_.endOfText(inText + 16);
  }
  const char* EndOfName(const char* inText) const {
    const unsigned int stops = sse2::StopsOfName(inText);
    return stops != 0 ? inText + __builtin_ctz(stops) : long_.endOfName(inText + 16);
  }
#else
  const char* EndOfValue(const char* inText, char inQuote) const {
    return long_.endOfValue(inText, inQuote);
  }
  const char* EndOfText(const char* inText) const { return long_.endOfText(inText); }
  const char* EndOfName(const char* inText) const { return long_.endOfName(inText); }
#endif

 private:
  const ByteSearch& long_ = ByteSearch::Best();
};

#endif
