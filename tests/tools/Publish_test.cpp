// Publications: pages that hold everything and nothing dangerous, pictures that are whole.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <algorithm>
#include <filesystem>
#include <regex>

#include "lyra/terminal/Progress.h"
#include "tools/Command.h"

using testing::EndsWith;
using testing::HasSubstr;
using testing::Not;
using testing::StartsWith;

namespace fs = std::filesystem;

namespace {

const std::string kResult = "samples/as1.clash.xml";
const std::string kModel = "samples/as1-oc-214.stp";
constexpr const char* kStyleSheetStart =
    "<xsl:stylesheet version='1.0' xmlns:xsl='http://www.w3.org/1999/XSL/Transform'"
    " xmlns:page='urn:zorlyra:page'>";

std::size_t Occurrences(const std::string& inText, const std::string& inPart) {
  std::size_t count = 0;
  for (auto at = inText.find(inPart); at != std::string::npos; at = inText.find(inPart, at + 1))
    ++count;
  return count;
}

std::string InOneSet(const std::string& inInterferences) {
  return "<ClashElement Version='1.2' ZORDocument='d'><ClashResult Name='r' NbInterf='1'>" +
         inInterferences + "</ClashResult></ClashElement>";
}

class Publish : public testing::Test {
 protected:
  CommandResult Run(std::vector<std::string> inArguments, const std::string& inInput = {}) {
    inArguments.insert(inArguments.begin(), {"publish", "-o", folder_});
    return RunCommand(inArguments, inInput);
  }
  CommandResult RunSmall(std::vector<std::string> inMore = {}) {
    inMore.insert(inMore.end(), {kResult, "--model", kModel, "--size", "90x60"});
    return Run(inMore);
  }
  /// The page of a document; fails the test when there is none.
  std::string PageOf(const std::string& inDocument) {
    const CommandResult result = Run({"-"}, inDocument);
    EXPECT_EQ(result.code, 0) << result.error;
    return Page();
  }
  std::string Page() const { return ReadFile(folder_ + "/index.html"); }
  std::string Report() const { return ReadFile(folder_ + "/report.xml"); }
  std::string Picture(const std::string& inName) const { return folder_ + "/pictures/" + inName; }
  CommandResult RunWithStyleSheet(const std::string& inTemplates) {
    return Run({kResult, "--xsl",
                directory_.Write("own.xsl", kStyleSheetStart + inTemplates + "</xsl:stylesheet>")});
  }

  TemporaryDirectory directory_;
  std::string folder_ = directory_.Path("out");
};

}  // namespace

TEST_F(Publish, PageHasARowAndASectionForEachInterference) {
  const CommandResult result = Run({kResult});
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.out, folder_ + "/index.html: 32 interferences, 0 with a picture\n");
  EXPECT_EQ(Occurrences(Page(), "<tr data-n="), 32u);
  EXPECT_EQ(Occurrences(Page(), "<section id="), 32u);
  EXPECT_THAT(Page(), StartsWith("<!DOCTYPE html"));
}

TEST_F(Publish, PageStandsAlone) {
  Run({kResult});
  const std::string page = Page();
  const std::regex reference("(src|href)=\"([^\"#][^\"]*)\"");
  for (std::sregex_iterator found(page.begin(), page.end(), reference), end; found != end; ++found)
    EXPECT_EQ((*found)[2], "data:,");
  EXPECT_THAT(page, Not(HasSubstr("@import")));
  EXPECT_THAT(page, Not(HasSubstr("url(")));
  EXPECT_THAT(page, Not(HasSubstr("xmlns:")));
}

TEST_F(Publish, SummaryCountsTypesAndStatuses) {
  const std::string page =
      PageOf(InOneSet("<Interference ResultType='Clash' Status='Relevant'/>"
                      "<Interference ResultType='Clash' Status='Relevant'/>"
                      "<Interference ResultType='Contact'/>"));
  EXPECT_THAT(page, HasSubstr("<span class=\"dot clash\"></span><bdi>Clash</bdi>"));
  EXPECT_THAT(page, HasSubstr("<th scope=\"col\" class=\"number\"><bdi>Not stated</bdi></th>"));
  EXPECT_EQ(Occurrences(page, "<td class=\"number\">2</td>"), 2u);  // relevant clashes, and all
  EXPECT_EQ(Occurrences(page, "<span class=\"none\">0</span>"), 2u);
  EXPECT_THAT(page, HasSubstr("<td class=\"number all\">3</td>"));
}

