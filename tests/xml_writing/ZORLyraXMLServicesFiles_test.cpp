#include <gtest/gtest.h>

#include <string>

#include "ZORClashParsing.h"
#include "ZORLyraXMLServices.h"
#include "platform/system/ZORFile.h"
#include "platform/xml/DOM_Document.h"
#include "platform/xml/ZORXMLParser.h"
#include "support/LoadedDocument.h"
#include "support/PlatformFolder.h"
#include "support/XMLText.h"

using support::Loaded;
using support::Parsed;
using support::WrittenText;

namespace fs = std::filesystem;

namespace {
const std::string kDeclaration = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>";
const std::string kFederator = "<FederatorClashElement><Elements/></FederatorClashElement>";
const std::string kStyleSheet = "<?xml-stylesheet type=\"text/xsl\" href=\"s.xsl\"?>";
const std::string kDocumentType = "<!DOCTYPE T SYSTEM \"d.dtd\">";

class Files : public testing::Test {
 protected:
  void SetUp() override {
    folder_.WriteCatalogue("ZORLyraNLSXMLEncoding",
                           "nlsEncoding = '<?xml version=\"1.0\" encoding=\"UTF-8\"?>'\n");
  }

  std::string FederatorText(const char* inDTD, const char* inStyleSheet, int inIndent = 1) {
    EXPECT_EQ(writer_.CreateNewFederatorDocument(path_.c_str(), inDTD, inStyleSheet, inIndent),
              S_OK);
    return support::ReadFile(path_);
  }

  /// What the dump of a node writes, with the type name T.
  std::string DumpText(const DOM_Node& inNode, const char* inDTD, const char* inStyleSheet,
                       int inPrologue, int inIndent = 1) {
    EXPECT_EQ(
        writer_.DumpDocument(inNode, path_.c_str(), inDTD, inStyleSheet, "T", inPrologue, inIndent),
        S_OK);
    return support::ReadFile(path_);
  }

  /// The end of a start tag in the form selected now.
  std::string SelectedForm() {
    ZORLyraXMLServices writer(noText_);
    writer.CloseXMLAttrMarkerWithElem();
    EXPECT_EQ(writer.DumpDocument(folder_.FilePath("form").c_str()), S_OK);
    return support::ReadFile(folder_.FilePath("form"));
  }

  support::PlatformFolder folder_;
  const std::string path_ = folder_.FilePath("document.xml");
  const ZORLyraXMLServices noText_;
  ZORLyraXMLServices writer_;
};

using FederatorDocument = Files;
using TextDump = Files;
using TreeDump = Files;
using FileCopy = Files;
}  // namespace

TEST_F(FederatorDocument, WithoutArgumentsIsDeclarationAndRootWithoutLineFeed) {
  EXPECT_EQ(FederatorText("", ""), kDeclaration + kFederator);
}

TEST_F(FederatorDocument, WithBothIsOneLineWithTheDocumentTypeFirst) {
  EXPECT_EQ(FederatorText("f.dtd", "f.xsl"),
            kDeclaration + "<!DOCTYPE FederatorClashElement SYSTEM \"f.dtd\">" +
                "<?xml-stylesheet type=\"text/xsl\" href=\"f.xsl\"?>" + kFederator);
}

TEST_F(FederatorDocument, WithOneOfTheTwo) {
  EXPECT_EQ(FederatorText("f.dtd", ""),
            kDeclaration + "<!DOCTYPE FederatorClashElement SYSTEM \"f.dtd\">" + kFederator);
  EXPECT_EQ(FederatorText("", "f.xsl"),
            kDeclaration + "<?xml-stylesheet type=\"text/xsl\" href=\"f.xsl\"?>" + kFederator);
}

TEST_F(FederatorDocument, IsTheSameForEveryIndent) {
  EXPECT_EQ(FederatorText("f.dtd", "f.xsl", 0), FederatorText("f.dtd", "f.xsl", 1));
}

TEST_F(FederatorDocument, SelectsTheFormOfAllWriters) {
  FederatorText("", "", 0);
  EXPECT_EQ(SelectedForm(), ">");
  FederatorText("", "", 1);
  EXPECT_EQ(SelectedForm(), "> \n");
}

