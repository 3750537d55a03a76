// Latin-1 beside UTF-16.
#ifndef ZOR_DEFAULT_PLATFORM_XML_LATIN1_H
#define ZOR_DEFAULT_PLATFORM_XML_LATIN1_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

#ifdef __SSE2__
#include <emmintrin.h>

/// Eight characters of Latin-1 as UTF-16.
inline __m128i EightOfLatin1(const char* inLatin1) {
  const __m128i bytes = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(inLatin1));
  return _mm_unpacklo_epi8(bytes, _mm_setzero_si128());
}

inline void WidenEight(const char* inLatin1, char16_t* outUnits) {
  _mm_storeu_si128(reinterpret_cast<__m128i*>(outUnits), EightOfLatin1(inLatin1));
}

inline bool AreSameEight(const char16_t* inUnits, const char* inLatin1) {
  const __m128i units = _mm_loadu_si128(reinterpret_cast<const __m128i*>(inUnits));
  return _mm_movemask_epi8(_mm_cmpeq_epi16(units, EightOfLatin1(inLatin1))) == 0xFFFF;
}

#else

inline void WidenEight(const char* inLatin1, char16_t* outUnits) {
  for (std::size_t i = 0; i < 8; ++i) outUnits[i] = static_cast<unsigned char>(inLatin1[i]);
}

inline bool AreSameEight(const char16_t* inUnits, const char* inLatin1) {
  bool areSame = true;
  for (std::size_t i = 0; i < 8; ++i)
    areSame &= inUnits[i] == static_cast<unsigned char>(inLatin1[i]);
  return areSame;
}

#endif

/// Eight characters at a time; the last eight may overlap those before.
/// @param outUnits room for as many units as there are characters.
inline void WidenLatin1(std::string_view inLatin1, char16_t* outUnits) {
  const std::size_t count = inLatin1.size();
  if (count < 8) {
    for (std::size_t i = 0; i < count; ++i) outUnits[i] = static_cast<unsigned char>(inLatin1[i]);
    return;
  }
  for (std::size_t i = 0; i + 8 < count; i += 8) WidenEight(inLatin1.data() + i, outUnits + i);
  WidenEight(inLatin1.data() + count - 8, outUnits + count - 8);
}

/// Whether both are the same text.
inline bool IsSameText(std::u16string_view inText, std::string_view inLatin1) {
  const std::size_t count = inLatin1.size();
  if (inText.size() != count) return false;
  if (count < 8) {
    for (std::size_t i = 0; i < count; ++i)
      if (inText[i] != static_cast<unsigned char>(inLatin1[i])) return false;
    return true;
  }
  for (std::size_t i = 0; i + 8 < count; i += 8)
    if (!AreSameEight(inText.data() + i, inLatin1.data() + i)) return false;
  return AreSameEight(inText.data() + count - 8, inLatin1.data() + count - 8);
}

#endif