TEST_F(Publish, NumbersHaveThreeDigitsAndTheExactOneBeside) {
  const std::string page = PageOf(InOneSet(
      "<Interference Value='-0.123456'/><Interference Value='-12,3456'/>"
      "<Interference Value='1234.56'/><Interference Value='0.5'/><Interference Value='99.96'/>"
      "<Interference Value='0.00001234'/><Interference Value='deep'/>"));
  for (const char* shown :
       {"<data value=\"-0.123456\" title=\"-0.123456 mm\">-0.123</data>",
        "<data value=\"-12,3456\" title=\"-12,3456 mm\">-12,3</data>", ">1235</data>",
        "<data value=\"0.5\">0.5</data>", "title=\"99.96 mm\">100</data>", ">0.0000123</data>",
        "<bdi>deep</bdi>"})
    EXPECT_EQ(Occurrences(page, shown), 2u) << shown;  // in the row and in the section
}

TEST_F(Publish, EmptyColumnsAreHidden) {
  const std::string page = PageOf(InOneSet("<Interference><Comment Value='c'/></Interference>"));
  EXPECT_THAT(page, HasSubstr("class=\"no-value no-products no-rule \""));
}

TEST_F(Publish, PolicyAllowsNothingButThePageItself) {
  Run({kResult});
  const std::string page = Page();
  const std::regex policy(
      "content=\"default-src 'none'; img-src 'self' file: data:; "
      "style-src 'sha256-[A-Za-z0-9+/]{43}='; script-src 'sha256-[A-Za-z0-9+/]{43}=' "
      "'strict-dynamic'; form-action 'none'; base-uri 'none'\"");
  EXPECT_TRUE(std::regex_search(page, policy));
  EXPECT_THAT(page, Not(HasSubstr(" style=\"")));
  EXPECT_FALSE(std::regex_search(page, std::regex("<[^>]* on[a-z]+=")));
}

TEST_F(Publish, ResultWithoutInterferencesHasAPage) {
  EXPECT_THAT(PageOf("<ClashElement ZORDocument='empty'/>"),
              HasSubstr("There is no interference to show."));
}

TEST_F(Publish, SingleInterferenceDocumentHasAPage) {
  EXPECT_EQ(Run({"tests/golden/inputs/single.xml"}).code, 0);
  EXPECT_EQ(Occurrences(Page(), "<section id="), 1u);
}

TEST_F(Publish, ReportLiesWithItsStyleSheetAndType) {
  Run({kResult});
  EXPECT_THAT(Report(), HasSubstr("href=\"clash-report.xsl\""));
  EXPECT_EQ(RunShell("cd " + folder_ + " && xmllint --nonet --noout --valid report.xml").error, "");
  EXPECT_EQ(ReadFile(folder_ + "/clash-report.xsl"),
            ReadFile(ZOR_SOURCE_DIR "/resources/clash-report.xsl"));
}

