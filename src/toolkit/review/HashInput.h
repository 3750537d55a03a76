// What is hashed in one go; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_REVIEW_HASH_INPUT_H
#define ZOR_TOOLKIT_REVIEW_HASH_INPUT_H

#include <string>
#include <string_view>

#include "foundation/Hash.h"

namespace ZORToolkit {

/// Texts and numbers as ZORFoundation::Hash64 takes them, whose hash of them this has too. Many
/// short ones are hashed several times as fast.
class HashInput {
 public:
  void Clear() { bytes_.clear(); }
  void Add(std::uint64_t inNumber) {
    bytes_.append(reinterpret_cast<const char*>(&inNumber), sizeof inNumber);
  }
  /// The length, then the text.
  void AddText(std::string_view inText) {
    Add(inText.size());
    bytes_ += inText;
  }
  std::uint64_t Hash() const { return ZORFoundation::Hash64Of(bytes_); }

 private:
  std::string bytes_;
};

}  // namespace ZORToolkit

#endif
