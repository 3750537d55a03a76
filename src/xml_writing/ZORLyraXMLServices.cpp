#include "ZORLyraXMLServices.h"

#include <fstream>
#include <string>
#include <string_view>

#include "BuildPath.h"
#include "PlatformAdapter.h"
#include "RepCapture.h"
#include "StaticOrder.h"
#include "Teardown.h"
#include "ZORLyraGeneralServices.h"
#include "platform/system/ZORFile.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORSettingRepository.h"
#include "platform/xml/DOMString.h"
#include "platform/xml/ZORXMLParser.h"
#include "xml_writing/DocumentBytes.h"
#include "xml_writing/WriterState.h"

namespace {

constexpr char kClassName[] = "ZORLyraXMLServices";
constexpr int kReportWidth = 756;  // of pictures
constexpr int kReportHeight = 506;

void AppendForm(ZORUnicodeString& ioText, std::u16string_view inLaidOut,
                std::u16string_view inCompact) {
  adapter::AppendUnits(ioText, writer_state::IsLaidOut() ? inLaidOut : inCompact);
}

void AppendAttribute(ZORUnicodeString& ioText, const ZORUnicodeString& inName,
                     const ZORUnicodeString& inValue) {
  ioText.Append(inName);
  adapter::AppendUnits(ioText, u"=\"");
  ioText.Append(inValue);
  adapter::AppendUnits(ioText, u"\" ");
}

ZORUnicodeString StyleSheetSetting() {
  ZORUnicodeString value;
  ZORSettingRepository* const settings =
      ZORSettingRepository::GetRepository("ClashPublish", 0, 1, nullptr);
  if (settings != nullptr) settings->ReadSetting("XslTemplate", &value);
  return value;
}

// "Ressources" is spelled like the folder.
ZORUnicodeString DefaultStyleSheet() {
  ZORUnicodeString path("Ressources");
  path.Append(BuildPath::AppendSlash());
  path.Append(
      ZORMsgCatalog::BuildMessage("ZORSiMuXMLServicesV12", "NLSstr_Stylesheet", nullptr, 0, ""));
  return path;
}

constexpr int kPathSize = 260;  // bytes of a joined path, terminating zero included

/// A path in the form that the platform's file operations take.
std::wstring ToWide(const ZORUnicodeString& inPath) {
  std::wstring wide(static_cast<std::size_t>(inPath.GetLengthInChar()) + 10, L'\0');
  inPath.ConvertToWChar(wide.data());
  return wide;
}

/// The style-sheet reference and the document type of a dumped node, each after a line feed.
ZORUnicodeString PrologueLines() {
  ZORUnicodeString lines;
  const auto add = [&](const ZORUnicodeString& inLine) {
    lines.Append("\n");
    lines.Append(inLine);
  };
  if (writer_state::styleSheet != "") add(StyleSheetLine(writer_state::styleSheet));
  if (writer_state::dtdIdentifier != "")
    add(DocumentTypeLine(writer_state::typeName, writer_state::dtdIdentifier));
  return lines;
}

/// Opens a file, makes bytes of it and writes them.
/// @param inMakeBytes called when the file is open.
/// @param outClosed the platform's code of closing, when the file was opened.
template <class MakeBytes>
HRESULT WriteFile(const ZORUnicodeString& inPath, const MakeBytes& inMakeBytes,
                  HRESULT& outClosed) {
  int descriptor = 0;
  const HRESULT opened = ZORFOpen(ToWide(inPath).c_str(), "wb", &descriptor);
  if (FAILED(opened)) return opened;
  Teardown close;
  close.Add([&] { outClosed = ZORFClose(descriptor); });
  const std::string_view bytes = inMakeBytes();
  std::size_t count = 0;
  const HRESULT written = ZORFWrite(descriptor, bytes.data(), bytes.size(), &count);
  close.Run();
  return written;
}

}  // namespace

ZORMetaClass* ZORLyraXMLServices::meta_object = nullptr;

ZORLyraXMLServices::ZORLyraXMLServices() {
  writer_state::dtdIdentifier = ZORUnicodeString();
  writer_state::styleSheet = ZORUnicodeString();
  writer_state::indentFlag = 1;
}

ZORLyraXMLServices::ZORLyraXMLServices(const ZORLyraXMLServices& inOther) = default;

ZORLyraXMLServices& ZORLyraXMLServices::operator=(const ZORLyraXMLServices& inOther) = default;

ZORLyraXMLServices::~ZORLyraXMLServices() = default;

ZORMetaClass* ZORLyraXMLServices::MetaObject() {
  if (meta_object == nullptr)
    meta_object =
        fct_RetrieveMetaObject(kClassName, kZORTypeImplementation, ZORBaseUnknown::MetaObject(),
                               "ZORNull", "Pelinor", sizeof(ZORLyraXMLServices));
  return meta_object;
}

const char* ZORLyraXMLServices::ClassName() {
  MetaObject();
  return kClassName;
}

const CLSID& ZORLyraXMLServices::ClassId() { return MetaObject()->GetClassId(); }

ZORBaseUnknown* ZORLyraXMLServices::CreateItself() { return nullptr; }

ZORMetaClass* ZORLyraXMLServices::GetMetaObject() const { return MetaObject(); }

const char* ZORLyraXMLServices::IsA() const { return ClassName(); }

int ZORLyraXMLServices::IsAKindOf(const char* inClassName) const {
  return MetaObject()->IsAKindOf(inClassName);
}