TEST_F(Publish, FilesOfSomebodyElseAreNeverReplaced) {
  const std::vector<std::string> names = {"index.html", "report.xml", "clash-report.xsl",
                                          "clash-report.dtd", "manifest.json"};
  for (const std::string& name : names) {
    SCOPED_TRACE(name);
    fs::remove_all(folder_);
    fs::create_directory(folder_);
    const std::string path = directory_.Write("out/" + name, "<p>mine</p>");
    const CommandResult result = Run({kResult});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.error,
              "lyra: " + path + ": is in the way of the page and was not made by lyra publish\n");
    EXPECT_EQ(ReadFile(path), "<p>mine</p>");
    EXPECT_EQ(std::distance(fs::directory_iterator(folder_), fs::directory_iterator()), 1);
  }
  fs::remove_all(folder_);
  ASSERT_EQ(Run({kResult}).code, 0);
  // Geometry too
  fs::create_directory(folder_ + "/viewer");
  const std::string script = directory_.Write("out/viewer/scene.js", "mine()");
  EXPECT_EQ(Run({kResult}).code, 1);
  EXPECT_EQ(ReadFile(script), "mine()");
  fs::remove_all(folder_ + "/viewer");
  // A style sheet of the user's own beside it, and that of a former publication
  directory_.Write("out/own.xsl", "<mine/>");
  const std::string templates = "<xsl:template match='/'><p/></xsl:template>";
  EXPECT_EQ(RunWithStyleSheet(templates).code, 1);
  fs::remove(folder_ + "/own.xsl");
  EXPECT_EQ(RunWithStyleSheet(templates).code, 0);
  EXPECT_EQ(RunWithStyleSheet("<xsl:template match='/'><hr/></xsl:template>").code, 0);
  EXPECT_EQ(Run({kResult}).code, 0);
  // Former versions wrote no manifest, and a simpler page
  fs::remove(folder_ + "/manifest.json");
  directory_.Write("out/index.html",
                   "<html><body><p class=\"kind\">Clash report</p></body></html>");
  EXPECT_EQ(Run({kResult}).code, 0);
  EXPECT_THAT(Page(), HasSubstr("zor-manifest"));
}

TEST_F(Publish, ComponentListIsRefused) {
  EXPECT_EQ(Run({"tests/golden/inputs/components.xml"}).code, 1);
  EXPECT_FALSE(fs::exists(folder_));
}

TEST_F(Publish, FolderThatCannotBeMadeIsRefused) {
  directory_.Write("out", "a file");
  const CommandResult result = Run({kResult});
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, StartsWith("lyra: " + folder_ + ": "));
}

TEST_F(Publish, WrongWordsAreWrongUsage) {
  for (const char* option :
       {"--only=type", "--only=kind=clash", "--only=type=crash", "--only=result=a,result=b",
        "--size=0x1", "--format=gif", "--zoom=far", "--jobs=0", "--jobs=257"})
    EXPECT_EQ(Run({kResult, option}).code, 2) << option;
}

// Hostile documents

TEST_F(Publish, MarkupInEveryFieldIsText) {
  const std::string evil = "&quot;&apos;&gt;&lt;/bdi&gt;&lt;script&gt;evil()&lt;/script&gt;";
  const auto with = [&](const std::string& inNames) {
    std::string attributes;
    for (std::size_t at = 0; at < inNames.size();) {
      const std::size_t end = std::min(inNames.find(' ', at), inNames.size());
      attributes += " " + inNames.substr(at, end - at) + "=\"" + evil + "\"";
      at = end + 1;
    }
    return attributes;
  };
  const std::string page =
      PageOf("<ClashElement Version='1.2'" + with("ZORDocument Responsible PRCName") + "><Date" +
             with("Day Month Year") + "/><ClashSpec" + with("Name Type Clearance") +
             "/><ClashResult" + with("Name ComputationCase") + "><Interference" +
             with("Name Value ResultType Status DistanceClearance RetrieveInf") + "><ViolatedRule" +
             with("Name Severity Clearance") + "/><Product" +
             with("DescriptionID Alias ShapeName Preview") + "/><Product" + with("DescriptionID") +
             "/><GeometricAspect" + with("IntersectCurveLength ExtractOrDistValue") + "><Point" +
             with("Ux Uy Uz") + "/></GeometricAspect><Comment" + with("Value") + "/><Picture" +
             with("HRef") + "/></Interference></ClashResult></ClashElement>");
  EXPECT_EQ(Occurrences(page, "<script"), 3u);  // data, script and manifest
  EXPECT_EQ(Occurrences(page, "<script>evil"), 0u);
  EXPECT_GT(Occurrences(page, "&lt;script&gt;evil()"), 15u);
  EXPECT_EQ(Occurrences(page, "=\"\"'>"), 0u);
}

