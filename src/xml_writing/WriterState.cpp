#include "xml_writing/WriterState.h"

#include "StaticOrder.h"

namespace writer_state {
int indentFlag = 0;
ZORUnicodeString dtdIdentifier ZOR_STATIC_ORDER_WRITER;
ZORUnicodeString styleSheet ZOR_STATIC_ORDER_WRITER;
ZORUnicodeString typeName ZOR_STATIC_ORDER_WRITER;

void Select(int inIndent, const ZORUnicodeString& inDTDIdentifier,
            const ZORUnicodeString& inStyleSheet, const ZORUnicodeString& inTypeName) {
  indentFlag = inIndent;
  dtdIdentifier = inDTDIdentifier;
  styleSheet = inStyleSheet;
  if (typeName == "") typeName = "GenObject";
  typeName = inTypeName;
}
}  // namespace writer_state
