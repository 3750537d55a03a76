// Hashes of results, so that a faster wrong answer is refused.
#ifndef ZOR_BENCH_RESULT_HASH_H
#define ZOR_BENCH_RESULT_HASH_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>

#include "foundation/Hash.h"

/// A hash over texts as UTF-8, whatever form they come in, each ended by a byte that no UTF-8 text
/// holds.
class ResultHash {
 public:
  void Add(std::string_view inUtf8);
  void Add(std::u16string_view inUtf16);
  void Add(std::uint64_t inNumber) { hash_.Add(inNumber); }
  /// Part of a text, which the next Add ends.
  void AddPart(std::string_view inUtf8) { hash_.Add(inUtf8); }
  std::uint64_t Value() const { return hash_.Get(); }

 private:
  ZORFoundation::Hash64 hash_;
};

/// The hash of a file's bytes; raises when it cannot be read.
std::uint64_t HashOfBytes(const std::string& inPath);

/// Takes what a ResultHash takes and only counts its length: what a loop that is timed does with
/// the answers that it gets.
class LengthSum {
 public:
  void Add(std::string_view inText) { sum_ += inText.size(); }
  void Add(std::u16string_view inText) { sum_ += inText.size(); }
  void Add(std::uint64_t inNumber) { sum_ += inNumber; }
  std::uint64_t Value() const { return sum_; }

 private:
  std::uint64_t sum_ = 0;
};

/// The hash of a document's tree, from its nodes in document order: elements with their depth,
/// their attributes in any order, texts. Texts are UTF-8 or UTF-16.
class TreeHash {
 public:
  template <class Text>
  void AddElement(std::size_t inDepth, Text inName) {
    ++position_;
    AddNode('e', inDepth, inName, Text());
  }
  /// Of the element that was added last.
  template <class Text>
  void AddAttribute(Text inName, Text inValue) {
    AddNode('a', 0, inName, inValue);
  }
  template <class Text>
  void AddText(std::size_t inDepth, Text inText) {
    ++position_;
    AddNode('t', inDepth, Text(), inText);
  }
  std::uint64_t Value() const { return sum_; }

 private:
  // The nodes' hashes are summed: a node's place is in its hash, and attributes have no order.
  template <class Text>
  void AddNode(char inKind, std::size_t inDepth, Text inName, Text inValue) {
    ResultHash hash;
    hash.Add(std::string_view(&inKind, 1));
    hash.Add(static_cast<std::uint64_t>(position_));
    hash.Add(static_cast<std::uint64_t>(inDepth));
    hash.Add(inName);
    hash.Add(inValue);
    sum_ += hash.Value();
  }

  std::size_t position_ = 0;
  std::uint64_t sum_ = 0;
};

#endif
