// Records that never move.
#ifndef ZOR_DEFAULT_PLATFORM_XML_CHUNKEDRECORDS_H
#define ZOR_DEFAULT_PLATFORM_XML_CHUNKEDRECORDS_H

#include <cstddef>
#include <cstdint>
#include <limits>
#include <memory>
#include <stdexcept>
#include <vector>

/// A growing array of records addressed by 32-bit numbers from 1. References stay valid while it
/// grows, and growing copies nothing.
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
  /// The number of a new record; its content is undefined.
  std::uint32_t Add() {
    if ((end_ >> kChunkBits) >= chunks_.size()) {
      if (end_ > std::numeric_limits<std::uint32_t>::max() - kChunkSize)
        throw std::length_error("a document has more than 4,294,000,000 nodes or attributes");
      chunks_.emplace_back(new Record[kChunkSize]);
    }
    return end_++;
  }
  std::uint32_t End() const { return end_; }

 private:
  std::vector<std::unique_ptr<Record[]>> chunks_;
  std::uint32_t end_ = 1;  // 0 stands for no record
};

#endif
