// What cannot be read is refused with one line that says why, whatever it is.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#ifndef _WIN32
#include <sys/stat.h>
#include <unistd.h>
#endif

#include <algorithm>
#include <random>

#include "toolkit/records/InterferenceRecord.h"
#include "tools/Command.h"

using testing::HasSubstr;
using testing::StartsWith;

namespace {

const char* const kDocument =
    "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
    "<ClashElement Version=\"1.2\"><ClashResult Name=\"é\" NbInterf=\"1\"><!-- c -->\n"
    "<Interference Name=\"a&amp;b\" ResultType=\"Clash\"><Product Alias=\"日本\"/></Interference>"
    "<![CDATA[x]]></ClashResult><?pi x?></ClashElement>";

/// The reason why bytes are refused; empty when they are read.
std::string RefusalOf(const std::string& inBytes) {
  try {
    ZORToolkit::ClashDocument document("doc.xml", inBytes);
    ZORToolkit::ForEachInterference(document, ZORToolkit::RecordPart::kAll,
                                    [](const ZORToolkit::InterferenceRecord&) {});
  } catch (const ZORToolkit::Error& error) {
    return error.what();
  }
  return {};
}

void ExpectRefused(const CommandResult& inResult, const std::string& inStart) {
  EXPECT_EQ(inResult.code, 1);
  EXPECT_EQ(inResult.out, "");
  EXPECT_THAT(inResult.error, StartsWith(inStart));
  EXPECT_EQ(std::count(inResult.error.begin(), inResult.error.end(), '\n'), 1) << inResult.error;
}

void ExpectFileRefused(const std::string& inBytes, const std::string& inReason) {
  const TemporaryDirectory directory;
  const std::string path = directory.Write("input.xml", inBytes);
  for (const char* verb : {"info", "list"}) {
    const CommandResult result = RunCommand({verb, path});
    ExpectRefused(result, "lyra: " + path + ":");
    EXPECT_THAT(result.error, HasSubstr(inReason));
  }
}

}  // namespace

TEST(BadInput, DocumentOfTheTruncationTestIsReadWhenWhole) { EXPECT_EQ(RefusalOf(kDocument), ""); }

TEST(BadInput, EveryPrefixIsRefusedWithOneLine) {
  const std::string whole = kDocument;
  for (std::size_t length = 0; length < whole.size(); ++length) {
    const std::string reason = RefusalOf(whole.substr(0, length));
    EXPECT_THAT(reason, StartsWith("doc.xml:")) << "prefix of " << length;
    EXPECT_EQ(reason.find('\n'), std::string::npos) << reason;
  }
}

TEST(BadInput, EveryPrefixOfASampleIsRefusedWithOneLine) {
  std::string whole = ReadFile(ZOR_SOURCE_DIR "/tests/golden/inputs/two_sets.xml");
  whole.resize(whole.find_last_of('>'));
  for (std::size_t length = 0; length <= whole.size(); ++length) {
    const std::string reason = RefusalOf(whole.substr(0, length));
    ASSERT_THAT(reason, StartsWith("doc.xml:")) << "prefix of " << length;
    ASSERT_EQ(reason.find('\n'), std::string::npos) << reason;
  }
}

TEST(BadInput, ChangedBytesAreReadOrRefusedAndNothingElse) {
  std::mt19937 random(20261120);
  int refused = 0;
  for (int run = 0; run < 2000; ++run) {
    std::string bytes = kDocument;
    for (int change = 0; change < 3; ++change)
      bytes[random() % bytes.size()] = static_cast<char>(random() % 256);
    if (!RefusalOf(bytes).empty()) ++refused;
  }
  EXPECT_GT(refused, 1000);
}

TEST(BadInput, MissingFileIsNamedWithTheSystemsReason) {
  ExpectRefused(RunCommand({"info", "no/such.xml"}),
                "lyra: no/such.xml: No such file or directory");
}

#ifndef _WIN32
TEST(BadInput, UnreadableFileIsRefused) {
  if (geteuid() == 0) GTEST_SKIP() << "the superuser may read everything";
  const TemporaryDirectory directory;
  const std::string path = directory.Write("secret.xml", kDocument);
  ASSERT_EQ(chmod(path.c_str(), 0), 0);
  ExpectRefused(RunCommand({"info", path}), "lyra: " + path + ": Permission denied");
}
#endif

TEST(BadInput, DirectoryIsRefused) {
  ExpectRefused(RunCommand({"info", "samples"}), "lyra: samples: is a directory");
}

#ifndef _WIN32
TEST(BadInput, PipeWithoutWriterIsRefusedAtOnce) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("pipe");
  ASSERT_EQ(mkfifo(path.c_str(), 0600), 0);
  ExpectRefused(RunCommand({"info", path}), "lyra: " + path + ": is not a regular file");
}
#endif

TEST(BadInput, DeviceIsRefused) {
  ExpectRefused(RunCommand({"info", "/dev/zero"}), "lyra: /dev/zero: is not a regular file");
}

TEST(BadInput, EmptyFileIsRefused) { ExpectFileRefused("", "empty"); }

TEST(BadInput, EmptyStandardInputIsRefused) {
  ExpectRefused(RunCommand({"info", "-"}, ""), "lyra: -: ");
}

TEST(BadInput, MalformedFileIsRefusedWithItsPlace) {
  const TemporaryDirectory directory;
  const std::string path = directory.Write("bad.xml", "<ClashElement>\n  <a></b>\n</ClashElement>");
  const CommandResult result = RunCommand({"list", path});
  ExpectRefused(result, "lyra: " + path + ":2:8: expected end of tag 'a'\n");
}

