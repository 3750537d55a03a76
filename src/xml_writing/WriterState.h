// What all writers of the process share.
#ifndef ZOR_XML_WRITING_WRITER_STATE_H
#define ZOR_XML_WRITING_WRITER_STATE_H

#include "platform/system/ZORUnicodeString.h"

/// Process-wide on purpose: a form selected through one writer is that of every other. No lock
/// guards it. The texts are built when the library is loaded, right after the named constants.
namespace writer_state {
extern int indentFlag;  // 1: laid out; any other value: compact; 0 when the library is loaded
extern ZORUnicodeString dtdIdentifier;
extern ZORUnicodeString styleSheet;
extern ZORUnicodeString typeName;

inline bool IsLaidOut() { return indentFlag == 1; }

/// What every operation that writes a document selects before it does anything else.
void Select(int inIndent, const ZORUnicodeString& inDTDIdentifier,
            const ZORUnicodeString& inStyleSheet, const ZORUnicodeString& inTypeName);
}  // namespace writer_state

#endif
