#include "ZORLyraXMLServices.h"

#include <algorithm>
#include <cstdlib>
#include <fstream>
#include <memory>
#include <new>
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

/// A buffer of UTF-8, zeroed and large enough for any text of a given length: four bytes a unit. It
/// comes from calloc, which maps the pages of a large block only as they are written.
class Utf8Bytes {
 public:
  /// Raises std::bad_alloc when there is no memory for texts of inLength units.
  explicit Utf8Bytes(std::size_t inLength)
      : bytes_(static_cast<char*>(std::calloc(4 * inLength + 4, 1))) {
    if (bytes_ == nullptr) throw std::bad_alloc();
  }
  void Add(const ZORUnicodeString& inText) {
    std::size_t count = 0;
    inText.ConvertToUTF8(bytes_.get() + count_, &count);
    count_ += count;
  }
  /// Converts a long text in slices that fit the cache, without a second copy of it.
  void Add(std::u16string_view inUnits) {
    constexpr std::size_t kSlice = std::size_t{64} * 1024;
    ZORUnicodeString slice;
    while (!inUnits.empty()) {
      std::size_t count = std::min(inUnits.size(), kSlice);
      const bool splitsPair = count < inUnits.size() && (inUnits[count - 1] & 0xFC00) == 0xD800;
      if (splitsPair) --count;
      slice.BuildFromUTF16(inUnits.data(), count);
      Add(slice);
      inUnits.remove_prefix(count);
    }
  }
  HRESULT WriteTo(int inDescriptor) const {
    std::size_t written = 0;
    return ZORFWrite(inDescriptor, bytes_.get(), count_, &written);
  }

 private:
  struct Free {
    void operator()(char* inBytes) const { std::free(inBytes); }
  };
  std::unique_ptr<char, Free> bytes_;
  std::size_t count_ = 0;
};

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

/// A document as UTF-8: declaration and body, with the lines inserted after the first ">", or at the
/// start if there is none.
Utf8Bytes DocumentWithLines(std::u16string_view inDeclaration, std::u16string_view inLines,
                            std::u16string_view inBody) {
  Utf8Bytes document(inDeclaration.size() + inLines.size() + inBody.size());
  const std::size_t inHead = inDeclaration.find(u'>') + 1;  // 0 where there is none
  const std::size_t inRest = inHead > 0 ? 0 : inBody.find(u'>') + 1;
  if (inRest > 0) {
    document.Add(inDeclaration);
    document.Add(inBody.substr(0, inRest));
    document.Add(inLines);
    document.Add(inBody.substr(inRest));
  } else {
    document.Add(inDeclaration.substr(0, inHead));
    document.Add(inLines);
    document.Add(inDeclaration.substr(inHead));
    document.Add(inBody);
  }
  return document;
}

/// Opens a file, makes bytes of it and writes them.
/// @param inMakeBytes  called when the file is open.
/// @param outClosed the platform's code of closing, when the file was opened.
template <class MakeBytes>
HRESULT WriteFile(const ZORUnicodeString& inPath, const MakeBytes& inMakeBytes,
                  HRESULT& outClosed) {
  int descriptor = 0;
  const HRESULT opened = ZORFOpen(ToWide(inPath).c_str(), "wb", &descriptor);
  if (FAILED(opened)) return opened;
  Teardown close;
  close.Add([&] { outClosed = ZORFClose(descriptor); });
  const HRESULT written = inMakeBytes().WriteTo(descriptor);
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
  HRESULT closed = S_OK;
  const HRESULT written = WriteFile(
      inPath,
      [&] {
        Utf8Bytes bytes(static_cast<std::size_t>(text_.GetLengthInChar()));
        bytes.Add(text_);
        return bytes;
      },
      closed);
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
  const Utf8Bytes bytes = DocumentWithLines(
      adapter::UnitsOf(declaration), adapter::UnitsOf(PrologueLines()), adapter::UnitsOf(body));
  HRESULT ignored = S_OK;
  return WriteFile(
      inPath, [&]() -> const Utf8Bytes& { return bytes; }, ignored);
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
