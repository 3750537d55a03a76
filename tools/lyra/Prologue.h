// What stands before the root of a written document.
#ifndef ZOR_TOOLS_LYRA_PROLOGUE_H
#define ZOR_TOOLS_LYRA_PROLOGUE_H

#include <string>

#include "lyra/Arguments.h"
#include "toolkit/records/ClashDocumentEdit.h"

namespace lyra {

/// The document type, the style sheet and the XML declaration as options of a verb.
struct PrologueOptions : ZORToolkit::Prologue {
  void Declare(Arguments& ioArguments);
  /// Raises UsageError for what would make a document that is no XML.
  void Check() const;
};

}  // namespace lyra

#endif
