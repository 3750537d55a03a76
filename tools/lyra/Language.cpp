#include "lyra/Language.h"

#include <cstdlib>

#include "lyra/Arguments.h"
#include "lyra/OptionWord.h"
#include "toolkit/records/RecordFilter.h"

namespace lyra {

void ChooseLanguage(const std::string& inLanguage) {
  if (inLanguage.empty()) return;
  const std::string language =
      ZORToolkit::CaseFolded(inLanguage.substr(0, inLanguage.find_first_of("_-.@")));
  ChosenWord("--lang", language, kLanguages);
  setenv("ZOR_LANG", language.c_str(), 1);
}

}  // namespace lyra
