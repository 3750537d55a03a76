// What other tools get from the command, and what comes back from them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <nlohmann/json.hpp>

#include "toolkit/exchange/WrittenArchive.h"
#include "tools/Command.h"

using nlohmann::json;
using testing::AllOf;
using testing::HasSubstr;
using testing::Not;
using testing::SizeIs;
using testing::StartsWith;

namespace {

namespace fs = std::filesystem;

constexpr char kResult[] = "samples/as1.clash.xml";

/// Runs the command, which succeeds.
std::string Lyra(const std::vector<std::string>& inArguments) {
  const CommandResult result = RunCommand(inArguments);
  EXPECT_EQ(result.code, 0) << result.error;
  return result.out;
}

json ListOf(const std::string& inResult) { return json::parse(Lyra({"list", "--json", inResult})); }

/// The files of an archive in a folder of their own, validated against the official schemas.
void ExpectValid(const std::string& inArchive, const std::string& inVersion) {
  if (OfficialFolder().empty()) return;
  const TemporaryDirectory folder;
  std::map<std::string, std::string> filesOfSchema;
  int number = 0;
  for (const auto& [name, bytes] : ReadArchive(inArchive)) {
    const std::string file = fs::path(name).filename().string();
    const std::string schema = file == "markup.bcf"       ? "markup"
                               : file == "viewpoint.bcfv" ? "visinfo"
                               : file == "bcf.version"    ? "version"
                               : file == "project.bcfp"   ? "project"
                               : file == "documents.xml"  ? "documents"
                               : file == "extensions.xml" ? "extensions"
                                                          : "";
    if (schema.empty()) continue;
    filesOfSchema[schema] += " " + folder.Write(std::to_string(++number) + ".xml", bytes);
  }
  EXPECT_EQ(filesOfSchema.size(), inVersion == "3.0" ? 6u : 4u);
  for (const auto& [schema, files] : filesOfSchema) {
    const CommandResult checked = RunShell("xmllint --noout --schema " + OfficialFolder() +
                                           "/schemas/" + inVersion + "/" + schema + ".xsd" + files);
    EXPECT_EQ(checked.code, 0) << schema << ": " << checked.error;
  }
}

std::vector<std::string> NamesIn(const std::string& inArchive, const std::string& inEnding) {
  std::vector<std::string> names;
  for (const auto& [name, bytes] : ReadArchive(inArchive))
    if (name.ends_with(inEnding)) names.push_back(name);
  return names;
}

std::string Replaced(const std::string& inText, const std::string& inOld,
                     const std::string& inNew) {
  const std::size_t at = inText.find(inOld);
  EXPECT_NE(at, std::string::npos) << inOld;
  if (at == std::string::npos) return inText;
  return inText.substr(0, at) + inNew + inText.substr(at + inOld.size());
}

/// The archive with what an edit makes of the markup of the topic whose title begins so.
template <class Edit>
std::string EditedBcf(const std::string& inArchive, const std::string& inTitle, bool inKeepsResult,
                      const Edit& inEdit) {
  Entries entries;
  int edited = 0;
  for (auto& [name, bytes] : ReadArchive(inArchive)) {
    const bool isIt =
        name.ends_with("markup.bcf") && bytes.find("<Title>" + inTitle) != std::string::npos;
    edited += isIt ? 1 : 0;
    if (inKeepsResult || name.find(".clash.xml") == std::string::npos)
      entries.emplace_back(name, isIt ? inEdit(bytes) : bytes);
  }
  EXPECT_EQ(edited, 1);
  return WriteArchive("edited.bcf", entries);
}

std::string WithoutColours(const std::string& inArchive) {
  Entries entries;
  for (auto& [name, bytes] : ReadArchive(inArchive)) {
    const std::size_t begin = bytes.find("<Coloring>"), end = bytes.find("</Coloring>");
    const bool isView = name.ends_with(".bcfv") && end != std::string::npos;
    entries.emplace_back(
        name, isView ? bytes.substr(0, begin) + bytes.substr(bytes.find('\n', end)) : bytes);
  }
  return WriteArchive("colourless.bcf", entries);
}

std::string Work(std::string inMarkup) {
  inMarkup = Replaced(inMarkup, "TopicStatus=\"Not inspected\"", "TopicStatus=\"Closed\"");
  inMarkup = Replaced(inMarkup, "<CreationDate>", "<Labels>Piping</Labels><CreationDate>");
  inMarkup = Replaced(inMarkup, "<Description>",
                      "<ModifiedDate>2026-12-01T10:00:00Z</ModifiedDate>"
                      "<ModifiedAuthor>eva@example.com</ModifiedAuthor>"
                      "<AssignedTo>jo@example.com</AssignedTo><Description>");
  return Replaced(inMarkup, "<Viewpoints",
                  "<Comment Guid=\"11111111-2222-3333-4444-555555555555\">"
                  "<Date>2026-12-01T10:00:00Z</Date><Author>eva@example.com</Author>"
                  "<Comment>Moved by 5 mm &amp; done</Comment></Comment><Viewpoints");
}

}  // namespace

