// The loader of before: Xerces-C's scanner for well-formed text, which fills a compact tree in UTF-16.
// It stays here as a measure of the one that took its place, and is as it was.
#ifndef ZOR_BENCH_FORMER_TREE_H
#define ZOR_BENCH_FORMER_TREE_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "ResultHash.h"

namespace former {

/// An immutable UTF-16 text: this head, then the code units. It lies in the arena of a tree, or in a
/// counted block of its own (see OwnedText in DOMString.cpp).
struct DOM_Text {
  std::uint32_t length;

  const char16_t* Units() const { return reinterpret_cast<const char16_t*>(this + 1); }
  char16_t* Units() { return reinterpret_cast<char16_t*>(this + 1); }
  std::u16string_view View() const { return {Units(), length}; }
};

/// As ==, which the standard library does unit by unit.
inline bool IsSameText(std::u16string_view inA, std::u16string_view inB) {
  return inA.size() == inB.size() &&
         (inA.empty() || std::memcmp(inA.data(), inB.data(), inA.size() * sizeof(char16_t)) == 0);
}

/// The same for an ASCII text; bytes beyond ASCII are taken as Latin-1.
inline bool IsSameText(std::u16string_view inText, std::string_view inAscii) {
  if (inText.size() != inAscii.size()) return false;
  for (std::size_t i = 0; i < inAscii.size(); ++i)
    if (inText[i] != static_cast<unsigned char>(inAscii[i])) return false;
  return true;
}

/// A fast hash of UTF-16 text, eight bytes at a time.
inline std::uint64_t HashOfText(std::u16string_view inText) {
  constexpr std::uint64_t kFactor = 0x9E3779B97F4A7C15u;
  std::uint64_t hash = inText.size() * kFactor;
  const char16_t* at = inText.data();
  std::size_t left = inText.size() * sizeof(char16_t);
  for (; left >= 8; left -= 8, at += 4) {
    std::uint64_t part;
    std::memcpy(&part, at, 8);
    hash = (hash ^ part) * kFactor;
    hash ^= hash >> 29;
  }
  if (left > 0) {
    std::uint64_t part = 0;
    std::memcpy(&part, at, left);
    hash = (hash ^ part) * kFactor;
  }
  return hash ^ (hash >> 32);
}

/// The recent texts of one source, such as one attribute of one kind of element.
struct TextSeries {
  const DOM_Text* last = nullptr;
  std::uint32_t newInARow = 0;
};

/// An arena of texts. Short recent ones are stored once: documents repeat their indentation, "NO",
/// "0" and the like.
class TextStore {
 public:
  TextStore();
  const DOM_Text* Add(std::u16string_view inText);
  /// As Add. After a long run of different texts, as of numbers, only the last one is compared.
  const DOM_Text* Add(std::u16string_view inText, TextSeries& ioSeries);
  /// As Add, without looking for an equal text.
  const DOM_Text* AddUnshared(std::u16string_view inText);

 private:
  /// A recent text with its hash, so that most others need not be compared.
  struct Shared {
    std::uint64_t hash;
    const DOM_Text* text;
  };
  char* Allocate(std::size_t inBytes);
  char* AllocateBlock(std::size_t inBytes);

  static constexpr std::size_t kSharedSlots = 4096;
  static constexpr std::size_t kMaxShared = 64;

  std::vector<std::unique_ptr<char[]>> blocks_;
  char* free_ = nullptr;
  char* end_ = nullptr;
  std::size_t nextBlock_;
  std::unique_ptr<Shared[]> shared_;
};

/// Numbers the names of a document: equal names have equal numbers, from 1.
class NameTable {
 public:
  explicit NameTable(TextStore& ioTexts);
  std::uint32_t Intern(std::u16string_view inName);
  /// @return 0 for a name that the document does not have.
  std::uint32_t Find(std::u16string_view inName) const;
  const DOM_Text* TextOf(std::uint32_t inName) const { return names_[inName]; }
  /// One more than the largest number.
  std::uint32_t End() const { return static_cast<std::uint32_t>(names_.size()); }

 private:
  std::size_t SlotOf(std::u16string_view inName) const;
  void Grow();

  TextStore& texts_;
  std::vector<const DOM_Text*> names_;
  std::vector<std::uint32_t> slots_;  // open addressing; a power of two
};

/// Records in chunks that never move, addressed by numbers from 1.
template <typename Record>
class ChunkedRecords {
 public:
  static constexpr std::uint32_t kChunkBits = 12;
  static constexpr std::uint32_t kChunkSize = 1u << kChunkBits;

  Record& operator[](std::uint32_t inNumber) {
    return chunks_[inNumber >> kChunkBits][inNumber & (kChunkSize - 1)];
  }
  const Record& operator[](std::uint32_t inNumber) const {
    return chunks_[inNumber >> kChunkBits][inNumber & (kChunkSize - 1)];
  }
  std::uint32_t Add() {
    if ((end_ >> kChunkBits) >= chunks_.size()) chunks_.emplace_back(new Record[kChunkSize]);
    return end_++;
  }

 private:
  std::vector<std::unique_ptr<Record[]>> chunks_;
  std::uint32_t end_ = 1;  // 0 means none
};

enum Kind : std::uint8_t { kDocument, kElement, kText, kOther };

struct Node {
  Kind kind;
  std::uint32_t name;
  std::uint32_t parent;
  std::uint32_t previous;
  std::uint32_t next;
  std::uint32_t firstAttribute;
  struct Children {
    std::uint32_t first, last;
  };
  union {
    Children children;
    const DOM_Text* text;
  };
};

struct Attribute {
  const DOM_Text* value;
  std::uint32_t name;
  std::uint32_t next;
};

struct Tree {
  Tree() : names(texts) { Append(0, kDocument, 0, nullptr); }
  std::uint32_t Append(std::uint32_t inParent, Kind inKind, std::uint32_t inName,
                       const DOM_Text* inText);
  std::uint32_t AppendAttribute(std::uint32_t inElement, std::uint32_t inLast, std::uint32_t inName,
                                const DOM_Text* inValue);

  TextStore texts;
  NameTable names;
  ChunkedRecords<Node> nodes;
  ChunkedRecords<Attribute> attributes;
};

/// @return the tree of a file in UTF-8 without a document type; raises for others.
std::unique_ptr<Tree> Load(const std::string& inPath);
void HashTree(const Tree& inTree, std::uint32_t inNode, std::size_t inDepth, TreeHash& ioHash);

}  // namespace former

#endif
