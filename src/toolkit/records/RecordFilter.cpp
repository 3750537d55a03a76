#include "toolkit/records/RecordFilter.h"

#include <wctype.h>

#include <algorithm>
#include <clocale>

#include "foundation/Utf8.h"

namespace ZORToolkit {
namespace {

std::vector<std::string> Keys(const std::vector<std::string>& inWords) {
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

/// By way of the capital, so that both forms of a letter such as the Greek sigma meet.
char32_t Folded(char32_t inCharacter) {
  // Loaded when the first text comes, whatever the process's locale, and kept.
  static const locale_t tables = newlocale(LC_CTYPE_MASK, "C.UTF-8", nullptr);
  if (tables == nullptr) return inCharacter;
  return static_cast<char32_t>(
      towlower_l(towupper_l(static_cast<wint_t>(inCharacter), tables), tables));
}

}  // namespace

std::string CaseFolded(std::string_view inText) {
  std::u16string units(inText.size(), u'\0');
  units.resize(ZORFoundation::DecodeUtf8(inText, units.data()));
  std::string folded;
  folded.reserve(inText.size());
  for (std::size_t position = 0; position < units.size();) {
    char bytes[4];
    const char32_t character = Folded(ZORFoundation::NextCharacter(units, position));
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

void RecordFilter::SetTypes(const std::vector<std::string>& inWords) { types_ = Keys(inWords); }

void RecordFilter::SetStatuses(const std::vector<std::string>& inWords) {
  statuses_ = Keys(inWords);
}

bool RecordFilter::Accepts(const InterferenceRecord& inRecord) const {
  if (!IsAmong(types_, inRecord.type) || !IsAmong(statuses_, inRecord.status)) return false;
  if (result_ && *result_ != inRecord.result) return false;
  return !product_ || Holds(inRecord.products[0], *product_) ||
         Holds(inRecord.products[1], *product_);
}

}  // namespace ZORToolkit