TEST(ConvertToBcf, WritesWhatTheOfficialSchemasAllow) {
  const TemporaryDirectory folder;
  for (const std::string version : {"2.1", "3.0"}) {
    SCOPED_TRACE(version);
    const std::string file = folder.Path(version + ".bcf");
    const std::vector<std::string> call = {
        "convert",       kResult,  "--to",    "bcf",
        "--bcf-version", version,  "--model", "samples/as1-oc-214.stp",
        "--size",        "120x80", "-o",      file};
    EXPECT_THAT(Lyra(call), AllOf(HasSubstr("32 topics of 32 interferences, 32 with a picture"),
                                  HasSubstr("BCF has no place for:\n  value (32)")));
    ExpectValid(file, version);
    const auto entries = ReadArchive(file);
    EXPECT_THAT(NamesIn(file, "/viewpoint.bcfv"), SizeIs(32));
    for (const std::string& picture : NamesIn(file, "/snapshot.png"))
      EXPECT_THAT(entries.at(picture), AllOf(StartsWith("\x89PNG"), SizeIs(testing::Gt(300))));
    const std::string view = entries.at(NamesIn(file, "/viewpoint.bcfv").front());
    EXPECT_THAT(view, AllOf(Not(HasSubstr("ClippingPlane")), HasSubstr("<FieldOfView>")));
    EXPECT_EQ(view.find("<AspectRatio>1.5</AspectRatio>") != std::string::npos, version == "3.0");
    EXPECT_EQ(entries.at("bcf.version").find("DetailedVersion") == std::string::npos,
              version == "3.0");
    const json info = json::parse(Lyra({"info", "--json", file}));
    EXPECT_EQ(info["version"], version);
    ASSERT_THAT(info["topics"], SizeIs(32));
    for (const json& topic : info["topics"]) {
      const auto guid = topic["guid"].get<std::string>();
      EXPECT_THAT(guid, SizeIs(36));
      EXPECT_EQ(guid.find_first_not_of("0123456789abcdef-"), std::string::npos) << guid;
      EXPECT_EQ(topic["viewpoints"], 1);
      EXPECT_EQ(topic["snapshots"], 1);
    }
    const std::string again = ReadBytes(file);
    Lyra(call);
    EXPECT_EQ(again, ReadBytes(file)) << "the same input makes the same bytes";
  }
}

TEST(ConvertToBcf, WritesATopicForEachGroup) {
  const TemporaryDirectory folder;
  const std::string file = folder.Path("\u5E72\u6E09\U0001F680.bcf");
  const json written = json::parse(Lyra(
      {"convert", kResult, "--to", "bcf", "--group", "--json", "--size", "60x40", "-o", file}));
  ExpectValid(file, "2.1");
  EXPECT_EQ(written["topics"], json::parse(Lyra({"group", "--json", kResult})).size());
  EXPECT_EQ(written["interferences"], 32);
  EXPECT_EQ(written["notCarried"][0]["what"], "value");
  EXPECT_EQ(written["notCarried"][0]["count"], 32);
  EXPECT_EQ(json::parse(ReadFile(folder.Write(
                "r.json", Lyra({"review", "import", kResult, file, "-o", "-"}))))["entries"],
            json::array());
}

TEST(ConvertToBcf, TopicsKeepTheirGuidsWhenTheResultIsComputedAgain) {
  const TemporaryDirectory folder;
  const std::string shorter = folder.Path("shorter.xml");
  std::string text = ReadFile(std::string(ZOR_SOURCE_DIR "/") + kResult);
  const std::size_t first = text.find("<Interference "),
                    second = text.find("<Interference ", first + 1);
  folder.Write("shorter.xml", text.substr(0, first) + text.substr(second));
  const auto guids = [&](const std::string& inResult) {
    const std::string file = folder.Path("guids.bcf");
    Lyra({"convert", inResult, "--to", "bcf", "--size", "60x40", "-o", file});
    return NamesIn(file, "/markup.bcf");
  };
  const auto before = guids(kResult), after = guids(shorter);
  EXPECT_THAT(after, SizeIs(before.size() - 1));
  EXPECT_TRUE(std::includes(before.begin(), before.end(), after.begin(), after.end()));
}

