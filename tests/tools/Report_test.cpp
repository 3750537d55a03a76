// Reports: they read back as the same result, follow their document type and show as a page.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <array>

#include "ZORClashParsing.h"
#include "support/ScopedVariable.h"
#include "toolkit/publishing/ReportWriter.h"
#include "tools/Command.h"

using testing::HasSubstr;
using testing::StartsWith;

namespace {

/// The result's name and the 41 outputs of a reading.
using Outputs = std::array<ZORUnicodeString, 42>;

std::vector<Outputs> ReadAll(std::string inPath) {
  ZORClashParsing reader(inPath.data());
  ZORUnicodeString kind, reference, version;
  EXPECT_EQ(reader.LoadSequence(kind, reference, version), S_OK);
  std::vector<Outputs> all;
  DOM_Node copy;
  ZORUnicodeString unused[4];
  for (int i = 1;
       SUCCEEDED(reader.GetithInterference(i, copy, unused[0], unused[1], unused[2], unused[3]));
       ++i) {
    Outputs t;
    reader.GetClashInfos("1.2", i, t[0], t[1], t[2], t[3], t[4], t[5], t[6], t[7], t[8], t[9],
                         t[10], t[11], t[12], t[13], t[14], t[15], t[16], t[17], t[18], t[19],
                         t[20], t[21], t[22], t[23], t[24], t[25], t[26], t[27], t[28], t[29],
                         t[30], t[31], t[32], t[33], t[34], t[35], t[36], t[37], t[38], t[39],
                         t[40], t[41]);
    all.push_back(t);
    for (ZORUnicodeString& text : unused) text = ZORUnicodeString();
  }
  return all;
}

std::size_t Occurrences(const std::string& inText, const std::string& inPart) {
  std::size_t count = 0;
  for (auto at = inText.find(inPart); at != std::string::npos; at = inText.find(inPart, at + 1))
    ++count;
  return count;
}

std::string Value(const char* inText) { return ZORToolkit::AttributeValue(inText).ConvertToChar(); }

class ReportOfSample : public testing::TestWithParam<std::string> {
 protected:
  ReportOfSample() : path_(directory_.Path("report.xml")) {
    const CommandResult result = RunCommand({"report", GetParam(), "-o", path_});
    EXPECT_EQ(result.code, 0) << result.error;
    EXPECT_EQ(result.out + result.error, "");
  }
  TemporaryDirectory directory_;
  std::string path_;
};

}  // namespace

TEST_P(ReportOfSample, ReadsBackAsTheSameOutputs) {
  const std::vector<Outputs> expected = ReadAll(ZOR_SOURCE_DIR "/" + GetParam());
  const std::vector<Outputs> actual = ReadAll(path_);
  ASSERT_EQ(actual.size(), expected.size());
  ASSERT_GT(expected.size(), 0u);
  for (std::size_t i = 0; i < expected.size(); ++i)
    for (std::size_t output = 0; output < expected[i].size(); ++output)
      ASSERT_EQ(actual[i][output], expected[i][output])
          << "interference " << i + 1 << ", output " << output << ": "
          << actual[i][output].ConvertToChar();
}

TEST_P(ReportOfSample, HoldsAllElseThatTheCommandShows) {
  const auto withoutFile = [](const std::string& inJson) {
    return inJson.substr(inJson.find("\"kind\""));
  };
  EXPECT_EQ(withoutFile(RunCommand({"convert", "--to", "json", path_}).out),
            withoutFile(RunCommand({"convert", "--to", "json", GetParam()}).out));
}

TEST_P(ReportOfSample, FollowsItsDocumentType) {
  directory_.Write("clash-report.dtd", ReadFile(ZOR_SOURCE_DIR "/resources/clash-report.dtd"));
  const CommandResult result = RunShell("xmllint --nonet --noout --valid " + path_);
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(result.error, "");
}

TEST_P(ReportOfSample, ShowsEachInterferenceAsARowOfAPage) {
  const CommandResult result =
      RunShell("xsltproc --nonet --novalid resources/clash-report.xsl " + path_);
  EXPECT_EQ(result.code, 0) << result.error;
  const std::size_t count = ReadAll(path_).size();
  EXPECT_EQ(Occurrences(result.out, "<tr class="), count);
  EXPECT_THAT(result.out, HasSubstr("<td class=\"number\">" + std::to_string(count) + "</td>"));
  EXPECT_EQ(result.out.find("<script"), std::string::npos);
}

INSTANTIATE_TEST_SUITE_P(All, ReportOfSample, testing::ValuesIn(Samples()),
                         [](const testing::TestParamInfo<std::string>& inInfo) {
                           std::string name = inInfo.param.substr(inInfo.param.find('/') + 1);
                           name.resize(name.find('.'));
                           return name;
                         });