TEST_F(FederatorDocument, WithoutCatalogueHasNoDeclaration) {
  folder_.DamageCatalogue("ZORLyraNLSXMLEncoding");
  EXPECT_EQ(FederatorText("", ""), kFederator);
}

TEST_F(FederatorDocument, IsWrittenInTheNarrowForm) {
  const std::string text = FederatorText("pi\u00e8ces.dtd", "");
  EXPECT_NE(text.find("SYSTEM \"pi\u00e8ces.dtd\""), std::string::npos) << text;
}

TEST_F(FederatorDocument, ReplacesAnOlderFile) {
  folder_.WriteFile("document.xml", std::string(1000, 'x'));
  EXPECT_EQ(FederatorText("", ""), kDeclaration + kFederator);
}

TEST_F(FederatorDocument, IsReadAsAFederatorWithoutLinks) {
  FederatorText("", "f.xsl");
  std::string path = path_;
  ZORClashParsing reader(path.data());
  ZORUnicodeString kind, reference, version;
  ASSERT_EQ(reader.LoadSequence(kind, reference, version), S_OK);
  EXPECT_STREQ(kind.ConvertToChar(), "FederatorClashElement");
  EXPECT_EQ(reader.GetListOfLinkedElements().getLength(), 0u);
  EXPECT_FALSE(reader.GetElementsNode().isNull());
}

TEST_F(FederatorDocument, InAMissingFolderFailsAndStillSelectsTheForm) {
  EXPECT_EQ(writer_.CreateNewFederatorDocument(folder_.FilePath("none/f.xml").c_str(), "", "", 0),
            E_FAIL);
  EXPECT_EQ(SelectedForm(), ">");
}

TEST_F(FederatorDocument, BelowAFileFails) {
  folder_.WriteFile("file", "");
  EXPECT_EQ(writer_.CreateNewFederatorDocument(folder_.FilePath("file/f.xml").c_str(), "", "", 1),
            E_FAIL);
}

TEST_F(FederatorDocument, WithoutPathFails) {
  EXPECT_EQ(writer_.CreateNewFederatorDocument("", "", "", 1), E_FAIL);
}

TEST_F(FederatorDocument, OnAFullDiskStillSucceeds) {
  if (!fs::exists("/dev/full")) GTEST_SKIP() << "no full device here";
  EXPECT_EQ(writer_.CreateNewFederatorDocument("/dev/full", "", "", 1), S_OK);
}

TEST_F(TextDump, OfNoTextMakesAnEmptyFile) {
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "");
}

TEST_F(TextDump, TwiceWritesTheSameText) {
  writer_.AddPCData("kept");
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(writer_.DumpDocument(folder_.FilePath("second").c_str()), S_OK);
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "kept");
  EXPECT_EQ(support::ReadFile(folder_.FilePath("second")), "kept");
}

TEST_F(TextDump, ReplacesALongerFile) {
  folder_.WriteFile("document.xml", std::string(1000, 'x'));
  writer_.AddPCData("short");
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "short");
}

TEST_F(TextDump, WritesSequencesOfUpToFourBytes) {
  writer_.AddPCData("a\u00e9\u20ac\U0001F600");
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST_F(TextDump, OfThreeByteCharactersFits) {
  std::string text;
  for (int i = 0; i < 10000; ++i) text += "\u20ac";
  writer_.AddPCData(text.c_str());
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), text);
}

TEST_F(TextDump, KeepsLineFeeds) {
  writer_.AddPCData("a\nb\r\n");
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "a\nb\r\n");
}

TEST_F(TextDump, ToANameBeyondASCII) {
  writer_.AddPCData("text");
  const std::string path = folder_.FilePath("r\u00e9sum\u00e9 \u65e5.xml");
  EXPECT_EQ(writer_.DumpDocument(path.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path), "text");
}

TEST_F(TextDump, InAMissingFolderGivesThePlatformsCode) {
  EXPECT_EQ(writer_.DumpDocument(folder_.FilePath("none/f.xml").c_str()), kZORFileNotFound);
}

