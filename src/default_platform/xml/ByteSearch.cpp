#include "default_platform/xml/ByteSearch.h"

#ifdef __SSE2__
#include <immintrin.h>
#endif

namespace {

// ---- one byte at a time

bool IsPrintableAscii(char inByte) { return static_cast<signed char>(inByte) >= ' '; }

const char* EndOfValue(const char* inText, char inQuote) {
  while (IsPrintableAscii(*inText) && *inText != inQuote && *inText != '&' && *inText != '<')
    ++inText;
  return inText;
}

const char* EndOfText(const char* inText) {
  while ((IsPrintableAscii(*inText) && *inText != '&' && *inText != '<' && *inText != ']') ||
         *inText == '\t' || *inText == '\n')
    ++inText;
  return inText;
}

bool IsAsciiNameCharacter(char inByte) {
  return (inByte >= 'a' && inByte <= 'z') || (inByte >= 'A' && inByte <= 'Z') ||
         (inByte >= '0' && inByte <= ':') || inByte == '_' || inByte == '-' || inByte == '.';
}

const char* EndOfName(const char* inText) {
  while (IsAsciiNameCharacter(*inText)) ++inText;
  return inText;
}

// ---- sixteen and thirty-two

#ifdef __SSE2__

const char* EndOfValueSse2(const char* inText, char inQuote) {
  while (true) {
    const unsigned int stops = sse2::StopsOfValue(inText, inQuote);
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 16;
  }
}

const char* EndOfTextSse2(const char* inText) {
  while (true) {
    const unsigned int stops = sse2::StopsOfText(inText);
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 16;
  }
}

const char* EndOfNameSse2(const char* inText) {
  while (true) {
    const unsigned int stops = sse2::StopsOfName(inText);
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 16;
  }
}

#define ZOR_AVX2 __attribute__((target("avx2")))

ZOR_AVX2 inline __m256i Load(const char* inText) {
  return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(inText));
}
ZOR_AVX2 inline __m256i Equal(__m256i inBytes, char inByte) {
  return _mm256_cmpeq_epi8(inBytes, _mm256_set1_epi8(inByte));
}
ZOR_AVX2 inline __m256i IsBelowBlank(__m256i inBytes) {
  return _mm256_cmpgt_epi8(_mm256_set1_epi8(' '), inBytes);
}
ZOR_AVX2 inline __m256i IsBetween(__m256i inBytes, char inFirst, char inLast) {
  return _mm256_and_si256(
      _mm256_cmpgt_epi8(inBytes, _mm256_set1_epi8(static_cast<char>(inFirst - 1))),
      _mm256_cmpgt_epi8(_mm256_set1_epi8(static_cast<char>(inLast + 1)), inBytes));
}
ZOR_AVX2 inline unsigned int Bits(__m256i inA, __m256i inB, __m256i inC, __m256i inD) {
  return static_cast<unsigned int>(
      _mm256_movemask_epi8(_mm256_or_si256(_mm256_or_si256(inA, inB), _mm256_or_si256(inC, inD))));
}

ZOR_AVX2 const char* EndOfValueAvx2(const char* inText, char inQuote) {
  while (true) {
    const __m256i bytes = Load(inText);
    const unsigned int stops =
        Bits(Equal(bytes, inQuote), IsBelowBlank(bytes), Equal(bytes, '&'), Equal(bytes, '<'));
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 32;
  }
}

ZOR_AVX2 const char* EndOfTextAvx2(const char* inText) {
  while (true) {
    const __m256i bytes = Load(inText);
    const __m256i blank = _mm256_or_si256(Equal(bytes, '\t'), Equal(bytes, '\n'));
    const __m256i low = _mm256_andnot_si256(blank, IsBelowBlank(bytes));
    const unsigned int stops = Bits(Equal(bytes, '<'), low, Equal(bytes, '&'), Equal(bytes, ']'));
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 32;
  }
}

ZOR_AVX2 const char* EndOfNameAvx2(const char* inText) {
  while (true) {
    const __m256i bytes = Load(inText);
    const __m256i isLetter = IsBetween(_mm256_or_si256(bytes, _mm256_set1_epi8(0x20)), 'a', 'z');
    const unsigned int stops =
        ~Bits(isLetter, IsBetween(bytes, '0', ':'), IsBetween(bytes, '-', '.'), Equal(bytes, '_'));
    if (stops != 0) return inText + __builtin_ctz(stops);
    inText += 32;
  }
}

#endif

}  // namespace

const ByteSearch& ByteSearch::Plain() {
  static constexpr ByteSearch kSearch{&::EndOfValue, &::EndOfText, &::EndOfName};
  return kSearch;
}

const ByteSearch* ByteSearch::Sse2() {
#ifdef __SSE2__
  static constexpr ByteSearch kSearch{&EndOfValueSse2, &EndOfTextSse2, &EndOfNameSse2};
  return &kSearch;
#else
  return nullptr;
#endif
}

const ByteSearch* ByteSearch::Avx2() {
#ifdef __SSE2__
  static constexpr ByteSearch kSearch{&EndOfValueAvx2, &EndOfTextAvx2, &EndOfNameAvx2};
  return __builtin_cpu_supports("avx2") ? &kSearch : nullptr;
#else
  return nullptr;
#endif
}

const ByteSearch& ByteSearch::Best() {
  static const ByteSearch* const best = Avx2() != nullptr   ? Avx2()
                                        : Sse2() != nullptr ? Sse2()
                                                            : &Plain();
  return *best;
}