TEST(ReviewImport, BringsTheWorkOfAnotherToolBack) {
  const TemporaryDirectory folder;
  const std::string file = folder.Path("a.bcf"), review = folder.Path("review.json"),
                    result = folder.Path("reviewed.xml");
  Lyra({"convert", kResult, "--to", "bcf", "--size", "60x40", "-o", file});
  for (const bool keepsResult : {true, false}) {
    const std::string edited = EditedBcf(file, "Contact 3:", keepsResult, Work);
    EXPECT_THAT(Lyra({"review", "import", kResult, edited, "-o", review}),
                HasSubstr("32 known, 1 changed"));
    const json entries = json::parse(ReadFile(review))["entries"];
    ASSERT_THAT(entries, SizeIs(1));
    EXPECT_EQ(entries[0]["index"], 3);
    EXPECT_EQ(entries[0]["baseStatus"], "Not inspected");
    EXPECT_EQ(entries[0]["status"], "Irrelevant");
    EXPECT_EQ(entries[0]["assignee"], "jo@example.com");
    EXPECT_EQ(entries[0]["labels"], json({"Piping"}));
    EXPECT_EQ(entries[0]["who"], "eva@example.com");
    EXPECT_EQ(entries[0]["comment"],
              "to be checked with the supplier\n"
              "Moved by 5 mm & done (eva@example.com, 2026-12-01)\n"
              "Assigned to jo@example.com\nLabels: Piping");
  }
  Lyra({"review", "apply", kResult, review, "-o", result});
  EXPECT_EQ(ListOf(result)[2]["status"], "Irrelevant");
  const json was = ListOf(kResult), is = ListOf(result);
  for (std::size_t i = 0; i < was.size(); ++i)
    if (i != 2) {
      EXPECT_EQ(was[i], is[i]);
    }
  // What is in the result already is not brought twice.
  EXPECT_THAT(
      Lyra({"review", "import", result, EditedBcf(file, "Contact 3:", true, Work), "-o", review}),
      HasSubstr("32 known"));
  EXPECT_EQ(json::parse(ReadFile(review))["entries"][0].value("comment", ""), "");
}

TEST(ReviewImport, SaysWhatItDoesNotKnow) {
  const TemporaryDirectory folder;
  const std::string file = WriteArchive(
      "foreign.bcf",
      {{"bcf.version", "<Version VersionId='2.1'/>"},
       {"a/markup.bcf", "<Markup><Topic Guid='1'><Title>Theirs</Title></Topic></Markup>"}});
  EXPECT_THAT(Lyra({"review", "import", kResult, file, "-o", folder.Path("r.json")}),
              AllOf(HasSubstr("the topic \"Theirs\" is of no interference"), HasSubstr("0 known")));
}

TEST(ConvertToXlsx, WritesTypedCellsForEditing) {
  const TemporaryDirectory folder;
  const std::string file = folder.Path("\u5E72\u6E09\U0001F680.xlsx");
  const json written =
      json::parse(Lyra({"convert", kResult, "--to", "xlsx", "--json", "-o", file}));
  EXPECT_EQ(written["interferences"], 32);
  EXPECT_EQ(written["pictures"], 0);
  const auto entries = ReadArchive(file);
  const std::string& sheet = entries.at("xl/worksheets/sheet1.xml");
  EXPECT_THAT(sheet, AllOf(HasSubstr("state=\"frozen\""), HasSubstr("<autoFilter ref=\"A1:S33\""),
                           HasSubstr("\"Not inspected,Relevant,Irrelevant\""),
                           HasSubstr("<c r=\"B2\""), HasSubstr("<v>178</v>")));
  EXPECT_THAT(sheet, HasSubstr("<cfRule type=\"cellIs\""));
  for (const char* name : {"Interferences", "Summary", "Products", "Groups"})
    EXPECT_THAT(entries.at("xl/workbook.xml"), HasSubstr("<sheet name=\"" + std::string(name)));
  EXPECT_TRUE(entries.contains("xl/charts/chart1.xml"));
  const std::string again = ReadBytes(file);
  Lyra({"convert", kResult, "--to", "xlsx", "-o", file});
  EXPECT_EQ(again, ReadBytes(file));
  // What would be a formula is a text, and characters that XML has not come back.
  const std::string hostile = "tests/golden/inputs/hostile.xml";
  Lyra({"convert", hostile, "--to", "xlsx", "-o", file});
  EXPECT_THAT(ReadArchive(file).at("xl/worksheets/sheet1.xml"), Not(HasSubstr("<f>")));
  EXPECT_THAT(Lyra({"review", "import", hostile, file, "-o", folder.Path("r.json")}),
              HasSubstr(" 0 changed"));
}