TEST_F(TextDump, OntoAFolderGivesThePlatformsCode) {
  EXPECT_EQ(writer_.DumpDocument(folder_.path.string().c_str()), kZORFileIsDirectory);
}

TEST_F(TextDump, OnAFullDiskGivesThePlatformsCode) {
  if (!fs::exists("/dev/full")) GTEST_SKIP() << "no full device here";
  writer_.AddPCData("text");
  EXPECT_EQ(writer_.DumpDocument("/dev/full"), kZORFileDiskFull);
}

TEST_F(TextDump, KeepsTheTextAfterAFailure) {
  writer_.AddPCData("kept");
  EXPECT_LT(writer_.DumpDocument(folder_.FilePath("none/f.xml").c_str()), 0);
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "kept");
}

TEST_F(TreeDump, WithPrologueHasTheStyleSheetBeforeTheDocumentTypeOnLinesOfTheirOwn) {
  EXPECT_EQ(DumpText(Parsed("<A x='1'>text</A>"), "d.dtd", "s.xsl", 1),
            kDeclaration + "\n" + kStyleSheet + "\n" + kDocumentType + "\n<A x=\"1\">text</A>");
}

TEST_F(TreeDump, WithPrologueAlone) {
  EXPECT_EQ(DumpText(Parsed("<A/>"), "", "", 1), kDeclaration + "\n<A/>");
}

TEST_F(TreeDump, WithPrologueAndOneLine) {
  EXPECT_EQ(DumpText(Parsed("<A/>"), "d.dtd", "", 1),
            kDeclaration + "\n" + kDocumentType + "\n<A/>");
  EXPECT_EQ(DumpText(Parsed("<A/>"), "", "s.xsl", 1), kDeclaration + "\n" + kStyleSheet + "\n<A/>");
}

TEST_F(TreeDump, WithoutPrologueInsertsBehindTheFirstConstruct) {
  EXPECT_EQ(DumpText(Parsed("<A>text<B/></A>"), "d.dtd", "s.xsl", 0),
            "<A>\n" + kStyleSheet + "\n" + kDocumentType + "text<B/></A>");
}

