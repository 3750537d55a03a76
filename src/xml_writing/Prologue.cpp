#include "xml_writing/Prologue.h"

#include "platform/system/ZORMsgCatalog.h"

ZORUnicodeString XMLDeclaration() {
  return ZORMsgCatalog::BuildMessage("ZORLyraNLSXMLEncoding", "nlsEncoding", nullptr, 0, "");
}

ZORUnicodeString DocumentTypeLine(const ZORUnicodeString& inTypeName,
                                  const ZORUnicodeString& inDTDIdentifier) {
  ZORUnicodeString line("<!DOCTYPE ");
  line.Append(inTypeName).Append(" SYSTEM \"").Append(inDTDIdentifier).Append("\">");
  return line;
}

ZORUnicodeString StyleSheetLine(const ZORUnicodeString& inStyleSheet) {
  ZORUnicodeString line("<?xml-stylesheet type=\"text/xsl\" href=\"");
  line.Append(inStyleSheet).Append("\"?>");
  return line;
}
