// Clash documents of any size, for measuring.
#ifndef ZOR_BENCH_CLASH_DOCUMENT_GENERATOR_H
#define ZOR_BENCH_CLASH_DOCUMENT_GENERATOR_H

#include <cstddef>
#include <cstdint>
#include <ostream>

/// Writes a "ClashElement" document laid out as real results are: about 1.7 KB an interference,
/// with two placed products and contact geometry each, a viewpoint in every second, a comment in
/// every third, a violated rule in every fifth, a picture in all, and a specification for every
/// tenth. Numbers, names and states vary; some names hold characters that XML escapes or that are
/// not ASCII, some numbers a decimal comma. The same count and seed give the same bytes.
void WriteClashDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut);

/// Writes that document as a later computation might have it: of a hundred interferences three are
/// gone, three have another value, two other products and two a turned one; none is inspected.
void WriteRecomputedDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut);

/// Writes a "ClashElement" document whose interferences are all of one pair of products, at
/// different places; with another seed each is a little away from there.
void WritePairDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut);

/// Writes a "Components" document of placed components with attributes, features and shapes.
void WriteComponentsDocument(std::size_t inCount, std::uint64_t inSeed, std::ostream& ioOut);

#endif
