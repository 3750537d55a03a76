// Words of clash results in all languages that there are message catalogues of.
#ifndef ZOR_TOOLKIT_REVIEW_LANGUAGE_WORDS_H
#define ZOR_TOOLKIT_REVIEW_LANGUAGE_WORDS_H

#include <optional>
#include <string>
#include <vector>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// The languages that there are message catalogues of.
inline constexpr const char* kLanguages[] = {"de", "en", "es", "fr", "it", "ja"};

/// Message catalogues are of another language for as long as this lives: the environment says of which,
/// so no other thread reads that meanwhile.
class ZOR_TOOLKIT_EXPORT OtherLanguage {
 public:
  explicit OtherLanguage(const char* inLanguage);
  ~OtherLanguage();
  OtherLanguage(const OtherLanguage&) = delete;
  OtherLanguage& operator=(const OtherLanguage&) = delete;

 private:
  std::optional<std::string> former_;
};

/// @return what a status ("Relevant", "Irrelevant", "Not inspected") or an age ("Old", "New") is
/// in English, whatever its language; empty for another text.
std::string EnglishWord(const std::string& inText);

/// The language of a document, by the words that it uses: the current one when that knows them all.
class DocumentLanguage {
 public:
  /// @param inWords statuses and ages as the document has them.
  explicit DocumentLanguage(const std::vector<std::string>& inWords);
  /// @return an English word in this language; another text as it stands.
  std::string Translate(const std::string& inEnglish) const;

 private:
  int language_ = 0;  // a place in the table of languages
};

}  // namespace ZORToolkit

#endif
