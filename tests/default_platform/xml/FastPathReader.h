// The fast path alone, without the full scanner behind it.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_XML_FASTPATHREADER_H
#define ZOR_TESTS_DEFAULT_PLATFORM_XML_FASTPATHREADER_H

#include <algorithm>
#include <memory>
#include <string_view>

#include "default_platform/xml/Utf8FastPath.h"

/// Hands out a text in pieces of a given size.
class PiecewiseReader final : public ByteReader {
 public:
  PiecewiseReader(std::string_view inText, std::size_t inPiece) : text_(inText), piece_(inPiece) {}
  bool IsEmpty() override { return text_.empty(); }

 private:
  std::size_t DoRead(unsigned char* outBytes, std::size_t inMax) override {
    const std::size_t count = std::min({inMax, piece_, text_.size() - at_});
    std::copy_n(text_.data() + at_, count, outBytes);
    at_ += count;
    return count;
  }
  void DoRewind() override { at_ = 0; }

  std::string_view text_;
  std::size_t piece_;
  std::size_t at_ = 0;
};

/// A tree of its own.
class OwnedTree {
 public:
  OwnedTree() : tree_(DOM_Tree::Create()) { tree_->Hold(); }
  ~OwnedTree() { tree_->Release(); }
  OwnedTree(const OwnedTree&) = delete;
  OwnedTree& operator=(const OwnedTree&) = delete;
  DOM_Tree& operator*() const { return *tree_; }
  DOM_Tree* operator->() const { return tree_; }

 private:
  DOM_Tree* tree_;
};

/// @return whether the fast path reads a text.
inline bool IsReadByFastPath(std::string_view inText, std::size_t inPiece = 1 << 20) {
  const OwnedTree tree;
  PiecewiseReader reader(inText, inPiece);
  try {
    Utf8FastPath(reader, *tree).Read();
    return true;
  } catch (const NeedsFullScanner&) {
    return false;
  }
}

#endif
