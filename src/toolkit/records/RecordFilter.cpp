#include "toolkit/records/RecordFilter.h"

#include <algorithm>
#include <sstream>

#include "foundation/CharacterTables.h"
#include "foundation/Utf8.h"

namespace ZORToolkit {
namespace {

std::vector<std::string> WordKeys(const std::vector<std::string>& inWords) {
  std::vector<std::string> keys;
  keys.reserve(inWords.size());
  for (const std::string& word : inWords) keys.push_back(WordKey(word));
  return keys;
}

bool IsAmong(const std::vector<std::string>& inKeys, const std::string& inText) {
  return inKeys.empty() || std::ranges::find(inKeys, WordKey(inText)) != inKeys.end();
}

bool Holds(const ProductRecord& inProduct, const std::string& inFolded) {
  for (const std::string* text :
       {&inProduct.alias, &inProduct.id, &inProduct.instance, &inProduct.label})
    if (CaseFolded(*text).find(inFolded) != std::string::npos) return true;
  return false;
}

}  // namespace

std::string CaseFolded(std::string_view inText) {
  std::u16string units(inText.size(), u'\0');
  units.resize(ZORFoundation::DecodeUtf8(inText, units.data()));
  std::string folded;
  folded.reserve(inText.size());
  for (std::size_t position = 0; position < units.size();) {
    char bytes[4];
    const char32_t character =
        ZORFoundation::CaseFoldedCharacter(ZORFoundation::NextCharacter(units, position));
    folded.append(bytes, ZORFoundation::EncodeCharacter(character, bytes));
  }
  return folded;
}

std::string WordKey(std::string_view inWord) {
  std::string key = CaseFolded(inWord);
  for (char& byte : key)
    if (byte == '-' || byte == '_') byte = ' ';
  return key;
}

void RecordFilter::SetTypes(const std::vector<std::string>& inWords) { types_ = WordKeys(inWords); }

void RecordFilter::SetStatuses(const std::vector<std::string>& inWords) {
  statuses_ = WordKeys(inWords);
}

bool RecordFilter::Accepts(const InterferenceRecord& inRecord) const {
  if (!IsAmong(types_, inRecord.type) || !IsAmong(statuses_, inRecord.status)) return false;
  if (result_ && *result_ != inRecord.result) return false;
  return !product_ || Holds(inRecord.products[0], *product_) ||
         Holds(inRecord.products[1], *product_);
}

namespace {

void CheckWords(const std::vector<std::string>& inWords, const char* inOption,
                std::span<const char* const> inKnown) {
  for (const std::string& word : inWords) {
    const auto isWord = [&](const char* inKnownWord) {
      return WordKey(inKnownWord) == WordKey(word);
    };
    if (std::ranges::none_of(inKnown, isWord)) throw UnknownWord(inOption, word, inKnown);
  }
}

class OnlyConditions {
 public:
  void Add(const std::string& inCondition) {
    const std::size_t equals = inCondition.find('=');
    const std::string name = inCondition.substr(0, equals);
    const std::string word = equals == std::string::npos ? "" : inCondition.substr(equals + 1);
    if (word.empty())
      throw UsageError("--only: a condition is such as type=clash, not \"" + inCondition + "\"");
    if (name == "type")
      options_.types.push_back(word);
    else if (name == "status")
      options_.statuses.push_back(word);
    else if (name == "result")
      SetOnce(name, word, options_.result);
    else if (name == "product")
      SetOnce(name, word, options_.product);
    else
      throw UsageError("--only: unknown word \"" + name +
                       "\"; known are type, status, result, product");
  }
  RecordFilter Filter() const { return ZORToolkit::FilterOf(options_); }

 private:
  static void SetOnce(const std::string& inName, const std::string& inWord, std::string& ioText) {
    if (!ioText.empty()) throw UsageError("--only: " + inName + " is given twice");
    ioText = inWord;
  }
  FilterOptions options_;
};

}  // namespace

UsageError UnknownWord(const std::string& inOption, const std::string& inWord,
                       std::span<const char* const> inKnown) {
  std::string message = inOption + ": unknown word \"" + inWord + "\"; known are";
  const char* separator = " ";
  for (const char* const known : inKnown) {
    message.append(separator).append(known);
    separator = ", ";
  }
  return UsageError(message);
}

RecordFilter FilterOf(const FilterOptions& inOptions) {
  CheckWords(inOptions.types, "--type", kTypeWords);
  CheckWords(inOptions.statuses, "--status", kStatusWords);
  RecordFilter filter;
  filter.SetTypes(inOptions.types);
  filter.SetStatuses(inOptions.statuses);
  if (!inOptions.result.empty()) filter.SetResult(inOptions.result);
  if (!inOptions.product.empty()) filter.SetProduct(inOptions.product);
  return filter;
}

RecordFilter FilterOfConditions(const std::vector<std::string>& inLists) {
  OnlyConditions conditions;
  for (const std::string& list : inLists) {
    std::istringstream parts(list);
    for (std::string part; std::getline(parts, part, ',');) conditions.Add(part);
  }
  return conditions.Filter();
}

}  // namespace ZORToolkit
