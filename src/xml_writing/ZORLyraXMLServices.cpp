// The writer itself and its markers.
#include "ZORLyraXMLServices.h"

#include <string_view>

#include "BuildPath.h"
#include "ZORLyraGeneralServices.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORSettingRepository.h"
#include "xml_writing/Prologue.h"
#include "xml_writing/WriterState.h"

namespace {
void AppendLiteral(ZORUnicodeString& ioText, std::u16string_view inLiteral) {
  ioText.AppendUTF16(inLiteral.data(), inLiteral.size());
}

void AppendForm(ZORUnicodeString& ioText, std::u16string_view inLaidOut,
                std::u16string_view inCompact) {
  AppendLiteral(ioText, writer_state::IsLaidOut() ? inLaidOut : inCompact);
}

ZORUnicodeString StyleSheetSetting() {
  ZORUnicodeString value;
  ZORSettingRepository* const settings =
      ZORSettingRepository::GetRepository("ClashPublish", 0, 1, nullptr);
  if (settings != nullptr) settings->ReadSetting("XslTemplate", &value);
  return value;
}

// "Ressources" is the folder's name.
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
    meta_object = fct_RetrieveMetaObject("ZORLyraXMLServices", kZORTypeImplementation,
                                         ZORBaseUnknown::MetaObject(), "ZORNull", "Pelinor",
                                         sizeof(ZORLyraXMLServices));
  return meta_object;
}

const char* ZORLyraXMLServices::ClassName() { return MetaObject()->IsA(); }

const CLSID& ZORLyraXMLServices::ClassId() { return MetaObject()->GetClassId(); }

ZORBaseUnknown* ZORLyraXMLServices::CreateItself() { return nullptr; }

ZORMetaClass* ZORLyraXMLServices::GetMetaObject() const { return MetaObject(); }

const char* ZORLyraXMLServices::IsA() const { return ClassName(); }

int ZORLyraXMLServices::IsAKindOf(const char* inClassName) const {
  return MetaObject()->IsAKindOf(inClassName);
}

void ZORLyraXMLServices::InitXMLMarkerWithAttr(ZORUnicodeString inName) {
  AppendLiteral(text_, u"<");
  text_.Append(inName);
  AppendLiteral(text_, u" ");
}

void ZORLyraXMLServices::InitXMLMarkerWithoutAttr(ZORUnicodeString inName) {
  AppendLiteral(text_, u"<");
  text_.Append(inName);
  AppendLiteral(text_, u"> ");
}

void ZORLyraXMLServices::AppendAttribute(const ZORUnicodeString& inName,
                                         const ZORUnicodeString& inValue) {
  text_.Append(inName);
  AppendLiteral(text_, u"=\"");
  text_.Append(inValue);
  AppendLiteral(text_, u"\" ");
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, ZORUnicodeString inValue) {
  AppendAttribute(inName, inValue);
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, int inValue) {
  AppendAttribute(inName, BuildPath::ConvToStr(inValue));
}

void ZORLyraXMLServices::AddAttr(ZORUnicodeString inName, char* inValue) {
  AppendAttribute(inName, ZORUnicodeString(inValue));
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