TEST_F(Publish, DirectionsAreNeverTurned) {
  const std::string page =
      PageOf(InOneSet("<Interference Status='&#x202d;c'><Product Alias='a&#x202e;gnp.exe'/>"
                      "<Product Alias='&#x2066;b'/></Interference>"));
  EXPECT_THAT(page, HasSubstr("<bdi>a\\u{202E}gnp.exe</bdi>"));
  EXPECT_THAT(page, HasSubstr("<bdi>\\u{2066}b</bdi>"));
  for (const char* bytes : {"\u202d", "\u202e", "\u2066"}) EXPECT_THAT(page, Not(HasSubstr(bytes)));
  EXPECT_THAT(Report(), HasSubstr("a\u202egnp.exe"));
}

TEST_F(Publish, LongCommentIsCutInTheTableAlone) {
  const std::string comment(1 << 20, 'x');
  const std::string page =
      PageOf(InOneSet("<Interference><Comment Value='" + comment + "'/></Interference>"));
  EXPECT_EQ(Occurrences(page, comment), 1u);
  EXPECT_THAT(page, HasSubstr("<bdi>" + std::string(120, 'x') + "</bdi>…"));
}

TEST_F(Publish, ManyPointsAreCounted) {
  std::string points;
  for (int i = 0; i < 10000; ++i) points += "<Point Ux='" + std::to_string(i) + "' Uy='1' Uz='2'/>";
  const std::string page = PageOf(
      InOneSet("<Interference><GeometricAspect>" + points + "</GeometricAspect></Interference>"));
  EXPECT_THAT(page, HasSubstr("10000 points"));
  EXPECT_THAT(page, HasSubstr("The other 9900 are in report.xml."));
  EXPECT_EQ(Occurrences(page, "<span class=\"coordinate\">"), 300u);
}

TEST_F(Publish, InterferencesWithoutProductsAreShown) {
  const std::string page = PageOf(
      InOneSet("<Interference Name='a'/><Interference><Product Alias='one'/></Interference>"));
  EXPECT_THAT(page, HasSubstr("The document names no product."));
  EXPECT_EQ(Occurrences(page, "<bdi>one</bdi>"), 2u);
}

TEST_F(Publish, PicturesOutsideAreNeverReferredTo) {
  const std::string page =
      PageOf(InOneSet("<Interference><Product Alias='a' Preview='../../b.jpg'/>"
                      "<Picture HRef='../../../etc/passwd'/><Picture HRef='file:///x'/>"
                      "</Interference>"));
  for (const std::string& text : {page, Report()}) {
    EXPECT_THAT(text, Not(HasSubstr("../")));
    EXPECT_THAT(text, Not(HasSubstr("file:///")));
  }
}

TEST_F(Publish, FiveThousandInterferencesMakeAPage) {
  std::string all;
  for (int i = 0; i < 5000; ++i)
    all += "<Interference Name='i" + std::to_string(i) + "' ResultType='Clash'/>";
  EXPECT_EQ(Occurrences(PageOf(InOneSet(all)), "<tr data-n="), 5000u);
}

// Pictures

TEST_F(Publish, EachInterferenceHasItsPictureAndItsPreviews) {
  const CommandResult result = RunSmall();
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.error, "");
  EXPECT_THAT(result.out, EndsWith("32 interferences, 32 with a picture\n"));
  for (const char* name : {"interference_1.jpg", "interference_32.jpg",
                           "interference_7_product_1.jpg", "interference_7_product_2.jpg"}) {
    EXPECT_EQ(ReadFile(Picture(name)).substr(0, 2), "\xFF\xD8") << name;
    EXPECT_THAT(Page(), HasSubstr(std::string("src=\"pictures/") + name + "\"")) << name;
  }
  EXPECT_THAT(Report(), HasSubstr("<Picture HRef=\"pictures/interference_32.jpg\""));
  EXPECT_THAT(Report(), HasSubstr("Preview=\"pictures/interference_32_product_2.jpg\""));
  EXPECT_EQ(Occurrences(Page(), "fill=\"#"), 4 * 32u);
}

