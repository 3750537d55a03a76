// Building readers and loading documents.
#include <gtest/gtest.h>

#include <filesystem>
#include <thread>
#include <type_traits>
#include <vector>

#include "platform/xml/ZORXMLParseError.h"
#include "support/LoadedReader.h"
#include "support/PlatformFolder.h"

namespace {

using support::Attribute;
using support::ClashInfos;
using support::IthInterference;
using support::kUntouched;
using support::LoadedReader;
using support::Name;
using support::PlatformFolder;
using support::SharedReader;
using support::ShortInfos;
using support::Text;

/// The three texts of the first LoadSequence.
struct LoadedTexts {
  HRESULT Load(ZORClashParsing& ioReader) {
    return ioReader.LoadSequence(kind, reference, version);
  }
  ZORUnicodeString kind = kUntouched;
  ZORUnicodeString reference = kUntouched;
  ZORUnicodeString version = kUntouched;
};

// ---- Kinds

TEST(ZORClashParsing, LoadClashDocumentGivesKindReferenceAndVersion) {
  const LoadedReader reader("<ClashElement Version=\"1.2\" ZORDocument=\"doc 7\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("ClashElement", Text(reader.kind));
  EXPECT_EQ("doc 7", Text(reader.reference));
  EXPECT_EQ("1.2", Text(reader.version));
}

TEST(ZORClashParsing, LoadSingleInterferenceDocumentGivesKindReferenceAndVersion) {
  const LoadedReader reader("<InterferenceElement Version=\"1.3\" ZORDocument=\"single\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("InterferenceElement", Text(reader.kind));
  EXPECT_EQ("single", Text(reader.reference));
  EXPECT_EQ("1.3", Text(reader.version));
}

TEST(ZORClashParsing, LoadFederatorDocumentGivesKindReferenceAndVersion) {
  const LoadedReader reader("<FederatorClashElement Version=\"2\" ZORDocument=\"all\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("FederatorClashElement", Text(reader.kind));
  EXPECT_EQ("all", Text(reader.reference));
  EXPECT_EQ("2", Text(reader.version));
}

TEST(ZORClashParsing, LoadWithoutVersionReportsOneDotOne) {
  EXPECT_EQ("1.1", Text(LoadedReader("<ClashElement/>").version));
  EXPECT_EQ("1.1", Text(LoadedReader("<InterferenceElement/>").version));
  EXPECT_EQ("1.1", Text(LoadedReader("<FederatorClashElement/>").version));
}

TEST(ZORClashParsing, LoadEmptyVersionCountsAsMissing) {
  EXPECT_EQ("1.1", Text(LoadedReader("<ClashElement Version=\"\"/>").version));
}

TEST(ZORClashParsing, LoadBlankVersionIsNotEmpty) {
  EXPECT_EQ(" ", Text(LoadedReader("<ClashElement Version=\" \"/>").version));
}

TEST(ZORClashParsing, LoadWithoutReferenceEmptiesIt) {
  EXPECT_EQ("", Text(LoadedReader("<ClashElement/>").reference));
}

TEST(ZORClashParsing, LoadComponentListEmptiesReferenceAndLeavesVersion) {
  const LoadedReader reader("<Components Version=\"1.2\" ZORDocument=\"doc\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("Components", Text(reader.kind));
  EXPECT_EQ("", Text(reader.reference));
  EXPECT_EQ(kUntouched, Text(reader.version));
}

TEST(ZORClashParsing, LoadErrorReportEmptiesReferenceAndLeavesVersion) {
  const LoadedReader reader("<Errors Version=\"1.2\" ZORDocument=\"doc\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("Errors", Text(reader.kind));
  EXPECT_EQ("", Text(reader.reference));
  EXPECT_EQ(kUntouched, Text(reader.version));
}

TEST(ZORClashParsing, LoadOtherRootIsUnknownAndNoFailure) {
  const LoadedReader reader("<Drawing Version=\"1.2\" ZORDocument=\"doc\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("Unknown", Text(reader.kind));
  EXPECT_EQ("", Text(reader.reference));
  EXPECT_EQ(kUntouched, Text(reader.version));
}

TEST(ZORClashParsing, LoadRootOfOtherLetterCaseIsUnknown) {
  EXPECT_EQ("Unknown", Text(LoadedReader("<clashElement/>").kind));
  EXPECT_EQ("Unknown", Text(LoadedReader("<CLASHELEMENT/>").kind));
  EXPECT_EQ("Unknown", Text(LoadedReader("<errors/>").kind));
  EXPECT_EQ("Unknown", Text(LoadedReader("<components/>").kind));
}

TEST(ZORClashParsing, LoadPrefixedRootIsUnknown) {
  EXPECT_EQ("Unknown", Text(LoadedReader("<z:ClashElement xmlns:z=\"urn:z\"/>").kind));
}

TEST(ZORClashParsing, LoadUnknownRootKeepsItsChildren) {
  LoadedReader reader("<Drawing><Sheet/><Sheet/></Drawing>");
  EXPECT_EQ(2, reader->GetNbProd());
}

// ---- The document type is read and never enforced

TEST(ZORClashParsing, LoadIgnoresWhatTheDocumentTypeDemands) {
  LoadedReader reader(
      "<!DOCTYPE ClashElement [<!ELEMENT ClashElement EMPTY>]>"
      "<ClashElement Version=\"1.2\"><Unheard Of=\"it\"/></ClashElement>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("ClashElement", Text(reader.kind));
  EXPECT_EQ(1, reader->GetNbProd());
}

TEST(ZORClashParsing, LoadDoesNotNeedTheDocumentTypesFile) {
  const LoadedReader reader(
      "<!DOCTYPE ClashElement SYSTEM \"no/such/file.dtd\"><ClashElement Version=\"1.2\"/>");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ("ClashElement", Text(reader.kind));
}

// ---- Files

TEST(ZORClashParsing, LoadFileReadsIt) {
  const PlatformFolder folder;
  folder.WriteFile("a.xml", "<ClashElement Version=\"1.2\" ZORDocument=\"on disk\"/>");
  std::string path = folder.FilePath("a.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  EXPECT_EQ(S_OK, texts.Load(reader));
  EXPECT_EQ("ClashElement", Text(texts.kind));
  EXPECT_EQ("on disk", Text(texts.reference));
  EXPECT_EQ("1.2", Text(texts.version));
}

TEST(ZORClashParsing, LoadMissingFileFailsAndOnlyEmptiesTheReference) {
  const PlatformFolder folder;
  std::string path = folder.FilePath("missing.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  EXPECT_EQ(E_FAIL, texts.Load(reader));
  EXPECT_EQ(kUntouched, Text(texts.kind));
  EXPECT_EQ("", Text(texts.reference));
  EXPECT_EQ(kUntouched, Text(texts.version));
}

TEST(ZORClashParsing, LoadMissingFileAsDocumentFailsAndTouchesNothing) {
  const PlatformFolder folder;
  std::string path = folder.FilePath("missing.xml");
  ZORClashParsing reader(path.data());
  DOM_Document document;
  ZORUnicodeString kind = kUntouched;
  EXPECT_EQ(E_FAIL, reader.LoadSequence(document, kind));
  EXPECT_EQ(kUntouched, Text(kind));
  EXPECT_TRUE(document.isNull());
}

TEST(ZORClashParsing, LoadAgainFromAFileThatHasGoneKeepsRootAndKind) {
  const PlatformFolder folder;
  folder.WriteFile("a.xml", "<ClashElement PRCName=\"p\"><Date/></ClashElement>");
  std::string path = folder.FilePath("a.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  std::filesystem::remove(path);
  EXPECT_EQ(E_FAIL, texts.Load(reader));
  EXPECT_EQ("p", Text(reader.GetPRCName()));
  EXPECT_EQ(1u, reader.GetNodeList().getLength());
}

TEST(ZORClashParsing, LoadAgainParsesTheChangedFile) {
  const PlatformFolder folder;
  folder.WriteFile("a.xml", "<ClashElement><Date/></ClashElement>");
  std::string path = folder.FilePath("a.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  folder.WriteFile("a.xml", "<Components><Component Alias=\"c\"/><Component/></Components>");
  ASSERT_EQ(S_OK, texts.Load(reader));
  EXPECT_EQ("Components", Text(texts.kind));
  EXPECT_EQ(2, reader.GetNbProd());
  EXPECT_EQ("c", Text(reader.GetPrdId(0)));
  EXPECT_TRUE(reader.GetNodeList().isNull());
}

TEST(ZORClashParsing, LoadEmptyFileFailsWithUnknownKind) {
  const PlatformFolder folder;
  folder.WriteFile("empty.xml", "");
  std::string path = folder.FilePath("empty.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  EXPECT_EQ(E_FAIL, texts.Load(reader));
  EXPECT_EQ("Unknown", Text(texts.kind));
  EXPECT_EQ("", Text(texts.reference));
  EXPECT_EQ(kUntouched, Text(texts.version));
}

TEST(ZORClashParsing, LoadEmptyFileAsDocumentFailsAndLeavesTheKind) {
  const PlatformFolder folder;
  folder.WriteFile("empty.xml", "");
  std::string path = folder.FilePath("empty.xml");
  ZORClashParsing reader(path.data());
  DOM_Document document;
  ZORUnicodeString kind = kUntouched;
  EXPECT_EQ(E_FAIL, reader.LoadSequence(document, kind));
  EXPECT_EQ(kUntouched, Text(kind));
  EXPECT_TRUE(document.getDocumentElement().isNull());
}

TEST(ZORClashParsing, LoadDirectoryRaisesTheParsersError) {
  const PlatformFolder folder;
  std::string path = folder.path.string();
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  EXPECT_THROW(texts.Load(reader), ZORXMLParseError);
}

TEST(ZORClashParsing, LoadFileOfAnotherEncodingReadsItsTexts) {
  const PlatformFolder folder;
  folder.WriteFile("latin.xml",
                   "<?xml version=\"1.0\" encoding=\"ISO-8859-1\"?>"
                   "<ClashElement ZORDocument=\"pi\xE8"
                   "ce\"/>");
  std::string path = folder.FilePath("latin.xml");
  ZORClashParsing reader(path.data());
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  EXPECT_EQ("pièce", Text(texts.reference));
}

// ---- Buffers

TEST(ZORClashParsing, LoadBufferReadsOnlyItsLength) {
  std::string text = "<ClashElement PRCName=\"p\"/>and this is beyond its length";
  ZORClashParsing reader(text.data(), 27);
  LoadedTexts texts;
  EXPECT_EQ(S_OK, texts.Load(reader));
  EXPECT_EQ("p", Text(reader.GetPRCName()));
}

TEST(ZORClashParsing, LoadNullBufferWithALengthGivesThePlatformsCode) {
  ZORClashParsing reader(nullptr, 5);
  LoadedTexts texts;
  EXPECT_EQ(E_INVALIDARG, texts.Load(reader));
  EXPECT_EQ(kUntouched, Text(texts.kind));
  EXPECT_EQ("", Text(texts.reference));
  EXPECT_EQ(kUntouched, Text(texts.version));
}

TEST(ZORClashParsing, LoadNullBufferWithALengthAsDocumentGivesThePlatformsCode) {
  ZORClashParsing reader(nullptr, 5);
  DOM_Document document;
  ZORUnicodeString kind = kUntouched;
  EXPECT_EQ(E_INVALIDARG, reader.LoadSequence(document, kind));
  EXPECT_EQ(kUntouched, Text(kind));
  EXPECT_TRUE(document.isNull());
}

TEST(ZORClashParsing, LoadBufferOfNegativeLengthGivesThePlatformsCode) {
  std::string text = "<ClashElement/>";
  ZORClashParsing reader(text.data(), -1);
  LoadedTexts texts;
  EXPECT_EQ(E_INVALIDARG, texts.Load(reader));
}

TEST(ZORClashParsing, LoadEmptyBufferFailsWithUnknownKind) {
  const LoadedReader reader("");
  EXPECT_EQ(E_FAIL, reader.result);
  EXPECT_EQ("Unknown", Text(reader.kind));
  EXPECT_EQ("", Text(reader.reference));
  EXPECT_EQ(kUntouched, Text(reader.version));
}

// Unlike an empty file: the answer is that of the buffer's source.
TEST(ZORClashParsing, LoadEmptyBufferAsDocumentSucceedsWithoutRoot) {
  const SharedReader reader("");
  EXPECT_EQ(S_OK, reader.result);
  EXPECT_EQ(kUntouched, Text(reader.kind));
  EXPECT_TRUE(reader.root.isNull());
}

TEST(ZORClashParsing, LoadMalformedBufferRaisesTheParsersErrorWithTheBuffersName) {
  std::string text = "<ClashElement>\n<Date>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  LoadedTexts texts;
  try {
    texts.Load(reader);
    FAIL() << "a document that ends too early was read";
  } catch (const ZORXMLParseError& error) {
    EXPECT_EQ("LIDPipodIBM", error.source);
    EXPECT_EQ(2u, error.line);
  }
  EXPECT_EQ(kUntouched, Text(texts.kind));
  EXPECT_EQ("", Text(texts.reference));
  EXPECT_EQ(0, reader.GetNbProd());
}

TEST(ZORClashParsing, LoadAgainMalformedKeepsTheFormerRootAndKind) {
  std::string text = "<ClashElement PRCName=\"p\"/>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  text.replace(0, 1, "x");
  EXPECT_THROW(texts.Load(reader), ZORXMLParseError);
  EXPECT_EQ("p", Text(reader.GetPRCName()));
  EXPECT_FALSE(reader.GetNodeList().isNull());
}

TEST(ZORClashParsing, LoadAgainParsesTheChangedBuffer) {
  std::string text = "<ClashElement><Date/></ClashElement>";
  const std::string errors = "<Errors><Error ErrorId='4'/></Errors>";
  text.resize(errors.size(), ' ');
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  ASSERT_EQ(1u, reader.GetNodeList().getLength());
  text.replace(0, text.size(), errors);
  ASSERT_EQ(S_OK, texts.Load(reader));
  EXPECT_EQ("Errors", Text(texts.kind));
  EXPECT_TRUE(reader.GetNodeList().isNull());
  ZORUnicodeString message;
  int id = 0;
  reader.GetErrorId(message, id);
  EXPECT_EQ(4, id);
}

TEST(ZORClashParsing, LoadNeitherChangesNorFreesTheBuffer) {
  std::string text = "<ClashElement PRCName=\"p\"/>";
  const std::string before = text;
  {
    ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
    LoadedTexts texts;
    ASSERT_EQ(S_OK, texts.Load(reader));
  }
  EXPECT_EQ(before, text);
}

TEST(ZORClashParsing, AnswersDoNotNeedTheBufferAfterLoading) {
  std::string text = "<ClashElement PRCName=\"p\"><Date Day=\"20\"/></ClashElement>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  LoadedTexts texts;
  ASSERT_EQ(S_OK, texts.Load(reader));
  text.assign(text.size(), 'x');
  EXPECT_EQ("p", Text(reader.GetPRCName()));
  EXPECT_EQ("20", Attribute(reader.GetNodeList().item(0), "Day"));
}

// ---- Loading as a document

TEST(ZORClashParsing, LoadAsDocumentGivesTheRootsNameWhateverItIs) {
  EXPECT_EQ("ClashElement", Text(SharedReader("<ClashElement/>").kind));
  EXPECT_EQ("Drawing", Text(SharedReader("<Drawing/>").kind));
  EXPECT_EQ(S_OK, SharedReader("<Drawing/>").result);
}

TEST(ZORClashParsing, LoadAsDocumentKeepsTheKindForLaterQuestions) {
  SharedReader clash("<ClashElement><Date/></ClashElement>");
  EXPECT_EQ(1u, clash->GetNodeList().getLength());
  SharedReader federator("<FederatorClashElement><Elements/></FederatorClashElement>");
  EXPECT_EQ("Elements", Name(federator->GetElementsNode()));
}

TEST(ZORClashParsing, LoadAsDocumentFromAFileReadsIt) {
  const PlatformFolder folder;
  folder.WriteFile("a.xml", "<Drawing Scale=\"1:2\"/>");
  std::string path = folder.FilePath("a.xml");
  ZORClashParsing reader(path.data());
  DOM_Document document;
  ZORUnicodeString kind;
  EXPECT_EQ(S_OK, reader.LoadSequence(document, kind));
  EXPECT_EQ("Drawing", Text(kind));
  EXPECT_EQ("1:2", Attribute(document.getDocumentElement(), "Scale"));
}

TEST(ZORClashParsing, DocumentOutlivesItsReader) {
  DOM_Document document;
  {
    SharedReader reader("<ClashElement><Date Day=\"20\"/></ClashElement>");
    document = reader.document;
  }
  EXPECT_EQ("20", Attribute(document.getDocumentElement().getFirstChild(), "Day"));
}

TEST(ZORClashParsing, ReaderKeepsItsDocumentAlive) {
  std::string text = "<ClashElement PRCName=\"p\"><Date Day=\"20\"/></ClashElement>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  {
    DOM_Document document;
    ZORUnicodeString kind;
    ASSERT_EQ(S_OK, reader.LoadSequence(document, kind));
  }
  EXPECT_EQ("p", Text(reader.GetPRCName()));
  EXPECT_EQ("20", Attribute(reader.GetNodeList().item(0), "Day"));
}

TEST(ZORClashParsing, LoadAgainAsDocumentWithoutRootLosesTheRootAndKeepsTheKind) {
  const PlatformFolder folder;
  folder.WriteFile("a.xml",
                   "<FederatorClashElement PRCName=\"p\"><Elements/></FederatorClashElement>");
  std::string path = folder.FilePath("a.xml");
  ZORClashParsing reader(path.data());
  DOM_Document document;
  ZORUnicodeString kind;
  ASSERT_EQ(S_OK, reader.LoadSequence(document, kind));
  folder.WriteFile("a.xml", "");
  EXPECT_EQ(E_FAIL, reader.LoadSequence(document, kind));
  EXPECT_EQ("FederatorClashElement", Text(kind));
  EXPECT_EQ("", Text(reader.GetPRCName()));
  EXPECT_TRUE(reader.GetElementsNode().isNull());
  EXPECT_TRUE(reader.GetNodeList().isNull());
}

// ---- Building and copying

TEST(ZORClashParsing, OnlyTheDestructorIsVirtual) {
  EXPECT_TRUE(std::has_virtual_destructor_v<ZORClashParsing>);
}

TEST(ZORClashParsing, CopyHasNoDocument) {
  LoadedReader reader("<ClashElement PRCName=\"p\"><Date/></ClashElement>");
  ZORClashParsing copy(*reader);
  EXPECT_EQ(0, copy.GetNbProd());
  EXPECT_EQ("", Text(copy.GetPRCName()));
  EXPECT_TRUE(copy.GetNodeList().isNull());
  EXPECT_EQ("p", Text(reader->GetPRCName()));
}

TEST(ZORClashParsing, CopyHasNoSource) {
  LoadedReader reader("<ClashElement/>");
  ZORClashParsing copy(*reader);
  LoadedTexts texts;
  EXPECT_EQ(E_FAIL, texts.Load(copy));
  EXPECT_EQ("Unknown", Text(texts.kind));
}

TEST(ZORClashParsing, AssignmentChangesNothing) {
  LoadedReader first("<ClashElement PRCName=\"first\"/>");
  LoadedReader second("<ClashElement PRCName=\"second\"/>");
  ZORClashParsing& result = (*first = *second);
  EXPECT_EQ(&*first, &result);
  EXPECT_EQ("first", Text(first->GetPRCName()));
  EXPECT_EQ("second", Text(second->GetPRCName()));
  LoadedTexts texts;
  EXPECT_EQ(S_OK, texts.Load(*first));
  EXPECT_EQ("first", Text(first->GetPRCName()));
}

TEST(ZORClashParsing, QuestionsBeforeLoadingAnswerAsForAMissingRoot) {
  std::string text = "<ClashElement/>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  EXPECT_TRUE(reader.GetNodeList().isNull());
  EXPECT_TRUE(reader.GetElementsNode().isNull());
  EXPECT_EQ(0, reader.IsValideNode(0, "Date"));
  EXPECT_EQ(0, reader.IsValideNode(0, 0, ""));
  EXPECT_EQ("", Text(reader.GetServerMarker()));
  EXPECT_EQ("", Text(reader.GetTransaction()));
  EXPECT_EQ("", Text(reader.GetPRCName()));
  EXPECT_EQ(0, reader.GetNbProd());
  EXPECT_EQ("", Text(reader.GetPrdId(0)));
  EXPECT_EQ("", Text(reader.GetPrdName(0)));
  EXPECT_EQ("", Text(reader.GetPrdType(0)));
  EXPECT_EQ("", Text(reader.GetAttrValue(0, "a")));
  EXPECT_EQ("", Text(reader.GetCompoAttr(0, "a")));
  EXPECT_EQ(0, reader.GetNbRealAttr(0));
  EXPECT_EQ(0, reader.GetNbShapes(0));
  EXPECT_EQ("", Text(reader.GetShapeAttrValue(0, 0, "a")));
  EXPECT_EQ(0u, reader.GetListOfLinkedElements().getLength());
  EXPECT_EQ(E_FAIL, IthInterference().Read(reader, 1).result);
  int count = 7;
  reader.GetSpecInfos(count);
  EXPECT_EQ(0, count);
}

TEST(ZORClashParsing, QuestionsBeforeLoadingLeaveOutputsUntouched) {
  std::string text = "<ClashElement/>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  ZORUnicodeString a = kUntouched, b = kUntouched, c = kUntouched;
  int count = 7;
  DOM_Node date, specification;
  reader.GetClashGeneralInfos(a, b, date, specification, count, c);
  reader.GetClashGeneralInfos(a, count);
  reader.GetSetOfRealAttr(0, 1, a, b, c);
  EXPECT_EQ(kUntouched, Text(a));
  EXPECT_EQ(kUntouched, Text(b));
  EXPECT_EQ(kUntouched, Text(c));
  EXPECT_EQ(7, count);
  EXPECT_EQ((std::array<std::string, 5>{kUntouched, kUntouched, kUntouched, "", ""}),
            ShortInfos().Read(reader, 1).Texts());
  EXPECT_EQ(kUntouched, support::SpecifiedProducts().Read(reader, 1).Texts()[0]);
}

// Before loading the kind is empty, and so not that of a clash document.
TEST(ZORClashParsing, FullInfosBeforeLoadingEmptyTheResultName) {
  std::string text = "<ClashElement/>";
  ZORClashParsing reader(text.data(), static_cast<int>(text.size()));
  ClashInfos infos;
  infos.Read(reader, "1.2", 1);
  EXPECT_EQ("", Text(infos.resultName));
  for (int number = 1; number <= 41; ++number) {
    const bool reset = number == 8 || number == 9 || number == 13 || number == 14;
    EXPECT_EQ(reset ? "" : kUntouched, infos[number]) << number;
  }
}

// ---- The reader as an object

// Hosts make readers by value, so that nothing may be added to these fields.
struct GivenFields {
  virtual ~GivenFields() = default;
  char* path;
  char* buffer;
  int bufferLength;
  ZORUnicodeString documentKind;
  DOM_Element root;
};
static_assert(sizeof(ZORClashParsing) == sizeof(GivenFields));

TEST(ZORClashParsing, ReadersOnDifferentThreadsDoNotDisturbEachOther) {
  const auto loadAndRead = [](int inCount) {
    std::string text = "<ClashElement><ClashResult>";
    for (int i = 0; i < inCount; ++i) text += "<Interference/>";
    text += "</ClashResult></ClashElement>";
    for (int round = 0; round < 50; ++round) {
      LoadedReader reader(text);
      EXPECT_EQ(S_OK, IthInterference().Read(*reader, inCount).result);
      EXPECT_EQ(E_FAIL, IthInterference().Read(*reader, inCount + 1).result);
    }
  };
  std::vector<std::thread> threads;
  for (int count = 1; count <= 4; ++count) threads.emplace_back(loadAndRead, count);
  for (std::thread& thread : threads) thread.join();
}

}  // namespace