TEST(ConvertToXlsx, HasThumbnailsOfAModelOrOfAPage) {
  const TemporaryDirectory folder;
  const std::string file = folder.Path("a.xlsx"), page = folder.Path("page");
  EXPECT_THAT(Lyra({"convert", kResult, "--to", "xlsx", "--only", "status=irrelevant", "--model",
                    "samples/as1-oc-214.stp", "-o", file}),
              HasSubstr("3 interferences, 3 with a picture"));
  EXPECT_THAT(NamesIn(file, ".png"), SizeIs(3));
  Lyra({"publish", kResult, "--only", "status=irrelevant", "--size", "60x40", "--model",
        "samples/as1-oc-214.stp", "-o", page});
  EXPECT_THAT(Lyra({"convert", kResult, "--to", "xlsx", "--page", page, "-o", file}),
              HasSubstr("32 interferences, 3 with a picture"));
  // Pictures of another kind, and too large ones, become what a BCF file may hold.
  const std::string bcf = folder.Path("a.bcf");
  Lyra({"publish", kResult, "--only", "status=irrelevant", "--size", "3000x20", "--format", "jpeg",
        "--model", "samples/as1-oc-214.stp", "-o", folder.Path("jpeg")});
  EXPECT_THAT(Lyra({"convert", kResult, "--to", "bcf", "--bcf-version", "3.0", "--only",
                    "status=irrelevant", "--page", folder.Path("jpeg"), "-o", bcf}),
              HasSubstr("3 topics of 3 interferences, 3 with a picture"));
  for (const std::string& name : NamesIn(bcf, "/snapshot.png"))
    EXPECT_THAT(ReadArchive(bcf).at(name),
                AllOf(StartsWith("\x89PNG"),
                      HasSubstr(std::string("IHDR\0\0\x05\xDC\0\0\0\x0A", 12)),  // 1500 by 10
                      SizeIs(testing::Gt(300))));
}

TEST(ReviewImport, BringsCellsOfASheetBack) {
  const TemporaryDirectory folder;
  const std::string file = folder.Path("a.xlsx"), review = folder.Path("r.json");
  Lyra({"convert", kResult, "--to", "xlsx", "-o", file});
  Entries entries;
  for (auto& [name, bytes] : ReadArchive(file)) {
    if (name == "xl/worksheets/sheet1.xml") {
      const std::size_t first = bytes.find("<row r=\"2\""), second = bytes.find("<row r=\"3\"");
      bytes.erase(first, second - first);
      const std::size_t third = bytes.find("<row r=\"4\"");
      bytes = bytes.substr(0, third) +
              Replaced(Replaced(bytes.substr(third), "Not inspected", "irrelevant"),
                       "to be checked with the supplier", "checked &amp; &lt;fine&gt;");
    }
    entries.emplace_back(name, bytes);
  }
  const auto expectEntry = [&](const std::string& inFile) {
    Lyra({"review", "import", kResult, inFile, "-o", review});
    const json changed = json::parse(ReadFile(review))["entries"];
    ASSERT_THAT(changed, SizeIs(1));
    EXPECT_EQ(changed[0]["index"], 3);
    EXPECT_EQ(changed[0]["status"], "Irrelevant");
    EXPECT_EQ(changed[0]["baseStatus"], "Not inspected");
    EXPECT_EQ(changed[0]["comment"], "checked & <fine>");
  };
  expectEntry(WriteArchive("edited.xlsx", entries));
  const CommandResult rows = RunCommand({"convert", kResult, "--to", "csv"});
  EXPECT_THAT(rows.error, AllOf(StartsWith("A sheet has no place for:\n"),
                                HasSubstr("  placements (32)\n"), Not(HasSubstr("viewpoint"))));
  const std::string rowsFile = folder.Path("rows.csv");
  const json written =
      json::parse(Lyra({"convert", kResult, "--to", "csv", "--json", "-o", rowsFile}));
  EXPECT_EQ(ReadFile(rowsFile), rows.out);
  EXPECT_EQ(written["notCarried"][0]["what"], "placements");
  std::string csv = rows.out;
  csv =
      Replaced(csv, "Not inspected,to be checked with the supplier", "IRRELEVANT,checked & <fine>");
  expectEntry(folder.Write("edited.csv", csv));
  // As a German spreadsheet saves it, with other columns in front, and only those that matter.
  expectEntry(folder.Write(
      "german.csv", "\xEF\xBB\xBF\"N\";Comment;STATUS;id\r\n9;\"checked & <fine>\";Irrelevant;" +
                        ListOf(kResult)[2]["id"].get<std::string>() + "\r\n"));
  Lyra({"review", "apply", kResult, review, "-o", folder.Path("result.xml")});
  EXPECT_EQ(ListOf(folder.Path("result.xml"))[2]["comment"], "checked & <fine>");
  EXPECT_THAT(
      RunCommand({"review", "import", kResult, folder.Write("x.csv", "a,b\n1,2\n"), "-o", "-"})
          .error,
      HasSubstr("has no columns \"Id\""));
}