TEST_F(Publish, FormatAndSizeAreAsAsked) {
  ASSERT_EQ(Run({kResult, "--model", kModel, "--only", "product=plate", "--format", "png", "--size",
                 "31x23"})
                .code,
            0);
  const auto picture = fs::directory_iterator(folder_ + "/pictures");
  std::string bytes;
  for (const fs::directory_entry& entry : picture)
    if (entry.path().extension() == ".png" &&
        entry.path().string().find("product") == std::string::npos)
      bytes = ReadFile(entry.path().string());
  EXPECT_EQ(bytes.substr(1, 3), "PNG");
  EXPECT_EQ(bytes.substr(16, 8), std::string("\0\0\0\x1F\0\0\0\x17", 8));
}

TEST_F(Publish, ZoomFramesTheProductsToo) {
  ASSERT_EQ(RunSmall({"--zoom", "interference"}).code, 0);
  const std::string close = ReadFile(Picture("interference_1.jpg"));
  ASSERT_EQ(RunSmall({"--zoom", "products"}).code, 0);
  EXPECT_NE(ReadFile(Picture("interference_1.jpg")), close);
}

TEST_F(Publish, SeveralProcessesDrawTheSameBytes) {
  ASSERT_EQ(RunSmall({"--jobs", "1"}).code, 0);
  const std::string one = directory_.Path("one");
  fs::rename(folder_, one);
  ASSERT_EQ(RunSmall({"--jobs", "3"}).code, 0);
  const CommandResult difference = RunShell("diff -r " + one + " " + folder_);
  EXPECT_EQ(difference.code, 0) << difference.out;
}

TEST_F(Publish, ResumeDrawsOnlyWhatIsNotThere) {
  ASSERT_EQ(RunSmall().code, 0);
  const std::string drawn = ReadFile(Picture("interference_5.jpg"));
  fs::remove(Picture("interference_5.jpg"));
  directory_.Write("out/pictures/interference_6.jpg", "kept");
  ASSERT_EQ(RunSmall({"--resume"}).code, 0);
  EXPECT_EQ(ReadFile(Picture("interference_5.jpg")), drawn);
  EXPECT_EQ(ReadFile(Picture("interference_6.jpg")), "kept");
}

TEST_F(Publish, ResumeOfOtherPicturesDrawsAll) {
  ASSERT_EQ(RunSmall().code, 0);
  directory_.Write("out/pictures/interference_6.jpg", "stale");
  const CommandResult result = RunSmall({"--resume", "--format", "jpeg", "--zoom", "products"});
  EXPECT_EQ(result.error,
            "lyra: warning: the pictures that are there show something else: all are drawn\n");
  EXPECT_NE(ReadFile(Picture("interference_6.jpg")), "stale");
}

TEST_F(Publish, WithoutResumeAllIsDrawnAnew) {
  ASSERT_EQ(RunSmall().code, 0);
  directory_.Write("out/pictures/interference_6.jpg", "stale");
  directory_.Write("out/pictures/mine.jpg", "mine");
  ASSERT_EQ(RunSmall().code, 0);
  EXPECT_NE(ReadFile(Picture("interference_6.jpg")), "stale");
  EXPECT_EQ(ReadFile(Picture("mine.jpg")), "mine");
}

TEST_F(Publish, KilledRunGoesOn) {
  ASSERT_EQ(RunSmall().code, 0);
  const std::string whole = directory_.Path("whole");
  fs::rename(folder_, whole);
  // Ended as soon as the first picture is there.
  RunShell("lyra publish --jobs 1 --model " + kModel + " --size 90x60 -o " + folder_ + " " +
           kResult + " & for i in {1..1000}; do ls " + folder_ +
           "/pictures/*.jpg && break; sleep 0.01; done; kill -9 $!");
  EXPECT_EQ(RunSmall({"--resume"}).code, 0);
  const CommandResult difference = RunShell("diff -r " + whole + " " + folder_);
  EXPECT_EQ(difference.code, 0) << difference.out;
}

