#include "toolkit/review/LanguageWords.h"

#include <algorithm>
#include <array>

#include "foundation/Process.h"
#include "platform/system/ZORMsgCatalog.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

constexpr const char* kKeys[] = {"Relevant", "Irrelevant", "NotInspected", "Old", "New"};
constexpr std::size_t kWordCount = std::size(kKeys);
constexpr const char* kEnglish[] = {"Relevant", "Irrelevant", "Not inspected", "Old", "New"};
typedef std::array<std::string, kWordCount> Words;

/// The words of the current language.
Words CurrentWords() {
  Words words;
  for (std::size_t i = 0; i < kWordCount; ++i)
    words[i] = Utf8(ZORMsgCatalog::BuildMessage("ZORLyraITFClashDialog3", kKeys[i]).Strip());
  return words;
}

Words WordsOf(const char* inLanguage) {
  const OtherLanguage other(inLanguage);
  return CurrentWords();
}

/// The current language first, so that its meaning of a word counts, and then English.
std::vector<Words> ReadTable() {
  std::vector<Words> table{CurrentWords(), WordsOf("en")};
  for (const char* const language : kLanguages) table.push_back(WordsOf(language));
  return table;
}

const std::vector<Words>& Table() {
  static const std::vector<Words> table = ReadTable();
  return table;
}

std::string Trimmed(const std::string& inText) {
  const std::size_t begin = inText.find_first_not_of(' ');
  if (begin == std::string::npos) return {};
  return inText.substr(begin, inText.find_last_not_of(' ') - begin + 1);
}

}  // namespace

OtherLanguage::OtherLanguage(const char* inLanguage) {
  if (const char* const former = ZORFoundation::ReadEnvironment("ZOR_LANG")) former_ = former;
  ZORFoundation::WriteEnvironment("ZOR_LANG", inLanguage);
}

OtherLanguage::~OtherLanguage() {
  ZORFoundation::WriteEnvironment("ZOR_LANG", former_ ? former_->c_str() : nullptr);
}

std::string EnglishWord(const std::string& inText) {
  const std::string text = Trimmed(inText);
  if (text.empty()) return {};
  for (const Words& words : Table()) {
    const auto found = std::ranges::find(words, text);
    if (found != words.end()) return kEnglish[found - words.begin()];
  }
  return {};
}

DocumentLanguage::DocumentLanguage(const std::vector<std::string>& inWords) {
  std::ptrdiff_t most = -1;
  for (std::size_t i = 0; i < Table().size(); ++i) {
    const Words& words = Table()[i];
    const std::ptrdiff_t known = std::ranges::count_if(inWords, [&](const std::string& inWord) {
      return std::ranges::find(words, Trimmed(inWord)) != words.end();
    });
    if (known <= most) continue;
    most = known;
    language_ = static_cast<int>(i);
  }
}

std::string DocumentLanguage::Translate(const std::string& inEnglish) const {
  const auto found = std::ranges::find(kEnglish, inEnglish);
  if (found == std::end(kEnglish)) return inEnglish;
  return Table()[static_cast<std::size_t>(language_)]
                [static_cast<std::size_t>(found - std::begin(kEnglish))];
}

}  // namespace ZORToolkit
