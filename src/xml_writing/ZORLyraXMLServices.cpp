// The writer itself, its markers, pictures of representations.
#include "ZORLyraXMLServices.h"

#include <string_view>

#include "BuildPath.h"
#include "PlatformAdapter.h"
#include "RepCapture.h"
#include "ZORLyraGeneralServices.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORSettingRepository.h"
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

// By contract a print image that could not be rasterised is not released, here and in the variant
// with a viewpoint.
void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, true);
  if (Capture(*image, "JPEG", inPath)) image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath, int inWidth,
                                      int inHeight, int inViewMode, int inKeepBackground) {
  if (!inRep) return;
  auto* const image = new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), inWidth, inHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, inViewMode == 1);
  Capture(*image, "JPEG", inPath);
  image->Release();
}

void ZORLyraXMLServices::TakeRepImage(ZORRep* inRep, ZORUnicodeString inPath,
                                      ZOR3DViewpoint* inViewpoint, int inKeepBackground) {
  if (!inRep) return;
  auto* const image =
      new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inRep), kReportWidth, kReportHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, true);
  *image->GetViewpoint() = *inViewpoint;
  if (Capture(*image, "JPEG", inPath)) image->Release();
}
