// The lines in front of a document's root.
#ifndef ZOR_XML_WRITING_PROLOGUE_H
#define ZOR_XML_WRITING_PROLOGUE_H

#include "platform/system/ZORUnicodeString.h"

/// The XML declaration of the message catalogue; empty without that catalogue.
ZORUnicodeString XMLDeclaration();

/// <!DOCTYPE NAME SYSTEM "IDENTIFIER">
ZORUnicodeString DocumentTypeLine(const ZORUnicodeString& inTypeName,
                                  const ZORUnicodeString& inDTDIdentifier);

/// <?xml-stylesheet type="text/xsl" href="REFERENCE"?>
ZORUnicodeString StyleSheetLine(const ZORUnicodeString& inStyleSheet);

#endif