TEST(ConvertToXlsx, IsOpenedByAnotherSpreadsheet) {
#ifdef __SANITIZE_ADDRESS__
  GTEST_SKIP() << "it says nothing of our memory, and takes its time";
#endif
  if (RunShell("command -v soffice >/dev/null").code != 0)
    GTEST_SKIP() << "libreoffice-calc-nogui is not installed";
  const TemporaryDirectory folder;
  const std::string file = folder.Path("a.xlsx");
  Lyra({"convert", kResult, "--to", "xlsx", "-o", file});
  for (const std::string format : {"pdf", "csv"}) {
    const CommandResult made =
        RunShell("HOME='" + folder.Path("") + "' soffice --headless --convert-to " + format +
                 " --outdir '" + folder.Path("") + "' '" + file + "'");
    EXPECT_EQ(made.code, 0) << made.error;
  }
  EXPECT_THAT(ReadFile(folder.Path("a.pdf")), StartsWith("%PDF"));
  EXPECT_THAT(Lyra({"review", "import", kResult, folder.Path("a.csv"), "-o", folder.Path("r")}),
              HasSubstr("32 known, 0 changed"));
}

TEST(ConvertToBcf, RefusesWhatCannotBeWritten) {
  const TemporaryDirectory folder;
  const auto refusal = [&](std::vector<std::string> inRest) {
    inRest.insert(inRest.begin(), {"convert", kResult, "--to", "bcf"});
    const CommandResult result = RunCommand(inRest);
    EXPECT_NE(result.code, 0);
    return result.error;
  };
  EXPECT_THAT(refusal({}), HasSubstr("--output must name the file"));
  EXPECT_THAT(refusal({"--size", "1600x900", "-o", folder.Path("a")}), HasSubstr("1500 pixels"));
  EXPECT_THAT(refusal({"--bcf-version", "4", "-o", folder.Path("a")}), HasSubstr("2.1, 3.0"));
  EXPECT_THAT(refusal({"-o", folder.Path("no/where.bcf")}), HasSubstr("No such file"));
  EXPECT_FALSE(fs::exists(folder.Path("a")));
}

TEST(ConvertToBcf, IsReadByAReaderThatNobodyHereWrote) {
  const std::string modules = ZOR_SOURCE_DIR "/build/npm/node_modules";
  if (!fs::exists(modules + "/@parametricos/bcf-js"))
    GTEST_SKIP() << "npm install --prefix build/npm @parametricos/bcf-js has not been run";
  const TemporaryDirectory folder;
  const std::string program = folder.Write("read.cjs", R"(
const {BcfReader} = require('@parametricos/bcf-js/dist/' + process.argv[2]);
const reader = new BcfReader();
reader.read(require('fs').readFileSync(process.argv[3])).then(async () => {
  let components = 0, pictures = 0;
  for (const markup of reader.markups) {
    const view = markup.viewpoints[0];
    components += view.components.selection.length;
    pictures += (await markup.getViewpointSnapshot(view)).length > 60 ? 1 : 0;
  }
  const first = reader.markups.find(markup => markup.topic.title.startsWith('Contact 3:'));
  console.log([reader.markups.length, components, pictures, first.topic.topic_status,
               first.topic.comments[0].comment].join('|'));
});
)");
  for (const std::string version : {"2.1", "3.0"}) {
    std::string file = folder.Path(version + ".bcf");
    Lyra({"convert", kResult, "--to", "bcf", "--bcf-version", version, "--size", "60x40", "-o",
          file});
    // That reader looks for the colours of 3.0 where 2.1 has them, in the official cases too.
    if (version == "3.0") file = WithoutColours(file);
    const CommandResult read =
        RunShell("NODE_PATH='" + modules + "' node " + program + " " + version + " " + file);
    EXPECT_EQ(read.out, "32|64|32|Not inspected|to be checked with the supplier\n")
        << version << read.error;
  }
}
