// The published schemas, held against what we write and print by validators that nobody here wrote.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <map>

#include "tools/Command.h"

namespace fs = std::filesystem;
using testing::HasSubstr;
using testing::IsEmpty;

namespace {

const std::string kInputs = "tests/golden/inputs/", kSample = "samples/as1.clash.xml";

/// @return the files, relative to the source folder, that the schema of documents refuses.
std::vector<std::string> RefusedAmong(const std::vector<std::string>& inFiles) {
  std::string line = "xmllint --noout --nonet --schema resources/clash-result.xsd";
  for (const std::string& file : inFiles) line += " '" + file + "'";
  std::vector<std::string> refused;
  const std::string said = RunShell(line).error;
  for (const std::string& file : inFiles)
    if (said.find(file + " validates\n") == std::string::npos) refused.push_back(file);
  return refused;
}

std::vector<std::string> FilesIn(const std::string& inFolder, const std::string& inStart,
                                 const std::string& inEnd) {
  std::vector<std::string> files;
  for (const auto& entry : fs::directory_iterator(std::string(ZOR_SOURCE_DIR "/") + inFolder)) {
    const std::string name = entry.path().filename().string();
    if (name.starts_with(inStart) && name.ends_with(inEnd)) files.push_back(inFolder + "/" + name);
  }
  return files;
}

/// Validates JSON documents, given as pairs of a schema's name and a file. @return what is said of
/// those that are refused.
std::string JsonComplaints(const std::vector<std::pair<std::string, std::string>>& inDocuments) {
  const TemporaryDirectory folder;
  const std::string program = folder.Write("validate.py", R"(
import glob, json, os, sys, warnings
warnings.simplefilter('ignore')
import jsonschema
folder = 'resources/'
store = {os.path.basename(f): json.load(open(f)) for f in glob.glob(folder + '*.schema.json')}
for name, path in zip(sys.argv[1::2], sys.argv[2::2]):
    schema = store[name + '.schema.json']
    jsonschema.Draft7Validator.check_schema(schema)
    resolver = jsonschema.RefResolver('', schema, store=store)
    for error in jsonschema.Draft7Validator(schema, resolver=resolver).iter_errors(json.load(open(path))):
        print(name, path, list(error.path), error.message[:200])
        break
)");
  std::string line = "python3 " + program;
  for (const auto& [schema, file] : inDocuments) line += " " + schema + " '" + file + "'";
  const CommandResult result = RunShell(line);
  EXPECT_EQ(result.code, 0) << result.error;
  return result.out;
}

bool HasJsonValidator() { return RunShell("python3 -c 'import jsonschema'").code == 0; }

std::string Printed(const std::string& inArguments) {
  const CommandResult result = RunShell("lyra " + inArguments);
  EXPECT_EQ(result.error, "") << inArguments;
  return result.out;
}

}  // namespace

TEST(DocumentSchema, AcceptsTheSamplesAndWhatIsWritten) {
  const TemporaryDirectory folder;
  const std::string merged = folder.Path("merged.xml"), federated = folder.Path("federated.xml"),
                    carried = folder.Path("carried.xml"), detected = folder.Path("detected.xml"),
                    reviewed = folder.Path("reviewed.xml");
  Printed("detect samples/as1-oc-214.stp --only 'rod*' -o " + detected);
  Printed("merge " + kSample + " samples/printable_case.clash.xml -o " + merged);
  Printed("federate " + kSample + " samples/dissonance.clash.xml -o " + federated);
  Printed("review set " + kSample + " --only type=contact --status irrelevant --comment c -o " +
          reviewed);
  Printed("carry " + reviewed + " " + detected + " -o " + carried);
  std::vector<std::string> files = {merged, federated, carried, detected, reviewed};
  for (const std::string& sample : Samples()) files.push_back(sample);
  EXPECT_THAT(files.size(), testing::Ge(10u));
  EXPECT_THAT(RefusedAmong(files), IsEmpty());
}

TEST(DocumentSchema, TellsTheCorpusApart) {
  const auto valid = FilesIn("samples/corpus", "valid-", ".xml");
  const auto invalid = FilesIn("samples/corpus", "invalid-", ".xml");
  EXPECT_THAT(valid.size(), testing::Ge(10u));
  EXPECT_THAT(invalid.size(), testing::Ge(10u));
  EXPECT_THAT(RefusedAmong(valid), IsEmpty());
  EXPECT_EQ(RefusedAmong(invalid), invalid);
  const std::string readme = ReadFile(ZOR_SOURCE_DIR "/samples/corpus/README.md");
  for (const char* const ending : {".xml", ".json"})
    for (const std::string& file : FilesIn("samples/corpus", "", ending))
      EXPECT_THAT(readme, HasSubstr("| `" + fs::path(file).filename().string() + "` | "));
  for (const std::string& file : valid) Printed("info " + file);
}

