// Interferences in words, for BCF files; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_WORDS_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_WORDS_H

#include <array>
#include <cstddef>
#include <string>
#include <vector>

#include "toolkit/exchange/bcf/BcfWriter.h"
#include "toolkit/records/InterferenceRecord.h"

namespace ZORToolkit {

/// What a reader calls a product: its alias, else its identifier.
const std::string& NameOf(const ProductRecord& inProduct);

/// What tells a product from others of its result.
std::string IdentityOf(const ProductRecord& inProduct);

/// The last names of both products.
std::string PairOf(const InterferenceRecord& inRecord);

/// One of "Clash", "Contact", "Clearance" and, of any other type, "Interference".
std::string TypeOf(const InterferenceRecord& inRecord);

/// In words, what has no place of its own in a topic.
std::string DescriptionOf(const InterferenceRecord& inRecord);

/// What a description in words and the attached result keep.
class NotCarriedCounter {
 public:
  void Add(const InterferenceRecord& inRecord);
  std::vector<NotCarried> List() const;

 private:
  void Count(bool inIsThere, std::size_t inWhat) { counts_[inWhat] += inIsThere ? 1 : 0; }
  std::array<int, 9> counts_{};
};

}  // namespace ZORToolkit

#endif