TEST_F(Publish, ProductsThatTheModelLacksAreMarkedAndCounted) {
  const CommandResult result =
      Run({"-", "--model", kModel, "--size", "60x40"},
          InOneSet("<Interference><Product DescriptionID='plate_1' Alias='plate_1'/>"
                   "<Product DescriptionID='gone'/></Interference>"
                   "<Interference><Product DescriptionID='gone'/><Product DescriptionID='lost'/>"
                   "</Interference>"));
  EXPECT_EQ(result.code, 0);
  EXPECT_THAT(result.error, HasSubstr("the model lacks 2 products of 2 interferences: \"gone\", "
                                      "\"lost\"\n"));
  EXPECT_THAT(result.out, EndsWith("2 interferences, 1 with a picture\n"));
  EXPECT_THAT(Page(), HasSubstr("<strong>2</strong> of 2 interferences name a product"));
  EXPECT_EQ(Occurrences(Page(), "</bdi> <span class=\"missing\">") +
                Occurrences(Page(), "</strong> <span class=\"missing\">"),
            6u);
}

TEST_F(Publish, OfThreeProductsTheFirstAndTheLastAreShown) {
  const CommandResult result =
      Run({"-", "--model", kModel, "--size", "60x40"},
          InOneSet("<Interference><Product DescriptionID='plate_1' Alias='plate_1'/>"
                   "<Product DescriptionID='gone' Preview='dangling.jpg'/>"
                   "<Product DescriptionID='l-bracket-assembly_1' Alias='l-bracket-assembly_1'/>"
                   "</Interference>"));
  EXPECT_EQ(result.code, 0);
  EXPECT_THAT(result.error, Not(HasSubstr("lacks")));
  EXPECT_THAT(Report(), Not(HasSubstr("dangling.jpg")));
  EXPECT_EQ(Occurrences(Report(), "Preview="), 2u);
  for (const char* name : {"interference_1_product_1.jpg", "interference_1_product_2.jpg"})
    EXPECT_TRUE(fs::exists(Picture(name))) << name;
}

TEST_F(Publish, OnlySomeKeepTheirNumbers) {
  ASSERT_EQ(Run({"tests/golden/inputs/two_sets.xml", "--only", "type=contact"}).code, 0);
  EXPECT_EQ(Occurrences(Page(), "<tr data-n="), 1u);
  EXPECT_THAT(Page(), HasSubstr("<section id=\"i2\""));
  EXPECT_THAT(Report(), HasSubstr("NbInterf=\"1\""));
  EXPECT_THAT(Report(), HasSubstr("NbInterf=\"0\""));
}

// Style sheets

TEST_F(Publish, OwnStyleSheetMakesThePage) {
  const CommandResult result = RunWithStyleSheet(
      "<xsl:output method='text'/><xsl:template match='/'>"
      "<xsl:value-of select='count(//Interference[@page:number])'/></xsl:template>");
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(Page(), "32");
  EXPECT_THAT(Report(), HasSubstr("href=\"own.xsl\""));
  EXPECT_TRUE(fs::exists(folder_ + "/own.xsl"));
}

TEST_F(Publish, StyleSheetComesFromTheSettings) {
  directory_.Write("house.xsl", std::string(kStyleSheetStart) +
                                    "<xsl:output method='text'/><xsl:template match='/'>house"
                                    "</xsl:template></xsl:stylesheet>");
  directory_.Write("ClashPublish.toml", "XslTemplate = \"" + directory_.Path("house.xsl") + "\"\n");
  const CommandResult result = RunShell("ZOR_SETTINGS_PATH=" + directory_.Path("") +
                                        " lyra publish " + kResult + " -o " + folder_);
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(Page(), "house");
}

TEST_F(Publish, BrokenStyleSheetIsRefusedBeforeAnythingIsWritten) {
  const CommandResult result = RunWithStyleSheet("<xsl:template>");
  EXPECT_EQ(result.code, 1);
  EXPECT_THAT(result.error, StartsWith("lyra: " + directory_.Path("own.xsl") + ": "));
  EXPECT_FALSE(fs::exists(folder_));
}

TEST_F(Publish, StyleSheetThatEndsWithoutAPageLeavesTheFormerFiles) {
  ASSERT_EQ(Run({kResult}).code, 0);
  const std::string report = ReadFile(folder_ + "/report.xml");
  const CommandResult result = RunWithStyleSheet(
      "<xsl:template match='/'><p/><xsl:message terminate='yes'>no</xsl:message></xsl:template>");
  EXPECT_EQ(result.code, 1) << result.error;
  EXPECT_EQ(ReadFile(folder_ + "/report.xml"), report);  // which would name own.xsl
  EXPECT_FALSE(fs::exists(folder_ + "/own.xsl"));
}

