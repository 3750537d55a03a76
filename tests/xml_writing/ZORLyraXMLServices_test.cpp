#include "ZORLyraXMLServices.h"

#include <gtest/gtest.h>

#include <string>

#include "support/PlatformFolder.h"

namespace {
constexpr char kDeclaration[] = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>";

class Writer : public testing::Test {
 protected:
  void SetUp() override {
    folder_.WriteCatalogue("ZORLyraNLSXMLEncoding",
                           "nlsEncoding = '<?xml version=\"1.0\" encoding=\"UTF-8\"?>'\n");
    folder_.WriteCatalogue("ZORSiMuXMLServicesV12", "NLSstr_Stylesheet = 'report.xsl'\n");
  }

  /// What a writer has written so far.
  std::string TextOf(ZORLyraXMLServices& inWriter) {
    const std::string path = folder_.FilePath("text.xml");
    EXPECT_EQ(inWriter.DumpDocument(path.c_str()), S_OK);
    return support::ReadFile(path);
  }

  /// Selects the form of all writers.
  void SelectForm(int inIndent) {
    ZORLyraXMLServices other;
    ASSERT_EQ(
        other.CreateNewFederatorDocument(folder_.FilePath("form.xml").c_str(), "", "", inIndent),
        S_OK);
  }

  std::string StyleSheet() {
    return ZORLyraXMLServices().getStyleSheetFromSetting().ConvertToChar();
  }

  support::PlatformFolder folder_;
  ZORLyraXMLServices writer_;
};
}  // namespace

TEST_F(Writer, NewOneHasNoText) { EXPECT_EQ(TextOf(writer_), ""); }

TEST_F(Writer, MarkerWithAttributesStaysOpen) {
  writer_.InitXMLMarkerWithAttr("Interference");
  EXPECT_EQ(TextOf(writer_), "<Interference ");
}

TEST_F(Writer, MarkerWithoutAttributesEndsInASpaceInBothForms) {
  writer_.InitXMLMarkerWithoutAttr("Clash");
  SelectForm(0);
  writer_.InitXMLMarkerWithoutAttr("Clash");
  EXPECT_EQ(TextOf(writer_), "<Clash> <Clash> ");
}

TEST_F(Writer, AttributesOfEveryTypeEndInASpace) {
  char narrow[] = "bolt";
  writer_.AddAttr("Name", ZORUnicodeString("Interference.1"));
  writer_.AddAttr("Number", 5);
  writer_.AddAttr("Below", -15);
  writer_.AddAttr("Alias", narrow);
  EXPECT_EQ(TextOf(writer_), "Name=\"Interference.1\" Number=\"5\" Below=\"-15\" Alias=\"bolt\" ");
}

TEST_F(Writer, AttributesAreTheSameInBothForms) {
  SelectForm(0);
  writer_.AddAttr("Name", ZORUnicodeString("x"));
  writer_.AddAttr("Number", 0);
  EXPECT_EQ(TextOf(writer_), "Name=\"x\" Number=\"0\" ");
}

TEST_F(Writer, AttributeOfANullTextIsEmpty) {
  char* const nothing = nullptr;
  writer_.AddAttr("Alias", nothing);
  EXPECT_EQ(TextOf(writer_), "Alias=\"\" ");
}

TEST_F(Writer, AttributeValueIsNotEscaped) {
  writer_.AddAttr("Name", ZORUnicodeString("3\" & <more>"));
  EXPECT_EQ(TextOf(writer_), "Name=\"3\" & <more>\" ");
}

TEST_F(Writer, CharacterDataIsNotEscaped) {
  writer_.AddPCData("a < b & \"c\"\n");
  EXPECT_EQ(TextOf(writer_), "a < b & \"c\"\n");
}

TEST_F(Writer, StartTagWithContentLaidOut) {
  writer_.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(writer_), "> \n");
}

TEST_F(Writer, StartTagWithContentCompact) {
  SelectForm(0);
  writer_.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(writer_), ">");
}

