// What all writers of the process share, and the lines that precede a document's root.
#ifndef ZOR_XML_WRITING_WRITER_STATE_H
#define ZOR_XML_WRITING_WRITER_STATE_H

#include "platform/system/ZORUnicodeString.h"

/// Process-wide by contract: a form selected through one writer applies to all. Not locked. The
/// texts are constructed when the library is loaded, right after the named constants.
namespace writer_state {
extern int indentFlag;  // 1: laid out; any other value: compact; 0 when the library is loaded
extern ZORUnicodeString dtdIdentifier;
extern ZORUnicodeString styleSheet;
extern ZORUnicodeString typeName;

inline bool IsLaidOut() { return indentFlag == 1; }

/// Called first by every operation that writes a document.
void Select(int inIndent, const ZORUnicodeString& inDTDIdentifier,
            const ZORUnicodeString& inStyleSheet, const ZORUnicodeString& inTypeName);
}  // namespace writer_state

/// The XML declaration of the message catalogue; empty without that catalogue.
ZORUnicodeString XMLDeclaration();

/// <!DOCTYPE NAME SYSTEM "IDENTIFIER">
ZORUnicodeString DocumentTypeLine(const ZORUnicodeString& inTypeName,
                                  const ZORUnicodeString& inDTDIdentifier);

/// <?xml-stylesheet type="text/xsl" href="REFERENCE"?>
ZORUnicodeString StyleSheetLine(const ZORUnicodeString& inStyleSheet);

#endif
