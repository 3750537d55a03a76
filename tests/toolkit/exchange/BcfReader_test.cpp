#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <pugixml.hpp>

#include "toolkit/Error.h"
#include "toolkit/exchange/ExchangeLibrary.h"
#include "toolkit/exchange/WrittenArchive.h"
#include "toolkit/exchange/bcf/BcfFile.h"

using namespace ZORToolkit;
using testing::AllOf;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

extern "C" WriteArchiveFunction ZORWriteArchive;

namespace {

constexpr char kVersion21[] = R"(<Version VersionId="2.1"/>)";

std::string Markup(const std::string& inGuid, const std::string& inTitle,
                   const std::string& inRest = {}) {
  return "<Markup><Topic Guid=\"" + inGuid + "\" TopicType=\"Clash\" TopicStatus=\"Open\"><Title>" +
         inTitle + "</Title></Topic>" + inRest + "</Markup>";
}

/// Why a file is refused; empty when it is not. Every reason is one line that names the file.
std::string Refusal(const std::string& inPath) {
  try {
    ReadBcf(inPath);
    return {};
  } catch (const Error& error) {
    EXPECT_THAT(error.what(), AllOf(StartsWith(inPath + ": "), Not(HasSubstr("\n"))));
    return error.what();
  }
}

std::size_t Count(const pugi::xml_document& inXml, const char* inPath) {
  return inXml.select_nodes(inPath).size();
}

/// What another XML reader counts in the topic of a markup.
void ExpectCounts(const BcfTopic& inTopic, const std::string& inMarkup) {
  pugi::xml_document xml;
  ASSERT_TRUE(xml.load_buffer(inMarkup.data(), inMarkup.size()));
  const pugi::xml_node topic = xml.child("Markup").child("Topic");
  EXPECT_EQ(inTopic.guid, topic.attribute("Guid").value());
  EXPECT_EQ(inTopic.status, topic.attribute("TopicStatus").value());
  EXPECT_EQ(inTopic.type, topic.attribute("TopicType").value());
  EXPECT_EQ(inTopic.title, topic.child_value("Title"));
  EXPECT_EQ(inTopic.assignedTo, topic.child_value("AssignedTo"));
  EXPECT_EQ(inTopic.comments.size(), Count(xml, "//Comment[@Guid]"));
  EXPECT_EQ(inTopic.viewpoints.size(), Count(xml, "//Viewpoints[@Guid]|//ViewPoint[@Guid]"));
  EXPECT_EQ(static_cast<std::size_t>(inTopic.Snapshots()), Count(xml, "//Snapshot"));
  EXPECT_EQ(inTopic.labels.size(), Count(xml, "//Labels[not(*) and text()]|//Label"));
  EXPECT_EQ(inTopic.documents.size(), Count(xml, "//DocumentReference"));
  EXPECT_EQ(inTopic.relatedTopics.size(), Count(xml, "//RelatedTopic"));
}

void ExpectCounts(const BcfView& inView, const std::string& inFile) {
  pugi::xml_document xml;
  ASSERT_TRUE(xml.load_buffer(inFile.data(), inFile.size()));
  EXPECT_EQ(inView.selection.size(), Count(xml, "//Selection/Component"));
  EXPECT_EQ(inView.exceptions.size(), Count(xml, "//Exceptions/Component"));
  EXPECT_EQ(inView.colouring.size(), Count(xml, "//Color[@Color]"));
  EXPECT_EQ(static_cast<std::size_t>(inView.lines), Count(xml, "//Line"));
  EXPECT_EQ(static_cast<std::size_t>(inView.clippingPlanes), Count(xml, "//ClippingPlane"));
  const pugi::xml_node camera = xml.select_node("//PerspectiveCamera|//OrthogonalCamera").node();
  ASSERT_EQ(inView.camera.has_value(), !camera.empty());
  if (!inView.camera) return;
  EXPECT_EQ(inView.camera->point[1], camera.child("CameraViewPoint").child("Y").text().as_double());
  EXPECT_EQ(inView.camera->fieldOfView, camera.child("FieldOfView").text().as_double());
  for (const BcfComponent& component : inView.selection) EXPECT_EQ(component.ifcGuid.size(), 22u);
}

}  // namespace

