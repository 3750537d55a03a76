// Federator documents from a shell, and the texts for scripts.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <iterator>
#include <nlohmann/json.hpp>
#include <sstream>

#include "support/ScopedVariable.h"
#include "tools/Command.h"

using testing::HasSubstr;
using testing::StartsWith;

namespace {

/// A directory with two results in a folder, as a project might have them.
struct Project : TemporaryDirectory {
  Project() {
    std::filesystem::create_directory(Path("results"));
    Write("results/as1.xml", ReadFile(ZOR_SOURCE_DIR "/samples/as1.clash.xml"));
    Write("results/push.xml", ReadFile(ZOR_SOURCE_DIR "/samples/pushdevice.clash.xml"));
  }
  CommandResult In(const std::string& inCommand) const {
    std::istringstream words(inCommand);
    return RunCommandIn(Path(""), {std::istream_iterator<std::string>(words), {}});
  }
  /// What a check says of each link of a federator document.
  std::vector<std::string> Check(const std::string& inFederator, int inCode) const {
    const CommandResult result = In("links --check --json " + inFederator);
    EXPECT_EQ(result.code, inCode) << result.error;
    std::vector<std::string> said;
    for (const auto& link : nlohmann::json::parse(result.out)) said.push_back(link.at("check"));
    return said;
  }
};

std::string Linking(const std::string& inLinks) {
  return "<FederatorClashElement><Elements>" + inLinks + "</Elements></FederatorClashElement>";
}

}  // namespace

TEST(Federate, LinksCarryTheProductsOfTheFirstInterference) {
  const Project project;
  ASSERT_EQ(project.In("federate results/as1.xml results/push.xml -o all.xml").code, 0);
  const auto links = nlohmann::json::parse(project.In("links --json all.xml").out);
  ASSERT_EQ(links.size(), 2u);
  EXPECT_EQ(links[0]["link"], "results/as1.xml");
  EXPECT_EQ(links[0]["products"][0]["name"], "rod-assembly_1 --++-- nut_1");
  EXPECT_EQ(links[0]["products"][1]["id"], "rod-assembly_1 --++-- rod_1");
  EXPECT_EQ(links[1]["products"][0]["name"], "𳜦:V");
  EXPECT_EQ(links[1]["products"][1]["name"], "\n:V");
}

TEST(Federate, LinksAreRelativeToTheFederatorDocument) {
  const Project project;
  ASSERT_EQ(project.In("federate results/as1.xml -o results/all.xml").code, 0);
  ASSERT_EQ(project.In("federate results/as1.xml -o all.xml").code, 0);
  const auto inFolder = nlohmann::json::parse(project.In("links --json results/all.xml").out);
  const auto above = nlohmann::json::parse(project.In("links --json all.xml").out);
  EXPECT_EQ(inFolder[0]["link"], "as1.xml");
  EXPECT_EQ(above[0]["link"], "results/as1.xml");
  EXPECT_EQ(project.Check("results/all.xml", 0), std::vector<std::string>{"ok"});
}

TEST(Federate, AbsolutePathsStayAbsolute) {
  const Project project;
  const std::string path = project.Path("results/as1.xml");
  ASSERT_EQ(project.In("federate " + path + " -o all.xml").code, 0);
  EXPECT_EQ(nlohmann::json::parse(project.In("links --json all.xml").out)[0]["link"], path);
}

TEST(Federate, DocumentIsAFederatorDocumentWithItsPrologue) {
  const Project project;
  ASSERT_EQ(project.In("federate results/as1.xml --dtd f.dtd --xsl f.xsl -o all.xml").code, 0);
  EXPECT_THAT(ReadFile(project.Path("all.xml")),
              StartsWith("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                         "<?xml-stylesheet type=\"text/xsl\" href=\"f.xsl\"?>\n"
                         "<!DOCTYPE FederatorClashElement SYSTEM \"f.dtd\">\n"
                         "<FederatorClashElement><Elements><Element Link="));
  EXPECT_THAT(project.In("info all.xml").out, HasSubstr("Linked documents  1"));
}

TEST(Federate, DocumentWithoutInterferencesIsLinkedWithoutProducts) {
  const Project project;
  project.Write("none.xml", "<ClashElement/>");
  ASSERT_EQ(project.In("federate none.xml -o all.xml").code, 0);
  EXPECT_EQ(nlohmann::json::parse(project.In("links --json all.xml").out)[0]["products"][0]["name"],
            "");
}

TEST(Federate, SameDocumentTwiceIsRefused) {
  const Project project;
  const CommandResult result =
      project.In("federate results/as1.xml ./results/../results/as1.xml -o all.xml");
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, HasSubstr("is given twice"));
  EXPECT_FALSE(std::filesystem::exists(project.Path("all.xml")));
}