// Long texts are encoded in slices; a character of two units may lie where one ends.
TEST_F(TreeDump, OfALongTextIsTheSerialisedNode) {
  for (const std::string shift : {"", "x"}) {
    std::string text = "<a k='" + shift;
    for (int i = 0; i < 100'000; ++i) text += "\xF0\x9F\x98\x80\xC3\xA9z";
    const DOM_Document document = Parsed(text + "'/>");
    EXPECT_TRUE(DumpText(document, "", "", 0) == WrittenText(document)) << shift;
  }
}

TEST_F(TreeDump, WithoutAnythingIsTheSerialisedNode) {
  const DOM_Document document = Parsed("<A x='1'><B/>t\u00e9xt</A>");
  EXPECT_EQ(DumpText(document, "", "", 0), WrittenText(document));
}

TEST_F(TreeDump, WithAnyPrologueFlagButOneHasNoDeclaration) {
  for (int flag : {0, 2, -1, 257})
    EXPECT_EQ(DumpText(Parsed("<A/>"), "", "", flag), "<A/>") << flag;
}

TEST_F(TreeDump, WithoutCatalogueHasALineFeedForPrologue) {
  folder_.DamageCatalogue("ZORLyraNLSXMLEncoding");
  EXPECT_EQ(DumpText(Parsed("<A/>"), "", "", 1), "\n<A/>");
  EXPECT_EQ(DumpText(Parsed("<A/>"), "d.dtd", "", 1), "\n<A/>\n" + kDocumentType);
}

TEST_F(TreeDump, OfTextWithoutAnyTagInsertsAtTheStart) {
  DOM_Document document = DOM_Document::createDocument();
  EXPECT_EQ(DumpText(document.createTextNode("plain"), "d.dtd", "s.xsl", 0),
            "\n" + kStyleSheet + "\n" + kDocumentType + "plain");
  EXPECT_EQ(DumpText(document.createTextNode("plain"), "", "", 0), "plain");
}

TEST_F(TreeDump, OfTextBehindADeclarationWithoutTagInsertsAtTheStart) {
  folder_.WriteCatalogue("ZORLyraNLSXMLEncoding", "nlsEncoding = 'head'\n");
  DOM_Document document = DOM_Document::createDocument();
  EXPECT_EQ(DumpText(document.createTextNode("plain"), "d.dtd", "", 1),
            "\n" + kDocumentType + "head\nplain");
}

TEST_F(TreeDump, WithAnEmptyTypeNameWritesAnEmptyName) {
  ASSERT_EQ(writer_.DumpDocument(Parsed("<A/>"), path_.c_str(), "d.dtd", "", "", 1, 1), S_OK);
  EXPECT_EQ(support::ReadFile(path_), kDeclaration + "\n<!DOCTYPE  SYSTEM \"d.dtd\">\n<A/>");
}

TEST_F(TreeDump, OfOneElementOfADocument) {
  const DOM_Document document = Parsed("<A><B y='2'/><C/></A>");
  EXPECT_EQ(DumpText(document.getDocumentElement().getFirstChild(), "", "", 1),
            kDeclaration + "\n<B y=\"2\"/>");
}

TEST_F(TreeDump, IsTheSameForEveryIndent) {
  const DOM_Document document = Parsed("<A><B/> <C/></A>");
  EXPECT_EQ(DumpText(document, "d.dtd", "s.xsl", 1, 0), DumpText(document, "d.dtd", "s.xsl", 1, 1));
}

TEST_F(TreeDump, SelectsTheFormOfAllWriters) {
  DumpText(Parsed("<A/>"), "", "", 1, 0);
  EXPECT_EQ(SelectedForm(), ">");
  DumpText(Parsed("<A/>"), "", "", 1, 1);
  EXPECT_EQ(SelectedForm(), "> \n");
}

TEST_F(TreeDump, LeavesTheTextOfTheWriter) {
  writer_.AddPCData("own");
  DumpText(Parsed("<A/>"), "", "", 1);
  EXPECT_EQ(writer_.DumpDocument(path_.c_str()), S_OK);
  EXPECT_EQ(support::ReadFile(path_), "own");
}

TEST_F(TreeDump, OfTextBeyondTheBasicPlane) {
  EXPECT_EQ(DumpText(Parsed("<A>\U0001F600\u20ac</A>"), "", "", 1),
            kDeclaration + "\n<A>\xF0\x9F\x98\x80\xE2\x82\xAC</A>");
}

TEST_F(TreeDump, OfANullNodeGivesTheSerialisersCodeAndLeavesTheFile) {
  folder_.WriteFile("document.xml", "old");
  EXPECT_EQ(writer_.DumpDocument(DOM_Node(), path_.c_str(), "", "", "", 1, 0), E_INVALIDARG);
  EXPECT_EQ(support::ReadFile(path_), "old");
  EXPECT_EQ(SelectedForm(), ">");
}

TEST_F(TreeDump, OfATreeThatNoXMLCanCarryGivesTheSerialisersCodeAndMakesNoFile) {
  DOM_Document document = Parsed("<A/>");
  document.getDocumentElement().appendChild(document.createComment("a--b"));
  EXPECT_EQ(writer_.DumpDocument(document, path_.c_str(), "", "", "", 1, 1), E_FAIL);
  EXPECT_FALSE(fs::exists(path_));
}

TEST_F(TreeDump, InAMissingFolderGivesThePlatformsCode) {
  EXPECT_EQ(
      writer_.DumpDocument(Parsed("<A/>"), folder_.FilePath("none/f").c_str(), "", "", "", 1, 1),
      kZORFileNotFound);
}

TEST_F(TreeDump, OnAFullDiskGivesThePlatformsCode) {
  if (!fs::exists("/dev/full")) GTEST_SKIP() << "no full device here";
  EXPECT_EQ(writer_.DumpDocument(Parsed("<A/>"), "/dev/full", "", "", "", 1, 1), kZORFileDiskFull);
}

TEST_F(TreeDump, OfEverySampleReadsBackAsTheSameTree) {
  int samples = 0;
  for (const auto& entry : fs::directory_iterator(ZOR_SOURCE_DIR "/samples")) {
    if (!entry.path().string().ends_with(".clash.xml")) continue;
    ++samples;
    const DOM_Document document = Loaded(entry.path().string());
    ASSERT_EQ(
        writer_.DumpDocument(document.getDocumentElement(), path_.c_str(), "", "s.xsl", "", 1, 0),
        S_OK);
    EXPECT_EQ(WrittenText(Loaded(path_).getDocumentElement()),
              WrittenText(document.getDocumentElement()))
        << entry.path();
  }
  EXPECT_EQ(samples, 6);
}

TEST_F(FileCopy, HasTheSameBytesUnderTheSameName) {
  const std::string bytes("a\0b\r\n\xFF", 6);
  folder_.WriteFile("from/picture.jpg", bytes);
  fs::create_directory(folder_.path / "to");
  EXPECT_EQ(writer_.CopyFile("picture.jpg", folder_.FilePath("from").c_str(),
                             folder_.FilePath("to").c_str()),
            S_OK);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("to/picture.jpg")), bytes);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("from/picture.jpg")), bytes);
}

