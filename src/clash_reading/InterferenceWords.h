// The language-dependent words of an interference.
#ifndef ZOR_CLASH_READING_INTERFERENCE_WORDS_H
#define ZOR_CLASH_READING_INTERFERENCE_WORDS_H

#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Node.h"

/// Translates the words that a document carries in its writer's language back to fixed ones, with
/// the message catalogue as it is when this object is made. Without the catalogue every text of it
/// is empty.
class InterferenceWords {
 public:
  InterferenceWords();

  /// "ResultTypeNoNLS" as it stands where present; else "ResultType" as "Clash", "Contact",
  /// "Clearance" or "error".
  ZORUnicodeString ResultType(const DOM_Node& inInterference) const;
  /// "Relevant", "Irrelevant", "Not inspected" or "error".
  ZORUnicodeString Status(const ZORUnicodeString& inText) const;
  /// "Old", "New" or the text without surrounding spaces.
  ZORUnicodeString Retrieve(const ZORUnicodeString& inText) const;

 private:
  ZORUnicodeString Word(const char* inKey) const;

  ZORMsgCatalog catalogue_;
};

#endif