TEST(Federate, ForeignDocumentIsRefused) {
  const Project project;
  project.Write("page.xml", "<html/>");
  EXPECT_EQ(project.In("federate page.xml -o all.xml").code, 1);
}

TEST(LinksCheck, EachProblemIsNamed) {
  const Project project;
  project.Write("broken.xml", "<ClashElement>");
  project.Write("list.xml", "<Components/>");
  project.Write("all.xml", Linking("<Element Link='results/as1.xml'/><Element Link='gone.xml'/>"
                                   "<Element Link='broken.xml'/><Element Link='list.xml'/>"
                                   "<Element Link='./results/as1.xml'/><Element/>"
                                   "<Element Link='ZORDLN://Nowhere\\a.xml'/>"
                                   "<Element Link='results\\push.xml'/>"));
  const std::vector<std::string> said = project.Check("all.xml", 1);
  ASSERT_EQ(said.size(), 8u);
  EXPECT_EQ(said[0], "ok");
  EXPECT_EQ(said[1], "missing");
  EXPECT_THAT(said[2], testing::StartsWith("unreadable: 1:15: "));
  EXPECT_EQ(said[3], "wrong kind: a component list");
  EXPECT_EQ(said[4], "listed twice");
  EXPECT_EQ(said[5], "missing: the link is empty");
  EXPECT_EQ(said[6], "missing: unknown logical name");
  EXPECT_EQ(said[7], "ok");
}

TEST(LinksCheck, ReasonOfWhatIsNoFileIsNamed) {
  const Project project;
  project.Write("all.xml", Linking("<Element Link='/dev/null'/><Element Link='loop.xml'/>"));
  RunShell("ln -s loop.xml " + project.Path("loop.xml"));
  EXPECT_THAT(project.Check("all.xml", 1),
              testing::ElementsAre(StartsWith("unreadable: is not a regular file"),
                                   "unreadable: Too many levels of symbolic links"));
}

TEST(LinksCheck, SoundDocumentEndsWell) {
  const Project project;
  project.Write("all.xml", Linking("<Element Link='results/as1.xml'/>"));
  const CommandResult result = project.In("links --check all.xml");
  EXPECT_EQ(result.code, 0);
  EXPECT_THAT(result.out, HasSubstr("  ok\n"));
}

// Texts for scripts

TEST(Path, ReferenceIsResolvedByTheTableOfLocations) {
  const TemporaryDirectory directory;
  directory.Write("DLNames.toml", "Reports = \"/srv/${LYRA_TEST_PLACE}/reports\"\n");
  const support::ScopedVariable settings("ZOR_SETTINGS_PATH", directory.Path(""));
  const support::ScopedVariable place("LYRA_TEST_PLACE", "x");
  EXPECT_EQ(RunCommand({"path", "ZORDLN://Reports\\a\\b.xsl"}).out, "/srv/x/reports\\a\\b.xsl\n");
  EXPECT_EQ(RunCommand({"path", "Reports"}).out, "/srv/x/reports\n");
}

TEST(Path, UnknownReferenceFails) {
  const CommandResult result = RunCommand({"path", "ZORDLN://Nowhere\\a"});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: ZORDLN://Nowhere\\a: unknown logical name\n");
}

TEST(Path, DirectoryThatCannotBeExpandedFails) {
  const TemporaryDirectory directory;
  directory.Write("DLNames.toml", "Reports = \"/srv/${LYRA_TEST_ABSENT}\"\n");
  const support::ScopedVariable settings("ZOR_SETTINGS_PATH", directory.Path(""));
  EXPECT_EQ(RunCommand({"path", "ZORDLN://Reports\\a"}).code, 1);
  EXPECT_EQ(RunCommand({"path", "Reports"}).code, 1);
}

TEST(Path, OtherTextComesBackAsItIs) {
  EXPECT_EQ(RunCommand({"path", "/srv/a b.xml"}).out, "/srv/a b.xml\n");
}

TEST(Escape, MarkupIsEscaped) {
  EXPECT_EQ(RunCommand({"escape", "a <b> & \"c\" 'd'"}).out,
            "a &lt;b&gt; &amp; &quot;c&quot; 'd'\n");
  EXPECT_EQ(RunCommand({"escape", "--identifier", "a <b"}).out, "a_&lt;b\n");
}

TEST(Escape, StandardInputIsConvertedAsItStands) {
  EXPECT_EQ(RunCommand({"escape", "-"}, "a&b\nc\n").out, "a&amp;b\nc\n");
}

TEST(Filename, CharactersThatFilesMayNotHoldAreReplaced) {
  EXPECT_EQ(RunCommand({"filename", "a b/c:d|e"}).out, "a_b&47c&58d&124e\n");
  EXPECT_EQ(RunCommand({"filename", "--references", "a b/c:d|e"}).out, "a b&#47;c&#58;d&#124;e\n");
}
