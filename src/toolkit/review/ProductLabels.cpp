#include "toolkit/review/ProductLabels.h"

#include <algorithm>
#include <array>
#include <numeric>

#include "foundation/Bytes.h"

namespace ZORToolkit {
namespace {

std::string_view PartOf(const ReviewProduct& inProduct) {
  return inProduct.part.empty() ? LastName(inProduct.Name()) : inProduct.part;
}

std::string_view AssemblyOf(const ReviewProduct& inProduct) {
  std::string_view path = inProduct.id;
  std::size_t at = LastSeparator(path);
  if (at == std::string_view::npos) {
    path = inProduct.Name();
    at = LastSeparator(path);
  }
  return at == std::string_view::npos ? "(top)" : path.substr(0, at);
}

std::string_view TextOf(const ReviewProduct& inProduct, GroupBy inBy) {
  if (inBy == GroupBy::kParts) return PartOf(inProduct);
  return inBy == GroupBy::kAssemblies ? AssemblyOf(inProduct) : inProduct.Name();
}

/// Numbers different texts in the order in which they come; by open addressing. A document has texts
/// that repeat, such as parts, at few places, so the place is looked at first.
class TextNumbers {
 public:
  std::uint32_t NumberOf(std::string_view inText) {
    const auto place = reinterpret_cast<std::uintptr_t>(inText.data()) / 4;
    Recent& recent = recents_[(place ^ (place >> 8)) % recents_.size()];
    if (recent.data != inText.data() || recent.size != inText.size())
      recent = {inText.data(), inText.size(), NumberOfOther(inText)};
    return recent.number;
  }

  const std::vector<std::string_view>& Texts() const { return texts_; }

 private:
  struct Slot {
    std::uint32_t tag = 0, number = 0;  // one more than the number
  };
  struct Recent {
    const char* data = nullptr;
    std::size_t size = 0;
    std::uint32_t number = 0;
  };

  std::uint32_t NumberOfOther(std::string_view inText) {
    if (2 * (texts_.size() + 1) > slots_.size()) Grow();
    const std::uint64_t hash = ZORFoundation::HashOfBytes(inText.data(), inText.size());
    const std::size_t mask = slots_.size() - 1;
    std::size_t slot = hash & mask;
    const auto tag = static_cast<std::uint32_t>(hash >> 32);
    for (; slots_[slot].number != 0; slot = (slot + 1) & mask)
      if (slots_[slot].tag == tag && IsText(slots_[slot].number - 1, inText))
        return slots_[slot].number - 1;
    texts_.push_back(inText);
    slots_[slot] = {tag, static_cast<std::uint32_t>(texts_.size())};
    return slots_[slot].number - 1;
  }

  bool IsText(std::uint32_t inNumber, std::string_view inText) const {
    const std::string_view text = texts_[inNumber];
    return text.size() == inText.size() &&
           ZORFoundation::AreSameBytes(text.data(), inText.data(), text.size());
  }

  void Grow() {
    slots_.assign(4 * slots_.size(), {});
    const std::size_t mask = slots_.size() - 1;
    for (std::uint32_t i = 0; i < texts_.size(); ++i) {
      const std::uint64_t hash = ZORFoundation::HashOfBytes(texts_[i].data(), texts_[i].size());
      std::size_t slot = hash & mask;
      while (slots_[slot].number != 0) slot = (slot + 1) & mask;
      slots_[slot] = {static_cast<std::uint32_t>(hash >> 32), i + 1};
    }
  }

  std::vector<std::string_view> texts_;
  std::vector<Slot> slots_ = std::vector<Slot>(64);
  std::array<Recent, 256> recents_{};
};

}  // namespace

ProductLabels::ProductLabels(const std::vector<ReviewProduct>& inProducts, GroupBy inBy) {
  if (inBy == GroupBy::kPlace) return;
  numbers_.reserve(inProducts.size());
  TextNumbers numbers;
  numbers.NumberOf("");
  for (const ReviewProduct& product : inProducts)
    numbers_.push_back(numbers.NumberOf(TextOf(product, inBy)));
  texts_ = numbers.Texts();
  Sort();
}

void ProductLabels::Sort() {
  std::vector<std::uint32_t> order(texts_.size()), rank(texts_.size());
  std::iota(order.begin(), order.end(), 0u);
  std::ranges::sort(order, {}, [&](std::uint32_t inNumber) { return texts_[inNumber]; });
  std::vector<std::string_view> sorted;
  sorted.reserve(order.size());
  for (const std::uint32_t number : order) {
    rank[number] = static_cast<std::uint32_t>(sorted.size());
    sorted.push_back(texts_[number]);
  }
  for (std::uint32_t& number : numbers_) number = rank[number];
  texts_.swap(sorted);
}

}  // namespace ZORToolkit
