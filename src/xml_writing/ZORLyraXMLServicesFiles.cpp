// The writer's operations on files.
#include <fstream>
#include <string_view>
#include <vector>

#include "ZORLyraXMLServices.h"
#include "platform/system/ZORFile.h"
#include "platform/xml/DOMString.h"
#include "platform/xml/ZORXMLParser.h"
#include "xml_writing/Prologue.h"
#include "xml_writing/Utf8File.h"
#include "xml_writing/WriterState.h"

namespace {
constexpr int kPathSize = 260;  // bytes of a joined path, terminating zero included

std::u16string_view Units(const ZORUnicodeString& inText) {
  return {inText.ConvertToUCChar(), static_cast<std::size_t>(inText.GetLengthInChar())};
}

// Both lines are inserted at one point, the document type first: the style sheet, inserted later,
// comes to stand before it.
ZORUnicodeString InsertedLines() {
  ZORUnicodeString lines;
  if (writer_state::styleSheet != "")
    lines.Append("\n").Append(StyleSheetLine(writer_state::styleSheet));
  if (writer_state::dtdIdentifier != "")
    lines.Append("\n").Append(
        DocumentTypeLine(writer_state::typeName, writer_state::dtdIdentifier));
  return lines;
}

// What a file is made of, in order. The lines go behind the first ">", or first where there is none.
std::vector<std::u16string_view> PiecesOfDocument(std::u16string_view inHead,
                                                  std::u16string_view inLines,
                                                  std::u16string_view inBody) {
  const std::size_t afterInHead = inHead.find(u'>') + 1;  // 0 where there is none
  const std::size_t afterInBody = afterInHead > 0 ? 0 : inBody.find(u'>') + 1;
  if (afterInBody > 0)
    return {inHead, inBody.substr(0, afterInBody), inLines, inBody.substr(afterInBody)};
  return {inHead.substr(0, afterInHead), inLines, inHead.substr(afterInHead), inBody};
}

HRESULT WriteFile(const ZORUnicodeString& inPath,
                  const std::vector<std::u16string_view>& inPieces) {
  OutputFile file;
  const HRESULT opened = file.Open(inPath);
  if (FAILED(opened)) return opened;
  Utf8Encoder encoder(file);
  for (const std::u16string_view piece : inPieces) encoder.Add(piece);
  return encoder.Finish();
}
}  // namespace

HRESULT ZORLyraXMLServices::CreateNewFederatorDocument(ZORUnicodeString inPath,
                                                       ZORUnicodeString inDTDIdentifier,
                                                       ZORUnicodeString inStyleSheet,
                                                       int inIndent) {
  writer_state::Select(inIndent, inDTDIdentifier, inStyleSheet, "FederatorClashElement");
  std::ofstream file(inPath.ConvertToChar());
  if (!file.is_open()) return E_FAIL;
  file << XMLDeclaration().ConvertToChar();
  if (inDTDIdentifier != "")
    file << DocumentTypeLine(writer_state::typeName, inDTDIdentifier).ConvertToChar();
  if (inStyleSheet != "") file << StyleSheetLine(inStyleSheet).ConvertToChar();
  file << "<FederatorClashElement><Elements/></FederatorClashElement>";
  return S_OK;
}

int ZORLyraXMLServices::DumpDocument(ZORUnicodeString inPath) {
  OutputFile file;
  const HRESULT opened = file.Open(inPath);
  if (FAILED(opened)) return opened;
  const Utf8Bytes text = ToUtf8(text_);
  const HRESULT written = file.Write(text.bytes.get(), text.count);
  const HRESULT closed = file.Close();
  return FAILED(written) ? written : closed;
}

HRESULT ZORLyraXMLServices::DumpDocument(DOM_Node inNode, ZORUnicodeString inPath,
                                         ZORUnicodeString inDTDIdentifier,
                                         ZORUnicodeString inStyleSheet, ZORUnicodeString inTypeName,
                                         int inPrologue, int inIndent) {
  writer_state::Select(inIndent, inDTDIdentifier, inStyleSheet, inTypeName);
  DOMString body;
  const HRESULT serialised = ZORXMLParser::WriteXML(inNode, "UTF-8", body);
  if (FAILED(serialised)) return serialised;

  ZORUnicodeString declaration;
  if (inPrologue == 1) declaration.Append(XMLDeclaration()).Append("\n");
  const ZORUnicodeString lines = InsertedLines();
  return WriteFile(inPath, PiecesOfDocument(Units(declaration), Units(lines),
                                            {body.rawBuffer(), body.length()}));
}

HRESULT ZORLyraXMLServices::CopyFile(const char* inFileName, ZORUnicodeString inSourceDirectory,
                                     ZORUnicodeString inTargetDirectory) {
  char source[kPathSize];
  char target[kPathSize];
  const HRESULT sourceJoined = ZORMakePath(inSourceDirectory.ConvertToChar(), inFileName, source);
  if (FAILED(sourceJoined)) return sourceJoined;
  const HRESULT targetJoined = ZORMakePath(inTargetDirectory.ConvertToChar(), inFileName, target);
  if (FAILED(targetJoined)) return targetJoined;
  return ZORFCopy(ToWide(source).c_str(), ToWide(target).c_str(), 0);
}
