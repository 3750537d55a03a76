#include "lyra/ListFilter.h"

#include <algorithm>
#include <span>

#include "lyra/OptionWord.h"

namespace lyra {
namespace {

void CheckWords(const std::vector<std::string>& inWords, const char* inOption,
                std::span<const char* const> inKnown) {
  for (const std::string& word : inWords) {
    const auto isWord = [&](const char* inKnownWord) {
      return ZORToolkit::WordKey(inKnownWord) == ZORToolkit::WordKey(word);
    };
    if (std::ranges::none_of(inKnown, isWord)) throw UnknownWord(inOption, word, inKnown);
  }
}

}  // namespace

ZORToolkit::RecordFilter FilterOf(const FilterOptions& inOptions) {
  CheckWords(inOptions.types, "--type", kTypeWords);
  CheckWords(inOptions.statuses, "--status", kStatusWords);
  ZORToolkit::RecordFilter filter;
  filter.SetTypes(inOptions.types);
  filter.SetStatuses(inOptions.statuses);
  if (!inOptions.result.empty()) filter.SetResult(inOptions.result);
  if (!inOptions.product.empty()) filter.SetProduct(inOptions.product);
  return filter;
}

}  // namespace lyra