TEST(BcfReader, ReadsEveryOfficialCaseAsAnotherReaderDoes) {
  if (OfficialFolder().empty()) GTEST_SKIP() << "the official cases are not beside the project";
  std::size_t topics = 0, components = 0;
  for (const auto& file : std::filesystem::directory_iterator(OfficialFolder() + "/cases")) {
    SCOPED_TRACE(file.path());
    const BcfProject project = ReadBcf(file.path().string());
    EXPECT_THAT(file.path().filename().string(), StartsWith(project.version + "_"));
    const auto entries = ReadArchive(file.path().string());
    for (const BcfTopic& topic : project.topics) {
      ++topics;
      ExpectCounts(topic, entries.at(topic.folder + "/markup.bcf"));
      for (const BcfViewpoint& viewpoint : topic.viewpoints) {
        ASSERT_TRUE(viewpoint.hasFile && viewpoint.hasSnapshot) << viewpoint.guid;
        ExpectCounts(viewpoint.view, entries.at(topic.folder + "/" + viewpoint.file));
        components += viewpoint.view.selection.size() + viewpoint.view.exceptions.size();
      }
    }
  }
  EXPECT_GE(topics, 20u);
  EXPECT_GE(components, 100u);
}

TEST(BcfReader, TakesWhatDeviatesFromTheFormat) {
  const BcfProject project = ReadBcf(
      WriteArchive("deviating.zip",
                   {{"extra/", ""},
                    {"extra\\ABC\\Markup.BCF",
                     "\xEF\xBB\xBF" + Markup("ABCDEF00-1111-2222-3333-444455556666", " A\n")},
                    {"extra\\ABC\\VIEWPOINT.bcfv", "<VisualizationInfo/>"},
                    {"extra\\ABC\\snapshot.png", "P"},
                    {"extra/notes/readme.txt", "not a topic"},
                    {"extra/x/markup.bcf",
                     "<b:Markup xmlns:b='u'><b:Topic><b:Title>B</b:Title><b:Labels>one</b:Labels>"
                     "<b:Labels><b:Label>two</b:Label></b:Labels></b:Topic></b:Markup>"}}));
  EXPECT_EQ(project.version, "2.1");
  EXPECT_EQ(project.name, "");
  ASSERT_EQ(project.topics.size(), 2u);
  EXPECT_EQ(project.topics[0].guid, "ABCDEF00-1111-2222-3333-444455556666");
  EXPECT_EQ(project.topics[0].title, "A");
  ASSERT_EQ(project.topics[0].viewpoints.size(), 1u);
  EXPECT_TRUE(project.topics[0].viewpoints[0].hasFile);
  EXPECT_EQ(project.topics[0].Snapshots(), 1);
  EXPECT_EQ(project.topics[1].guid, "x");
  EXPECT_EQ(project.topics[1].title, "B");
  EXPECT_THAT(project.topics[1].labels, ElementsAre("one", "two"));
}

TEST(BcfReader, TakesUtf16AndTheStructureOfEachVersion) {
  const std::string ascii = Markup("1", "T");
  std::string wide = "\xFF\xFE";
  for (const char byte : ascii) wide.append({byte, '\0'});
  const BcfProject project = ReadBcf(WriteArchive(
      "versions.bcfzip",
      {{"a/markup.bcf", wide},
       {"b/markup.bcf",
        "<Markup><Topic Guid='2'><Comments><Comment Guid='c'><Comment>text</Comment></Comment>"
        "</Comments><Viewpoints><ViewPoint Guid='v'><Snapshot>s.png</Snapshot></ViewPoint>"
        "</Viewpoints></Topic></Markup>"},
       {"c/markup.bcf",
        Markup("3", "old",
               "<Comment Guid='d'><VerbalStatus>x</VerbalStatus><Comment/></Comment>"
               "<Viewpoints Guid='w'><Viewpoint>w.bcfv</Viewpoint></Viewpoints>")},
       {"c/w.bcfv",
        "<VisualizationInfo><Components><Component IfcGuid='i' Selected='true' Color='FF0000'/>"
        "<Component IfcGuid='j' Visible='false'/></Components></VisualizationInfo>"}}));
  EXPECT_EQ(project.version, "3.0");
  ASSERT_EQ(project.topics.size(), 3u);
  EXPECT_EQ(project.topics[0].title, "T");
  EXPECT_EQ(project.topics[1].comments[0].text, "text");
  EXPECT_FALSE(project.topics[1].viewpoints[0].hasSnapshot);
  EXPECT_EQ(project.topics[2].comments.size(), 1u);
  const BcfView& old = project.topics[2].viewpoints[0].view;
  EXPECT_EQ(old.selection.size(), 1u);
  EXPECT_EQ(old.exceptions.size(), 1u);
  EXPECT_EQ(old.colouring[0].colour, "FF0000");
}

TEST(BcfReader, RefusesWhatIsNoBcfFile) {
  EXPECT_THAT(Refusal(WriteBytes("text.bcf", "<Markup/>")), HasSubstr("is no zip archive"));
  EXPECT_THAT(Refusal(WriteBytes("empty.bcf", "")), HasSubstr("is no zip archive"));
  EXPECT_THAT(Refusal(WriteArchive("other.bcf", {{"word/document.xml", "<a/>"}})),
              HasSubstr("neither bcf.version nor a topic"));
  EXPECT_THAT(Refusal(testing::TempDir() + "missing.bcf"), HasSubstr("No such file"));
}

