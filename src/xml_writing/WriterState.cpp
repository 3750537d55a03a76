#include "xml_writing/WriterState.h"

#include "StaticOrder.h"
#include "platform/system/ZORMsgCatalog.h"

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

ZORUnicodeString XMLDeclaration() {
  return ZORMsgCatalog::BuildMessage("ZORLyraNLSXMLEncoding", "nlsEncoding", nullptr, 0, "");
}

ZORUnicodeString DocumentTypeLine(const ZORUnicodeString& inTypeName,
                                  const ZORUnicodeString& inDTDIdentifier) {
  ZORUnicodeString line("<!DOCTYPE ");
  line.Append(inTypeName);
  line.Append(" SYSTEM \"");
  line.Append(inDTDIdentifier);
  line.Append("\">");
  return line;
}

ZORUnicodeString StyleSheetLine(const ZORUnicodeString& inStyleSheet) {
  ZORUnicodeString line("<?xml-stylesheet type=\"text/xsl\" href=\"");
  line.Append(inStyleSheet);
  line.Append("\"?>");
  return line;
}
