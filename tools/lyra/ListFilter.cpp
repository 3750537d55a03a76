#include "lyra/ListFilter.h"

#include <algorithm>
#include <span>

#include "lyra/OptionWord.h"
#include "lyra/SafeText.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

/// Letter case and the sign between two words do not matter.
std::string WordKey(const std::string& inWord) {
  std::string key = CaseFolded(inWord);
  for (char& byte : key)
    if (byte == '-' || byte == '_') byte = ' ';
  return key;
}

std::vector<std::string> KnownKeys(const std::vector<std::string>& inWords, const char* inOption,
                                   std::span<const char* const> inKnown) {
  std::vector<std::string> keys;
  for (const std::string& word : inWords) {
    const std::string key = WordKey(word);
    const bool isKnown = std::any_of(inKnown.begin(), inKnown.end(),
                                     [&](const char* inWord) { return WordKey(inWord) == key; });
    if (!isKnown) throw UnknownWord(inOption, word, inKnown);
    keys.push_back(key);
  }
  return keys;
}

bool IsAmong(const std::vector<std::string>& inKeys, const std::string& inText) {
  return inKeys.empty() || std::find(inKeys.begin(), inKeys.end(), WordKey(inText)) != inKeys.end();
}

bool Holds(const ProductRecord& inProduct, const std::string& inFolded) {
  for (const std::string* text :
       {&inProduct.alias, &inProduct.id, &inProduct.instance, &inProduct.label})
    if (CaseFolded(*text).find(inFolded) != std::string::npos) return true;
  return false;
}

}  // namespace

void ListFilter::SetTypes(const std::vector<std::string>& inWords) {
  types_ = KnownKeys(inWords, "--type", kTypeWords);
}

void ListFilter::SetStatuses(const std::vector<std::string>& inWords) {
  statuses_ = KnownKeys(inWords, "--status", kStatusWords);
}

void ListFilter::SetProduct(const std::string& inText) { product_ = CaseFolded(inText); }

bool ListFilter::Accepts(const InterferenceRecord& inRecord) const {
  if (!IsAmong(types_, inRecord.type) || !IsAmong(statuses_, inRecord.status)) return false;
  if (result_ && *result_ != inRecord.result) return false;
  return !product_ || Holds(inRecord.products[0], *product_) ||
         Holds(inRecord.products[1], *product_);
}

}  // namespace lyra
