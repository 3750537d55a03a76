#include "lyra/Prologue.h"

#include "BuildPath.h"
#include "lyra/CommandErrors.h"
#include "lyra/DocumentText.h"
#include "platform/xml/DOM_DOMException.h"

namespace lyra {
namespace {

void CheckName(const std::string& inName) {
  try {
    DOM_Document::createDocument().createElement(FromUtf8(inName).ConvertToChar());
  } catch (const DOM_DOMException&) {
    throw UsageError("--type-name: \"" + inName + "\" is no name in XML");
  }
}

void CheckReference(const char* inOption, const std::string& inText) {
  for (char byte : inText)
    if (byte == '"' || static_cast<unsigned char>(byte) < ' ')
      throw UsageError(std::string(inOption) +
                       ": must not hold quotation marks or control characters");
  if (inText.find("?>") != std::string::npos)
    throw UsageError(std::string(inOption) + ": must not hold \"?>\"");
}

}  // namespace

void Prologue::Declare(Arguments& ioArguments) {
  ioArguments.Text("--dtd", "REFERENCE", dtd, "System identifier of the document type");
  ioArguments.Text("--xsl", "REFERENCE", styleSheet, "Reference of the style sheet");
}

void Prologue::Check() const {
  CheckReference("--dtd", dtd);
  CheckReference("--xsl", styleSheet);
  if (!typeName.empty()) CheckName(typeName);
  if (without && !(dtd.empty() && styleSheet.empty()))
    throw UsageError("--no-prologue leaves no place for --dtd and --xsl");
}

ZORUnicodeString Prologue::Dtd() const { return FromUtf8(dtd); }

// The reference is written as an attribute's value.
ZORUnicodeString Prologue::StyleSheet() const {
  ZORUnicodeString text = FromUtf8(styleSheet), escaped;
  BuildPath::CheckXMLString(text, escaped);
  return escaped;
}

ZORUnicodeString Prologue::TypeName(const ZORUnicodeString& inRootName) const {
  return typeName.empty() ? inRootName : FromUtf8(typeName);
}

void RemoveReplaced(const Prologue& inPrologue, DOM_Document ioDocument) {
  for (DOM_Node node = ioDocument.getFirstChild(); !node.isNull();) {
    const DOM_Node next = node.getNextSibling();
    const bool isType = node.getNodeType() == DOM_Node::DOCUMENT_TYPE_NODE;
    const bool isSheet = node.getNodeType() == DOM_Node::PROCESSING_INSTRUCTION_NODE &&
                         node.getNodeName().equals("xml-stylesheet");
    if ((isType && !inPrologue.dtd.empty()) || (isSheet && !inPrologue.styleSheet.empty()))
      ioDocument.removeChild(node);
    node = next;
  }
}

}  // namespace lyra