TEST_F(Publish, MissingStyleSheetIsRefused) {
  EXPECT_EQ(Run({kResult, "--xsl", "no/such.xsl"}).code, 1);
}

TEST_F(Publish, StyleSheetReadsNoFile) {
  const std::string secret = directory_.Write("secret.xml", "<a>SECRET</a>");
  RunWithStyleSheet("<xsl:template match='/'><p>page<xsl:value-of select=\"document('" + secret +
                    "')\"/></p></xsl:template>");
  if (fs::exists(folder_ + "/index.html")) {
    EXPECT_THAT(Page(), Not(HasSubstr("SECRET")));
  }
  const CommandResult included = RunWithStyleSheet("<xsl:include href='" + secret + "'/>");
  EXPECT_EQ(included.code, 1) << included.error;
}

TEST_F(Publish, StyleSheetGetsNoEntityOfAFile) {
  const std::string secret = directory_.Write("secret.txt", "SECRET");
  const std::string sheet = directory_.Write(
      "own.xsl", "<!DOCTYPE x [<!ENTITY e SYSTEM '" + secret + "'>]>" + kStyleSheetStart +
                     "<xsl:template match='/'><p>&e;</p></xsl:template></xsl:stylesheet>");
  Run({kResult, "--xsl", sheet});
  if (fs::exists(folder_ + "/index.html")) {
    EXPECT_THAT(Page(), Not(HasSubstr("SECRET")));
  }
}

TEST_F(Publish, StyleSheetThatIsNoFileIsRefusedAtOnce) {
  const std::string pipe = directory_.Path("pipe");
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  for (const std::string& sheet : {pipe, std::string("/dev/zero"), std::string("/dev/null")}) {
    const CommandResult result = Run({kResult, "--xsl", sheet});
    EXPECT_EQ(result.code, 1);
    EXPECT_EQ(result.error, "lyra: " + sheet + ": is not a regular file\n");
  }
  EXPECT_FALSE(fs::exists(folder_));
}

TEST_F(Publish, EmptyStyleSheetIsRefused) {
  const std::string sheet = directory_.Write("empty.xsl", "");
  const CommandResult result = Run({kResult, "--xsl", sheet});
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error, "lyra: " + sheet + ": the style sheet is empty\n");
  EXPECT_FALSE(fs::exists(folder_));
}

TEST_F(Publish, StyleSheetBeyondTheLimitIsRefused) {
  const std::string sheet = directory_.Write("large.xsl", "");
  fs::resize_file(sheet, (std::uintmax_t{64} << 20) + 1);
  EXPECT_EQ(Run({kResult, "--xsl", sheet}).error, "lyra: " + sheet + ": File too large\n");
}

TEST_F(Publish, StyleSheetWritesNoFile) {
  RunWithStyleSheet("<xsl:template match='/'><xsl:document href='" + directory_.Path("written") +
                    "'><a/></xsl:document></xsl:template>");
  EXPECT_FALSE(fs::exists(directory_.Path("written")));
}

TEST_F(Publish, OtherVerbsLoadNoStyleSheetLibrary) {
  const CommandResult result = RunShell("ldd \"$(command -v lyra)\"");
  EXPECT_THAT(result.out, HasSubstr("libZORLyra.so"));
  EXPECT_THAT(result.out, Not(HasSubstr("xslt")));
}

TEST(DrawingText, SaysRateAndRemainingTime) {
  EXPECT_EQ(lyra::DrawingText(0, 400, 0), "drawing 0 of 400 interferences");
  EXPECT_EQ(lyra::DrawingText(50, 400, 10),
            "drawing 50 of 400 interferences, 5.0 a second, 70 s left");
  EXPECT_EQ(lyra::DrawingText(1, 5000, 1),
            "drawing 1 of 5000 interferences, 1.0 a second, 83 min left");
}