TEST(BcfReader, RefusesBrokenArchives) {
  std::string noise;
  for (unsigned int i = 0, state = 1; i < 5000; ++i, state = state * 1664525 + 1013904223)
    noise += static_cast<char>(state >> 24);
  const std::string good = ReadBytes(WriteArchive(
      "good.bcf",
      {{"bcf.version", kVersion21}, {"a/markup.bcf", Markup("1", "T")}, {"a/s.png", noise}}));
  EXPECT_THAT(Refusal(WriteBytes("cut.bcf", good.substr(0, good.size() / 2))),
              HasSubstr("is no zip archive"));
  std::string damaged = good;
  damaged[good.find("a/s.png") + 2000] ^= 0x10;
  EXPECT_THAT(Refusal(WriteBytes("damaged.bcf", damaged)),
              HasSubstr("the entry \"a/s.png\" cannot be read"));
  EXPECT_THAT(Refusal(WriteArchive("halfxml.bcf", {{"a/markup.bcf", "<Markup><Topic>"}})),
              HasSubstr("a/markup.bcf:1:"));
  EXPECT_THAT(Refusal(WriteArchive("locked.bcf", {{"bcf.version", kVersion21}}, true)),
              HasSubstr("is encrypted"));
}

TEST(BcfReader, RefusesNamesThatLeadOutside) {
  for (const char* name : {"../markup.bcf", "a/../../b", "/etc/passwd", "C:\\x", "a\\..\\..\\b"})
    EXPECT_THAT(Refusal(WriteArchive("climbing.bcf", {{"bcf.version", kVersion21}, {name, "x"}})),
                HasSubstr("leads out of the archive"))
        << name;
}

TEST(BcfReader, RefusesExternalEntitiesAndEveryDocumentType) {
  const std::string secret = WriteBytes("secret.txt", "secret");
  EXPECT_NE(Refusal(WriteArchive("entity.bcf",
                                 {{"a/markup.bcf", "<!DOCTYPE Markup [<!ENTITY e SYSTEM 'file://" +
                                                       secret + "'>]>" + Markup("1", "&e;")}})),
            "");
  EXPECT_THAT(Refusal(WriteArchive(
                  "laughs.bcf", {{"bcf.version", "<!DOCTYPE Version><Version VersionId='2.1'/>"}})),
              HasSubstr("has a document type"));
}

TEST(BcfReader, RefusesArchivesThatAreTooLarge) {
  const std::string zeros(std::size_t{24} << 20, '\0');
  EXPECT_THAT(Refusal(WriteArchive("bomb.bcf", {{"bcf.version", kVersion21}, {"a/s.png", zeros}})),
              HasSubstr("times its size"));
  EXPECT_THAT(Refusal(WriteEmptyEntries("many.bcf", 100000)), HasSubstr("has 100000 entries"));
}

TEST(BcfReader, ReadsWhatIsWrittenOfMoreEntriesThanThePlainFormatCounts) {
  std::vector<NewArchiveEntry> entries = {{"bcf.version", [] { return kVersion21; }}};
  for (std::size_t i = 0; i <= kMaxPlainArchiveEntries; ++i)
    entries.push_back({std::to_string(i), [] { return std::string(); }, false});
  entries.push_back({"a/markup.bcf", [] { return Markup("1", "the last"); }});
  const std::string path = testing::TempDir() + "zip64.bcf";
  std::string reason;
  ASSERT_TRUE(ZORWriteArchive(path, entries, reason)) << reason;
  const BcfProject project = ReadBcf(path);
  ASSERT_EQ(project.topics.size(), 1u);
  EXPECT_EQ(project.topics[0].title, "the last");
  entries.resize(kMaxArchiveEntries + 1, entries[1]);
  EXPECT_FALSE(ZORWriteArchive(path, entries, reason));
  EXPECT_THAT(reason, HasSubstr("would have 100000 entries, more than 99999"));
}

TEST(BcfReader, LooksLikeBcfGoesByTheNameAndTheFirstBytes) {
  EXPECT_TRUE(LooksLikeBcf("missing.BCF"));
  EXPECT_TRUE(LooksLikeBcf(WriteArchive("noname", {{"bcf.version", kVersion21}})));
  EXPECT_FALSE(LooksLikeBcf(WriteBytes("result.xml", "<ClashElement/>")));
  EXPECT_FALSE(LooksLikeBcf("-"));
}
