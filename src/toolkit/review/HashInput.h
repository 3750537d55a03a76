// What is hashed in one go; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_HASH_INPUT_H
#define ZOR_TOOLKIT_REVIEW_HASH_INPUT_H

#include <algorithm>
#include <string>
#include <string_view>

#include "foundation/Hash.h"

namespace ZORToolkit {

/// Texts and numbers as ZORFoundation::Hash64 takes them, whose hash of them this has too. Many
/// short ones are hashed several times as fast.
class HashInput {
 public:
  void Clear() {
    count_ = 0;
    long_.clear();
  }
  void Add(std::uint64_t inNumber) {
    AddBytes(reinterpret_cast<const char*>(&inNumber), sizeof inNumber);
  }
  /// The length, then the text.
  void AddText(std::string_view inText) {
    Add(inText.size());
    AddBytes(inText.data(), inText.size());
  }
  std::uint64_t Hash() const {
    return ZORFoundation::Hash64Of(long_.empty() ? std::string_view(short_, count_) : long_);
  }

 private:
  void AddBytes(const char* inBytes, std::size_t inCount) {
    if (long_.empty() && inCount <= sizeof short_ - count_) {
      std::copy_n(inBytes, inCount, short_ + count_);
      count_ += inCount;
      return;
    }
    if (long_.empty()) long_.assign(short_, count_);
    long_.append(inBytes, inCount);
  }

  char short_[480];
  std::size_t count_ = 0;
  std::string long_;  // all, where it does not fit
};

}  // namespace ZORToolkit

#endif