TEST(JsonSchemas, AcceptWhatIsPrinted) {
  if (!HasJsonValidator()) GTEST_SKIP() << "python3-jsonschema is not installed";
  const TemporaryDirectory folder;
  std::vector<std::pair<std::string, std::string>> documents;
  const auto add = [&](const std::string& inSchema, const std::string& inText) {
    documents.emplace_back(inSchema,
                           folder.Write(std::to_string(documents.size()) + ".json", inText));
  };
  std::map<std::string, int> verbs;  // what is printed of each
  const auto addOf = [&](const std::string& inVerb, const std::string& inRest) {
    ++verbs[inVerb];
    add(inVerb, Printed(inVerb + " --json " + inRest));
  };
  const std::string hostile = kInputs + "hostile.xml", sets = kInputs + "two_sets.xml";
  for (const std::string& file : {kSample, hostile, sets}) {
    addOf("list", file);
    addOf("show", file + " 1");
    add("convert", Printed("convert --to json " + file));
    addOf("group", file);
    addOf("diff", "--tolerance 0,5 " + file + " " + sets);
  }
  EXPECT_THAT(ReadFile(documents.back().second),
              HasSubstr(R"("filters":{"tolerance":0.5,"place":10.0})"));
  addOf("show", sets + " 3");
  addOf("info", kInputs + "errors.xml");
  addOf("info", kInputs + "federator.xml");
  addOf("info", kSample + " " + kInputs + "components.xml " + kInputs + "federator.xml " + kInputs +
                    "single.xml");
  addOf("components", kInputs + "components.xml");
  add("convert", Printed("convert --to json " + kInputs + "components.xml"));
  add("convert", Printed("convert --to json " + kInputs + "federator.xml"));
  addOf("specs", kSample);
  add("links", RunShell("lyra links --check --json " + kInputs + "federator.xml").out);
  addOf("links", kInputs + "federator.xml");
  addOf("tree", "samples/as1-oc-214.stp");
  addOf("tree", "--leaves samples/as1-oc-214.stp");
  addOf("tree", "--depth 1 samples/as1-oc-214.stp");
  add("plan", Printed("detect --plan --shares 3 --json --only 'rod*' samples/as1-oc-214.stp"));
  add("plan",
      Printed("publish --plan --shares 2 --json --model samples/as1-oc-214.stp " + kSample));
  const std::string mine = folder.Path("mine.xml"), theirs = folder.Path("theirs.xml");
  const std::string set = "review set " + kSample + " --only type=contact --comment ";
  Printed(set + "mine -o " + mine);
  Printed(set + "theirs -o " + theirs);
  add("conflicts", RunShell("lyra review merge " + kSample + " " + mine + " " + theirs + " -o " +
                            folder.Path("m.xml") + " --json")
                       .out);
  EXPECT_EQ(JsonComplaints(documents), "");
  // Those of convert and review have other names: see the next test. What detect and publish print is their plan.
  std::vector<std::string> printing = {"convert", "review", "detect", "publish"};
  for (const auto& [verb, count] : verbs) printing.push_back(verb);
  for (const std::string& help : FilesIn("tests/golden", "help_", ".txt")) {
    const std::string verb = help.substr(help.find('_') + 1, help.find('.') - help.find('_') - 1);
    if (ReadFile(std::string(ZOR_SOURCE_DIR "/") + help).find("--json") == std::string::npos)
      continue;
    EXPECT_THAT(printing, testing::Contains(verb)) << "prints JSON that no schema is held against";
  }
}

TEST(JsonSchemas, AcceptReportsOfExchangeAndReviewFiles) {
  if (!HasJsonValidator()) GTEST_SKIP() << "python3-jsonschema is not installed";
  const TemporaryDirectory folder;
  const std::string bcf = folder.Path("a.bcf"), sheet = folder.Path("a.xlsx"),
                    review = folder.Path("r.json");
  const std::string only = " --only status=relevant --json -o ";
  std::vector<std::pair<std::string, std::string>> documents = {
      {"exchange",
       folder.Write(
           "0", RunShell("lyra convert " + kSample + " --to bcf --size 60x40" + only + bcf).out)},
      {"exchange", folder.Write("1", Printed("convert " + kSample + " --to xlsx" + only + sheet))},
      {"exchange", folder.Write("4", Printed("convert " + kSample + " --to csv" + only +
                                             folder.Path("a.csv")))},
      {"exchange", folder.Write("5", RunShell("lyra convert " + kSample +
                                              " --to bcf --group --size 60x40" + only + bcf)
                                         .out)},
      {"info", folder.Write("2", Printed("info --json " + bcf))},
      {"import",
       folder.Write(
           "3", Printed("review import " +
                        folder.Write("x.xml", ReadFile(ZOR_SOURCE_DIR "/samples/as1.clash.xml")) +
                        " " + sheet + " --json -o " + review))},
      {"review", review}};
  for (const std::string& file : FilesIn("samples/corpus", "valid-review", ".json"))
    documents.emplace_back("review", file);
  EXPECT_EQ(JsonComplaints(documents), "");
  for (const std::string& file : FilesIn("samples/corpus", "invalid-review", ".json"))
    EXPECT_THAT(JsonComplaints({{"review", file}}), HasSubstr(file));
}