TEST(BadInput, MalformedStandardInputIsRefusedWithItsPlace) {
  EXPECT_EQ(RunCommand({"list", "-"}, "<ClashElement>\n<").error,
            "lyra: -:2:2: element name expected\n");
}

TEST(BadInput, ForeignRootIsRefusedByItsName) {
  ExpectFileRefused("<html/>", "is no clash result: its root element is \"html\"");
}

TEST(BadInput, RootInOtherLetterCaseIsForeign) {
  ExpectFileRefused("<clashelement/>", "its root element is \"clashelement\"");
}

TEST(BadInput, WrongDeclaredEncodingIsRefused) {
  ExpectFileRefused("<?xml version=\"1.0\" encoding=\"UTF-8\"?><ClashElement a=\"\xE9\xE8\"/>",
                    ":1:");
}

TEST(BadInput, UnknownDeclaredEncodingIsRefused) {
  ExpectFileRefused("<?xml version=\"1.0\" encoding=\"no-such\"?><ClashElement/>", ":1:");
}

TEST(BadInput, BinaryFileIsRefused) {
  ExpectFileRefused(ReadFile(kLyraProgram).substr(0, 100000), ":");
}

TEST(BadInput, FileOfZeroBytesIsRefused) { ExpectFileRefused(std::string(5000, '\0'), ":"); }

TEST(BadInput, ControlCharactersInAReasonAreShownEscaped) {
  const TemporaryDirectory directory;
  const std::string path = directory.Path("a\nb\033[31m");
  const CommandResult result = RunCommand({"info", path});
#ifdef _WIN32
  const std::string reason = "Invalid argument";  // no name of a file
#else
  const std::string reason = "No such file";
#endif
  EXPECT_THAT(result.error, HasSubstr("a\\u{A}b\\u{1B}[31m: " + reason));
  EXPECT_EQ(std::count(result.error.begin(), result.error.end(), '\n'), 1);
}

TEST(BadInput, OneVeryLongAttributeIsRead) {
  const std::string document = "<ClashElement Responsible=\"" + std::string(64 << 20, 'x') + "\"/>";
  const CommandResult result = RunCommand({"info", "--json", "-"}, document);
  EXPECT_EQ(result.code, 0) << result.error;
  EXPECT_GT(result.out.size(), std::size_t{64} << 20);
}

TEST(BadInput, DocumentBeyondTheMemoryIsRefused) {
  const TemporaryDirectory directory;
  const std::string path = directory.Write(
      "big.xml", "<ClashElement Responsible=\"" + std::string(100 << 20, 'x') + "\"/>");
  // The sanitizers reserve far more address space than they use.
  if (RunShell("ulimit -v 250000; lyra info samples/as1.clash.xml").code != 0)
    GTEST_SKIP() << "the address space cannot be limited here";
  ExpectRefused(RunShell("ulimit -v 250000; lyra info " + path), "lyra: " + path + ": ");
}

// A document of another kind says what it is.
TEST(WrongKind, ListOfAComponentListSaysSo) {
  ExpectRefused(
      RunCommand({"list", "tests/golden/inputs/components.xml"}),
      "lyra: tests/golden/inputs/components.xml: a component list (\"Components\") has no "
      "interferences\n");
}

TEST(WrongKind, JsonListOfAFederatorDocumentPrintsNothing) {
  ExpectRefused(RunCommand({"list", "--json", "tests/golden/inputs/federator.xml"}),
                "lyra: tests/golden/inputs/federator.xml: a federator document "
                "(\"FederatorClashElement\") has no interferences\n");
}

TEST(WrongKind, CsvListOfAnErrorReportPrintsNothing) {
  ExpectRefused(RunCommand({"list", "--csv", "tests/golden/inputs/errors.xml"}),
                "lyra: tests/golden/inputs/errors.xml: an error report (\"Errors\") has no "
                "interferences\n");
}

TEST(WrongKind, ShowOfAComponentListSaysSo) {
  ExpectRefused(RunCommand({"show", "tests/golden/inputs/components.xml", "1"}),
                "lyra: tests/golden/inputs/components.xml: a component list");
}

TEST(WrongKind, ComponentsOfAClashDocumentSaysSo) {
  ExpectRefused(RunCommand({"components", "samples/as1.clash.xml"}),
                "lyra: samples/as1.clash.xml: a clash document (\"ClashElement\") has no "
                "components\n");
}

TEST(WrongKind, SpecsOfAComponentListSaysSo) {
  ExpectRefused(
      RunCommand({"specs", "tests/golden/inputs/components.xml"}),
      "lyra: tests/golden/inputs/components.xml: a component list (\"Components\") has no "
      "specifications\n");
}

TEST(WrongKind, LinksOfASingleInterferenceSaysSo) {
  ExpectRefused(RunCommand({"links", "tests/golden/inputs/single.xml"}),
                "lyra: tests/golden/inputs/single.xml: a single-interference document "
                "(\"InterferenceElement\") has no links\n");
}

TEST(ShowNumber, BeyondTheLastSaysHowManyThereAre) {
  ExpectRefused(RunCommand({"show", "samples/as1.clash.xml", "33"}),
                "lyra: samples/as1.clash.xml: there is no interference 33: the document has 32 "
                "interferences\n");
}

TEST(ShowNumber, ZeroIsBeforeTheFirst) {
  ExpectRefused(RunCommand({"show", "samples/as1.clash.xml", "0"}),
                "lyra: samples/as1.clash.xml: there is no interference 0");
}

TEST(ShowNumber, TwoOfASingleInterferenceDocumentIsRefused) {
  ExpectRefused(
      RunCommand({"show", "tests/golden/inputs/single.xml", "2"}),
      "lyra: tests/golden/inputs/single.xml: there is no interference 2: the document has "
      "1 interference\n");
}