TEST_F(Writer, EmptyElementLaidOut) {
  writer_.CloseXMLAttrMarkerWithoutElem();
  EXPECT_EQ(TextOf(writer_), "/> \n\n");
}

TEST_F(Writer, EmptyElementCompact) {
  SelectForm(0);
  writer_.CloseXMLAttrMarkerWithoutElem();
  EXPECT_EQ(TextOf(writer_), "/>");
}

TEST_F(Writer, EndTagLaidOut) {
  writer_.CloseXMLMarker("Clash");
  EXPECT_EQ(TextOf(writer_), "\n</Clash> \n");
}

TEST_F(Writer, EndTagCompact) {
  SelectForm(0);
  writer_.CloseXMLMarker("Clash");
  EXPECT_EQ(TextOf(writer_), "</Clash>");
}

TEST_F(Writer, EmptyElementWithAnAttributeCompact) {
  SelectForm(0);
  writer_.InitXMLMarkerWithAttr("A");
  writer_.AddAttr("x", 5);
  writer_.CloseXMLAttrMarkerWithoutElem();
  EXPECT_EQ(TextOf(writer_), "<A x=\"5\" />");
}

TEST_F(Writer, DocumentLaidOut) {
  writer_.InitXMLMarkerWithAttr("Clash");
  writer_.AddAttr("Name", ZORUnicodeString("c"));
  writer_.CloseXMLAttrMarkerWithElem();
  writer_.InitXMLMarkerWithoutAttr("Comment");
  writer_.AddPCData("checked");
  writer_.CloseXMLMarker("Comment");
  writer_.CloseXMLMarker("Clash");
  EXPECT_EQ(TextOf(writer_), "<Clash Name=\"c\" > \n<Comment> checked\n</Comment> \n\n</Clash> \n");
}

TEST_F(Writer, UnbalancedCallsAreWrittenAsTheyCome) {
  SelectForm(0);
  writer_.CloseXMLMarker("B");
  writer_.InitXMLMarkerWithAttr("A");
  writer_.CloseXMLMarker("C");
  EXPECT_EQ(TextOf(writer_), "</B><A </C>");
}

TEST_F(Writer, EmptyNamesAreWrittenAsTheyAre) {
  SelectForm(0);
  writer_.InitXMLMarkerWithoutAttr("");
  writer_.AddAttr("", ZORUnicodeString(""));
  writer_.CloseXMLMarker("");
  EXPECT_EQ(TextOf(writer_), "<> =\"\" </>");
}

TEST_F(Writer, FormOfLastSelectionHoldsForEarlierWriters) {
  ZORLyraXMLServices earlier;
  SelectForm(0);
  earlier.CloseXMLAttrMarkerWithElem();
  writer_.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(earlier), ">");
  EXPECT_EQ(TextOf(writer_), ">");
}

TEST_F(Writer, DefaultConstructionSelectsTheLaidOutFormForAll) {
  SelectForm(0);
  const ZORLyraXMLServices later;
  writer_.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(writer_), "> \n");
}

TEST_F(Writer, CopyingAndAssigningSelectNoForm) {
  ZORLyraXMLServices target;
  SelectForm(0);
  ZORLyraXMLServices copy(writer_);
  target = writer_;
  copy.CloseXMLAttrMarkerWithElem();
  target.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(copy), ">");
  EXPECT_EQ(TextOf(target), ">");
}

TEST_F(Writer, FormIsCompactForEveryIndentButOne) {
  for (int indent : {0, 2, -1, 256}) {
    SelectForm(indent);
    ZORLyraXMLServices copy(writer_);
    copy.CloseXMLAttrMarkerWithElem();
    EXPECT_EQ(TextOf(copy), ">") << indent;
  }
  SelectForm(1);
  writer_.CloseXMLAttrMarkerWithElem();
  EXPECT_EQ(TextOf(writer_), "> \n");
}

