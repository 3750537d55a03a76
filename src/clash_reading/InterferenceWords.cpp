#include "clash_reading/InterferenceWords.h"

#include <string>

#include "ZORLyraGeneralServices.h"
#include "platform/xml/DOM_NamedNodeMap.h"

namespace {

constexpr int kStripBoth = ZORUnicodeString::kStripBoth;

struct ResultTypeWords {
  const char* type;             // also the key of the word in the current language
  const char* allLanguagesKey;  // of the text that lists the word of every language
};
constexpr ResultTypeWords kResultTypes[] = {{"Clash", "ClashAllLanguages"},
                                            {"Contact", "ContactAllLanguages"},
                                            {"Clearance", "ClearanceAllLanguages"}};

}  // namespace

InterferenceWords::InterferenceWords() { catalogue_.LoadMsgCatalog("ZORLyraITFClashDialog3"); }

ZORUnicodeString InterferenceWords::Word(const char* inKey) const {
  return catalogue_.GetCatalogMsg(inKey).BuildMessage().Strip(kStripBoth, ZORUnicodeChar(' '));
}

ZORUnicodeString InterferenceWords::ResultType(const DOM_Node& inInterference) const {
  const DOM_Node neutral = inInterference.getAttributes().getNamedItem("ResultTypeNoNLS");
  if (!neutral.isNull()) return ZORLyraGeneralServices::GetDOMName(neutral.getNodeValue());

  const ZORUnicodeString word = ZORLyraGeneralServices::GetAttrOnNode(inInterference, "ResultType")
                                    .Strip(kStripBoth, ZORUnicodeChar(' '));
  for (const ResultTypeWords& known : kResultTypes) {
    if (Word(known.allLanguagesKey).SearchSubString(word, 0, ZORUnicodeString::kSearchForward) >=
            0 ||
        word == Word(known.type))
      return known.type;
  }
  return "error";
}

ZORUnicodeString InterferenceWords::Status(const ZORUnicodeString& inText) const {
  const ZORUnicodeString word = inText.Strip(kStripBoth, ZORUnicodeChar(' '));
  if (word == Word("Relevant")) return "Relevant";
  if (word == Word("Irrelevant")) return "Irrelevant";
  if (word == Word("NotInspected")) return "Not inspected";
  return "error";
}

ZORUnicodeString InterferenceWords::Retrieve(const ZORUnicodeString& inText) const {
  const ZORUnicodeString word = inText.Strip(kStripBoth, ZORUnicodeChar(' '));
  if (word == Word("Old")) return "Old";
  if (word == Word("New")) return "New";
  return word;
}