void ZORLyraXMLServices::InitXMLMarkerWithAttr(ZORUnicodeString inName) {
  adapter::AppendUnits(text_, u"<");
  text_.Append(inName);
  adapter::AppendUnits(text_, u" ");
}

void ZORLyraXMLServices::InitXMLMarkerWithoutAttr(ZORUnicodeString inName) {
  adapter::AppendUnits(text_, u"<");
  text_.Append(inName);
  adapter::AppendUnits(text_, u"> ");
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, ZORUnicodeString inValue) {
  AppendAttribute(text_, inName, inValue);
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, int inValue) {
  AppendAttribute(text_, inName, BuildPath::ConvToStr(inValue));
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, char* inValue) {
  AppendAttribute(text_, inName, ZORUnicodeString(inValue));
}

void ZORLyraXMLServices::CloseXMLAttrMarkerWithElem() { AppendForm(text_, u"> \n", u">"); }

void ZORLyraXMLServices::CloseXMLAttrMarkerWithoutElem() { AppendForm(text_, u"/> \n\n", u"/>"); }

void ZORLyraXMLServices::AddPCData(ZORUnicodeString inText) { text_.Append(inText); }

void ZORLyraXMLServices::CloseXMLMarker(ZORUnicodeString inName) {
  AppendForm(text_, u"\n</", u"</");
  text_.Append(inName);
  AppendForm(text_, u"> \n", u">");
}

void ZORLyraXMLServices::WriteXMLHeaderTag(ZORUnicodeString inTypeName,
                                           ZORUnicodeString inDTDIdentifier,
                                           ZORUnicodeString inStyleSheet) {
  text_.Append(XMLDeclaration());
  AppendForm(text_, u"\n", u"");
  text_.Append(DocumentTypeLine(inTypeName, inDTDIdentifier));
  AppendForm(text_, u" \n", u"");
  if (inStyleSheet != "") {
    text_.Append(StyleSheetLine(inStyleSheet));
    AppendForm(text_, u"\n", u"");
  }
}

ZORUnicodeString ZORLyraXMLServices::getStyleSheetFromSetting() {
  ZORUnicodeString styleSheet = StyleSheetSetting();
  if (styleSheet == "") styleSheet = DefaultStyleSheet();
  return ZORLyraGeneralServices::TransformPathnameFromDLName(styleSheet);
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      int inKeepBackground) {
  CaptureRep(inRep,
             {inPath, "JPEG", kReportWidth, kReportHeight, true, inKeepBackground != 0, false},
             [](ZORPrint3DRepImage&) {});
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inWidth,
                                      int inHeight, int inViewMode, int inKeepBackground) {
  CaptureRep(inRep,
             {inPath, "JPEG", inWidth, inHeight, inViewMode == 1, inKeepBackground != 0, true},
             [](ZORPrint3DRepImage&) {});
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      ZOR3DViewpoint* inViewpoint, int inKeepBackground) {
  CaptureRep(inRep,
             {inPath, "JPEG", kReportWidth, kReportHeight, true, inKeepBackground != 0, false},
             [&](ZORPrint3DRepImage& ioImage) { *ioImage.GetViewpoint() = *inViewpoint; });
}

HRESULT ZORLyraXMLServices::CreateNewFederatorDocument(ZORUnicodeString inPath,
                                                       ZORUnicodeString inDTDIdentifier,
                                                       ZORUnicodeString inStyleSheet,
                                                       int inIndent) {
  writer_state::Select(inIndent, inDTDIdentifier, inStyleSheet, "FederatorClashElement");
#ifdef _WIN32
  std::ofstream file(
      ToWide(inPath.ConvertToChar()).c_str());  // narrow text need not be the system's
#else
  std::ofstream file(inPath.ConvertToChar());
#endif
  if (!file.is_open()) return E_FAIL;
  file << XMLDeclaration().ConvertToChar();
  if (inDTDIdentifier != "")
    file << DocumentTypeLine(writer_state::typeName, inDTDIdentifier).ConvertToChar();
  if (inStyleSheet != "") file << StyleSheetLine(inStyleSheet).ConvertToChar();
  file << "<FederatorClashElement><Elements/></FederatorClashElement>";
  return S_OK;
}

int ZORLyraXMLServices::DumpDocument(ZORUnicodeString inPath) {
  HRESULT closed = S_OK;
  Utf8Bytes bytes;
  const auto convert = [&] {
    bytes = Utf8Bytes(Utf8Bytes::MostOf(static_cast<std::size_t>(text_.GetLengthInChar())));
    bytes.Add(text_);
    return bytes.View();
  };
  const HRESULT written = WriteFile(inPath, convert, closed);
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
  if (inPrologue == 1) {
    declaration.Append(XMLDeclaration());
    declaration.Append("\n");
  }
  // Converted before the file is opened, so that running out of memory leaves an old file intact.
  const DocumentBytes bytes(declaration, PrologueLines(), body);
  HRESULT ignored = S_OK;
  return WriteFile(
      inPath, [&] { return bytes.View(); }, ignored);
}

// The codes of the joins are ignored: copying a path that does not fit fails anyway.
HRESULT ZORLyraXMLServices::CopyFile(const char* inFileName, ZORUnicodeString inSourceDirectory,
                                     ZORUnicodeString inTargetDirectory) {
  char source[kPathSize] = "";
  char target[kPathSize] = "";
  ZORMakePath(inSourceDirectory.ConvertToChar(), inFileName, source);
  ZORMakePath(inTargetDirectory.ConvertToChar(), inFileName, target);
  return ZORFCopy(ToWide(source).c_str(), ToWide(target).c_str(), 0);
}

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
