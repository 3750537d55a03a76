// What stands before the root of a written document.
#ifndef ZOR_TOOLS_LYRA_PROLOGUE_H
#define ZOR_TOOLS_LYRA_PROLOGUE_H

#include <string>

#include "lyra/Arguments.h"
#include "platform/system/ZORUnicodeString.h"
#include "platform/xml/DOM_Document.h"

namespace lyra {

/// The document type, the style sheet and the XML declaration as options of a verb.
struct Prologue {
  std::string dtd, styleSheet, typeName;
  bool without = false;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError for what would make a document that is no XML.
  void Check() const;
  ZORUnicodeString Dtd() const;
  ZORUnicodeString StyleSheet() const;
  /// @param inRootName name of the root, which the document type has unless another is asked for.
  ZORUnicodeString TypeName(const ZORUnicodeString& inRootName) const;
};

/// Takes out of a document the document type and the style sheets that a new prologue replaces.
void RemoveReplaced(const Prologue& inPrologue, DOM_Document ioDocument);

}  // namespace lyra

#endif