TEST_F(Writer, CopyHasTheTextSoFarAndGoesItsOwnWay) {
  writer_.AddPCData("so far");
  ZORLyraXMLServices copy(writer_);
  copy.AddPCData(", copied");
  writer_.AddPCData(", original");
  EXPECT_EQ(TextOf(copy), "so far, copied");
  EXPECT_EQ(TextOf(writer_), "so far, original");
}

TEST_F(Writer, AssignmentReplacesTheTextAndGivesTheObject) {
  ZORLyraXMLServices target;
  target.AddPCData("old");
  writer_.AddPCData("new");
  EXPECT_EQ(&(target = writer_), &target);
  EXPECT_EQ(TextOf(target), "new");
  EXPECT_EQ(TextOf(writer_), "new");
}

TEST_F(Writer, HeaderLaidOut) {
  writer_.WriteXMLHeaderTag("ClashElement", "clash.dtd", "clash.xsl");
  EXPECT_EQ(TextOf(writer_), std::string(kDeclaration) +
                                 "\n<!DOCTYPE ClashElement SYSTEM \"clash.dtd\"> \n"
                                 "<?xml-stylesheet type=\"text/xsl\" href=\"clash.xsl\"?>\n");
}

TEST_F(Writer, HeaderCompact) {
  SelectForm(0);
  writer_.WriteXMLHeaderTag("ClashElement", "clash.dtd", "clash.xsl");
  EXPECT_EQ(TextOf(writer_), std::string(kDeclaration) +
                                 "<!DOCTYPE ClashElement SYSTEM \"clash.dtd\">"
                                 "<?xml-stylesheet type=\"text/xsl\" href=\"clash.xsl\"?>");
}

TEST_F(Writer, HeaderWithAnEmptyIdentifierStillHasADocumentTypeLaidOut) {
  writer_.WriteXMLHeaderTag("ClashElement", "", "");
  EXPECT_EQ(TextOf(writer_),
            std::string(kDeclaration) + "\n<!DOCTYPE ClashElement SYSTEM \"\"> \n");
}

TEST_F(Writer, HeaderWithAnEmptyIdentifierStillHasADocumentTypeCompact) {
  SelectForm(0);
  writer_.WriteXMLHeaderTag("ClashElement", "", "");
  EXPECT_EQ(TextOf(writer_), std::string(kDeclaration) + "<!DOCTYPE ClashElement SYSTEM \"\">");
}

TEST_F(Writer, HeaderWithoutCatalogueHasNoDeclaration) {
  folder_.DamageCatalogue("ZORLyraNLSXMLEncoding");
  writer_.WriteXMLHeaderTag("A", "", "");
  EXPECT_EQ(TextOf(writer_), "\n<!DOCTYPE A SYSTEM \"\"> \n");
}

TEST_F(Writer, StyleSheetOfTheSetting) {
  folder_.WriteSettings("ClashPublish", "XslTemplate = '/styles/mine.xsl'\n");
  EXPECT_EQ(StyleSheet(), "/styles/mine.xsl");
}

TEST_F(Writer, StyleSheetWithoutSettingIsTheDefault) {
  folder_.WriteSettings("ClashPublish", "PublishDefDir = '/pub'\n");
  EXPECT_EQ(StyleSheet(), "Ressources\\report.xsl");
}

TEST_F(Writer, StyleSheetOfAnEmptySettingIsTheDefault) {
  folder_.WriteSettings("ClashPublish", "XslTemplate = ''\n");
  EXPECT_EQ(StyleSheet(), "Ressources\\report.xsl");
}

TEST_F(Writer, StyleSheetWithoutRepositoryIsTheDefault) {
  folder_.WriteSettings("ClashPublish", "= damaged\n");
  EXPECT_EQ(StyleSheet(), "Ressources\\report.xsl");
}

TEST_F(Writer, StyleSheetWithoutSettingAndCatalogueIsTheFolder) {
  folder_.WriteSettings("ClashPublish", "");
  folder_.DamageCatalogue("ZORSiMuXMLServicesV12");
  EXPECT_EQ(StyleSheet(), "Ressources\\");
}