TEST(Report, NumbersRunOverAllResultSetsOnThePage) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("report.xml");
  ASSERT_EQ(RunCommand({"report", "tests/golden/inputs/two_sets.xml", "-o", path}).code, 0);
  const CommandResult page =
      RunShell("xsltproc --nonet --novalid resources/clash-report.xsl " + path);
  EXPECT_EQ(Occurrences(page.out, "<table>"), 2u);
  for (const char* row : {"1</td>\n<td>Kollision", "2</td>\n<td>Contact", "3</td>\n<td>Clearance"})
    EXPECT_THAT(page.out, HasSubstr(std::string("<td class=\"number\">") + row));
  EXPECT_THAT(page.out, HasSubstr("see \"plan\", page 2"));
}

TEST(Report, SingleInterferenceDocumentIsReportedAsSuch) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("report.xml");
  ASSERT_EQ(RunCommand({"report", "tests/golden/inputs/single.xml", "-o", path}).code, 0);
  EXPECT_THAT(ReadFile(path), HasSubstr("<!DOCTYPE InterferenceElement SYSTEM"));
  EXPECT_EQ(RunCommand({"show", "--json", path, "1"}).out,
            RunCommand({"show", "--json", "tests/golden/inputs/single.xml", "1"}).out);
}

TEST(Report, HostileTextsReadBackAsTheyWere) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("report.xml");
  ASSERT_EQ(RunCommand({"report", "tests/golden/inputs/hostile.xml", "-o", path}).code, 0);
  EXPECT_EQ(RunCommand({"list", "--json", path}).out,
            RunCommand({"list", "--json", "tests/golden/inputs/hostile.xml"}).out);
}

TEST(Report, WhatReportsDoNotHoldIsLeftOut) {
  const TemporaryDirectory directory;
  directory.Write("clash-report.dtd", ReadFile(ZOR_SOURCE_DIR "/resources/clash-report.dtd"));
  const std::string path = directory.Path("report.xml");
  const CommandResult result = RunCommand(
      {"report", "-", "-o", path},
      "<ClashElement Other='1'><Foreign/><ClashResult Name='a'>text<Interference x='2' Name='b'>"
      "<Foreign><Product/></Foreign></Interference></ClashResult></ClashElement>");
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(RunShell("xmllint --nonet --noout --valid " + path).error, "");
  EXPECT_THAT(ReadFile(path), HasSubstr("<Interference Name=\"b\" />"));
}

TEST(Report, ControlCharactersNeverReachTheFile) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("report.xml");
  const CommandResult result =
      RunCommand({"report", "-", "-o", path},
                 "<?xml version=\"1.1\"?><ClashElement Responsible=\"a&#1;b&#9;c&#10;d&#13;e\"/>");
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_THAT(ReadFile(path), HasSubstr("Responsible=\"a\uFFFDb&#9;c&#10;d&#13;e\""));
  EXPECT_EQ(RunShell("xmllint --noout " + path).code, 0);
}

TEST(Report, StyleSheetAndTypeAreAsAsked) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("report.xml");
  ASSERT_EQ(RunCommand({"report", "samples/as1.clash.xml", "--dtd", "x.dtd", "--xsl", "a&b.xsl",
                        "-o", path})
                .code,
            0);
  EXPECT_THAT(ReadFile(path), StartsWith("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                         "<!DOCTYPE ClashElement SYSTEM \"x.dtd\"> \n"
                                         "<?xml-stylesheet type=\"text/xsl\" "
                                         "href=\"a&amp;b.xsl\"?>\n"));
}

TEST(Report, StyleSheetComesFromTheSettings) {
  const TemporaryDirectory directory;
  directory.Write("ClashPublish.toml", "XslTemplate = \"house.xsl\"\n");
  const std::string path = directory.Path("report.xml");
  const support::ScopedVariable settings("ZOR_SETTINGS_PATH", directory.Path(""));
  ASSERT_EQ(RunCommand({"report", "samples/as1.clash.xml", "-o", path}).code, 0);
  EXPECT_THAT(ReadFile(path), HasSubstr("href=\"house.xsl\""));
}

TEST(Report, ComponentListIsRefused) {
  EXPECT_EQ(RunCommand({"report", "tests/golden/inputs/components.xml", "-o", "/dev/null"}).code,
            1);
}

TEST(AttributeValue, EscapesMarkupAndWhatParsersNormalise) {
  EXPECT_EQ(Value("a<b>&\"'"), "a&lt;b&gt;&amp;&quot;'");
  EXPECT_EQ(Value("a\tb\nc\rd"), "a&#9;b&#10;c&#13;d");
  EXPECT_EQ(Value("\n"), "&#10;");
  EXPECT_EQ(Value(""), "");
  EXPECT_EQ(Value("é日本😀"), "é日本😀");
}

TEST(AttributeValue, ReplacesWhatXmlCannotCarry) {
  EXPECT_EQ(Value("a\x01"
                  "b\x1F"),
            "a\uFFFDb\uFFFD");
  EXPECT_EQ(Value("\uFFFE\uFFFF\uFFFD"), "\uFFFD\uFFFD\uFFFD");
  const ZORUC2Bytes lone[] = {'a', 0xD800, 'b', 0xDC00, 0xDBFF};
  ZORUnicodeString text;
  text.BuildFromUTF16(lone, 5);
  EXPECT_EQ(std::string(ZORToolkit::AttributeValue(text).ConvertToChar()), "a\uFFFDb\uFFFD\uFFFD");
}