TEST_F(FileCopy, TakesDirectoriesThatEndInASeparator) {
  folder_.WriteFile("from/a", "bytes");
  fs::create_directory(folder_.path / "to");
  EXPECT_EQ(
      writer_.CopyFile("a", folder_.FilePath("from/").c_str(), folder_.FilePath("to/").c_str()),
      S_OK);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("to/a")), "bytes");
}

TEST_F(FileCopy, TakesNamesBeyondASCII) {
  folder_.WriteFile("d\u00e9part/\u65e5.xml", "bytes");
  fs::create_directory(folder_.path / ZORFoundation::NativePath("arriv\u00e9e"));
  EXPECT_EQ(writer_.CopyFile("\u65e5.xml", folder_.FilePath("d\u00e9part").c_str(),
                             folder_.FilePath("arriv\u00e9e").c_str()),
            S_OK);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("arriv\u00e9e/\u65e5.xml")), "bytes");
}

TEST_F(FileCopy, ReplacesAnOlderTarget) {
  folder_.WriteFile("from/a", "new");
  folder_.WriteFile("to/a", "older and longer");
  EXPECT_EQ(writer_.CopyFile("a", folder_.FilePath("from").c_str(), folder_.FilePath("to").c_str()),
            S_OK);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("to/a")), "new");
}

TEST_F(FileCopy, OfAMissingFileGivesThePlatformsCodeAndLeavesTheTarget) {
  folder_.WriteFile("to/a", "old");
  EXPECT_EQ(writer_.CopyFile("a", folder_.FilePath("from").c_str(), folder_.FilePath("to").c_str()),
            kZORFileNotFound);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("to/a")), "old");
}

// The joined path is empty then, which no path may be.
TEST_F(FileCopy, OfPathsThatDoNotFitGivesThePlatformsCodeOfTheCopy) {
  const std::string longest(255, 'n');
  folder_.WriteFile(longest, "bytes");
  fs::create_directory(folder_.path / "to");
  EXPECT_EQ(writer_.CopyFile(longest.c_str(), folder_.path.string().c_str(),
                             folder_.FilePath("to").c_str()),
            kZORFileBadPath);
  EXPECT_TRUE(fs::is_empty(folder_.path / "to"));
}

// 259 bytes and the terminating zero.
TEST_F(FileCopy, OfPathsThatJustFit) {
  const std::string name(259 - folder_.path.string().size() - 4, 'n');
  ASSERT_LE(name.size(), 255u);
  folder_.WriteFile("to/" + name, "old");
  folder_.WriteFile("fr/" + name, "new");
  ASSERT_EQ(folder_.FilePath("to/" + name).size(), 259u);
  EXPECT_EQ(writer_.CopyFile(name.c_str(), folder_.FilePath("fr").c_str(),
                             folder_.FilePath("to").c_str()),
            S_OK);
  EXPECT_EQ(support::ReadFile(folder_.FilePath("to/" + name)), "new");
  EXPECT_EQ(writer_.CopyFile((name + "n").c_str(), folder_.FilePath("fr").c_str(),
                             folder_.FilePath("to").c_str()),
            kZORFileBadPath);
}