TEST_F(Writer, StyleSheetOfALogicalNameIsAPath) {
  folder_.WriteLogicalNames("Styles = '/styles'\nLost = '${ZOR_TEST_NO_SUCH_VARIABLE}'\n");
  folder_.WriteSettings("ClashPublish", "XslTemplate = 'ZORDLN://Styles\\mine.xsl'\n");
  EXPECT_EQ(StyleSheet(), "/styles\\mine.xsl");
  folder_.WriteSettings("ClashPublish", "XslTemplate = 'ZORDLN://Elsewhere\\mine.xsl'\n");
  EXPECT_EQ(StyleSheet(), "");
  folder_.WriteSettings("ClashPublish", "XslTemplate = 'ZORDLN://Lost\\mine.xsl'\n");
  EXPECT_EQ(StyleSheet(), "error");
}

TEST_F(Writer, StyleSheetIsReadAtEachCallAndWritesNothing) {
  folder_.WriteSettings("ClashPublish", "XslTemplate = 'one.xsl'\n");
  EXPECT_STREQ(writer_.getStyleSheetFromSetting().ConvertToChar(), "one.xsl");
  folder_.WriteSettings("ClashPublish", "XslTemplate = 'another.xsl'\n");
  EXPECT_STREQ(writer_.getStyleSheetFromSetting().ConvertToChar(), "another.xsl");
  EXPECT_EQ(TextOf(writer_), "");
}

TEST_F(Writer, ClassIsNamed) {
  EXPECT_STREQ(ZORLyraXMLServices::ClassName(), "ZORLyraXMLServices");
  const ZORBaseUnknown& component = writer_;
  EXPECT_STREQ(component.IsA(), "ZORLyraXMLServices");
}

TEST_F(Writer, ClassIsAKindOfItselfAndItsBase) {
  const ZORBaseUnknown& component = writer_;
  EXPECT_EQ(component.IsAKindOf("ZORLyraXMLServices"), 1);
  EXPECT_EQ(component.IsAKindOf("ZORBaseUnknown"), 1);
  EXPECT_EQ(component.IsAKindOf("ZORClashParsing"), 0);
  EXPECT_EQ(component.IsAKindOf(nullptr), 0);
}

TEST_F(Writer, MetaClassIsOneAndDescribesTheClass) {
  const ZORBaseUnknown& component = writer_;
  ZORMetaClass* const meta = ZORLyraXMLServices::MetaObject();
  ASSERT_NE(meta, nullptr);
  EXPECT_EQ(ZORLyraXMLServices::MetaObject(), meta);
  EXPECT_EQ(component.GetMetaObject(), meta);
  EXPECT_STREQ(meta->IsA(), "ZORLyraXMLServices");
  EXPECT_EQ(meta->GetTypeOfClass(), 1);
  EXPECT_EQ(meta->GetBase(), ZORBaseUnknown::MetaObject());
  EXPECT_STREQ(meta->GetExtendedClass(), "ZORNull");
  EXPECT_STREQ(meta->GetFramework(), "Pelinor");
  EXPECT_EQ(meta->GetInstanceSize(), sizeof(ZORLyraXMLServices));
  EXPECT_TRUE(ZORLyraXMLServices::ClassId() == meta->GetClassId());
}

TEST_F(Writer, NoFactoryMakesOne) { EXPECT_EQ(ZORLyraXMLServices::CreateItself(), nullptr); }

TEST_F(Writer, ComponentOnTheHeapGoesWithItsLastReference) {
  auto* const component = new ZORLyraXMLServices;
  EXPECT_EQ(component->AddRef(), 2u);
  ZORLyraXMLServices copy(*component);
  EXPECT_EQ(copy.AddRef(), 2u);  // a copy counts its own references
  EXPECT_EQ(component->Release(), 1u);
  EXPECT_EQ(component->Release(), 0u);
}
