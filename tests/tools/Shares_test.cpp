// Work in shares: what comes out is what one machine gives, and a share that does not belong is named.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <filesystem>
#include <fstream>
#include <map>

#include "tools/Command.h"

namespace fs = std::filesystem;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::StartsWith;

namespace {

using Words = std::vector<std::string>;

/// Two layers of two by two cubes, each 10 mm wide and touching the next.
std::string Cubes() {
  std::string text;
  int corner = 0;
  for (int cube = 0; cube < 8; ++cube) {
    text += "o cube" + std::to_string(cube) + "\n";
    for (int i = 0; i < 8; ++i)
      text += "v " + std::to_string(10 * ((cube & 1) + (i & 1))) + " " +
              std::to_string(10 * ((cube >> 1 & 1) + (i >> 1 & 1))) + " " +
              std::to_string(10 * ((cube >> 2) + (i >> 2))) + "\n";
    for (const auto& face : {std::array{1, 3, 4, 2},
                             {5, 6, 8, 7},
                             {1, 2, 6, 5},
                             {3, 7, 8, 4},
                             {1, 5, 7, 3},
                             {2, 4, 8, 6}}) {
      text += "f";
      for (const int at : face) text += " " + std::to_string(corner + at);
      text += "\n";
    }
    corner += 8;
  }
  return text;
}

/// Files below a folder with their bytes; of a file itself just that.
std::map<std::string, std::string> Content(const std::string& inPath) {
  std::map<std::string, std::string> files;
  if (fs::is_regular_file(inPath)) files[""] = ReadFile(inPath);
  if (!fs::is_directory(inPath)) return files;
  for (const auto& entry : fs::recursive_directory_iterator(inPath))
    if (entry.is_regular_file()) files[fs::relative(entry.path(), inPath)] = ReadFile(entry.path());
  return files;
}

/// Names of the files that only one has, or that differ.
Words Differences(const std::string& inPath, const std::map<std::string, std::string>& inContent) {
  auto other = Content(inPath);
  Words names;
  for (const auto& [name, bytes] : inContent) {
    const auto found = other.find(name);
    if (found == other.end() || found->second != bytes) names.push_back(name);
    if (found != other.end()) other.erase(found);
  }
  for (const auto& [name, bytes] : other) names.push_back(name);
  return names;
}

class Shares : public testing::Test {
 protected:
  Words PublishWords() const { return {"publish", result_, "--model", model_, "--size", "30x20"}; }
  Words DetectWords() const { return {"detect", model_, "--clearance", "1"}; }

  CommandResult Run(Words inWords, const Words& inMore) const {
    inWords.insert(inWords.end(), inMore.begin(), inMore.end());
    return RunCommand(inWords);
  }
  void MakeResult() const { ASSERT_EQ(Run(DetectWords(), {"-o", result_}).code, 0); }

  /// Makes all shares. @return their folders.
  Words MakeShares(const Words& inWords, int inCount, const std::string& inEnding = {}) const {
    Words folders;
    for (int i = 1; i <= inCount; ++i) {
      const std::string shard = std::to_string(i) + "/" + std::to_string(inCount);
      folders.push_back(
          folder_.Path(inWords[0] + std::to_string(i) + "of" + std::to_string(inCount) + inEnding));
      const CommandResult made = Run(inWords, {"--shard", shard, "-o", folders.back()});
      EXPECT_EQ(made.code, 0) << made.error;
      EXPECT_THAT(made.out, StartsWith(folders.back() + ": share " + shard + ", "));
    }
    return folders;
  }
  CommandResult Gather(Words inFolders, const std::string& inTarget) const {
    std::ranges::reverse(inFolders);
    return Run({"gather", "-o", inTarget}, inFolders);
  }
  std::string WhyRefused(const Words& inFolders) const {
    const std::string out = folder_.Path("refused");
    const CommandResult gathered = Gather(inFolders, out);
    EXPECT_EQ(gathered.code, 1);
    EXPECT_FALSE(fs::exists(out));
    return gathered.error;
  }

  TemporaryDirectory folder_;
  std::string model_ = folder_.Write("cubes.obj", Cubes()), result_ = folder_.Path("r.xml");
};

TEST_F(Shares, OfADetectionMakeTheResultOfOneMachine) {
  const CommandResult one = Run(DetectWords(), {"-o", result_});
  ASSERT_EQ(one.out, "0 clashes, 28 contacts, 0 clearances between 8 products\n") << one.error;
  for (const int count : {1, 2, 3, 7}) {
    const std::string out = folder_.Path("gathered.xml");
    const CommandResult gathered = Gather(MakeShares(DetectWords(), count), out);
    EXPECT_EQ(gathered.out, one.out) << gathered.error;
    EXPECT_EQ(ReadFile(out), ReadFile(result_)) << count << " shares";
  }
}

TEST_F(Shares, OfAPublicationMakeThePageOfOneMachine) {
  MakeResult();
  const std::string one = folder_.Path("one"), page = folder_.Path("one.html");
  ASSERT_EQ(Run(PublishWords(), {"-o", one}).code, 0);
  ASSERT_THAT(Content(one).size(), testing::Ge(100u));
  for (const int count : {1, 3, 7}) {
    const std::string out = folder_.Path("of" + std::to_string(count));
    const CommandResult gathered = Gather(MakeShares(PublishWords(), count), out);
    EXPECT_EQ(gathered.out, out + "/index.html: 28 interferences, 28 with a picture\n")
        << gathered.error;
    EXPECT_THAT(Differences(out, Content(one)), IsEmpty()) << count << " shares";
  }
  ASSERT_EQ(Run(PublishWords(), {"-o", page}).code, 0);
  const Words shares = MakeShares(PublishWords(), 2, ".html");
  const CommandResult gathered = Gather(shares, folder_.Path("of2.html"));
  EXPECT_EQ(gathered.error, "");
  EXPECT_THAT(Differences(folder_.Path("of2.html"), Content(page)), IsEmpty());
  // Shares with the pictures of the other form cost time, but make the same page.
  const CommandResult redrawn = Gather(shares, folder_.Path("of2"));
  EXPECT_THAT(redrawn.error, HasSubstr("pictures of another format"));
  EXPECT_THAT(Differences(folder_.Path("of2"), Content(one)), IsEmpty());
}

TEST_F(Shares, ThatDoNotBelongTogetherAreNamed) {
  Words shares = MakeShares(DetectWords(), 3);
  EXPECT_EQ(WhyRefused({shares[0], shares[2]}), "lyra: a share is missing: 2/3\n");
  EXPECT_EQ(WhyRefused({shares[1]}), "lyra: shares are missing: 1/3 3/3\n");
  EXPECT_THAT(WhyRefused({shares[0], shares[1], shares[2], shares[1]}),
              HasSubstr("share 2/3 is there twice: "));
  const auto isForeign = [&](const std::string& inFolder, const std::string& inWhy) {
    EXPECT_EQ(
        WhyRefused({inFolder, shares[0], shares[1]}),
        "lyra: " + inFolder + ": is a foreign share: " + inWhy + " than in " + shares[1] + "\n");
  };
  const std::string foreign = folder_.Path("foreign"), other = folder_.Path("other.obj");
  Run(DetectWords(), {"--sheets", "ignore", "--shard", "3/3", "-o", foreign});
  isForeign(foreign, "its option sheets is \"ignore\", another");
  Run(DetectWords(), {"--shard", "3/4", "-o", foreign});
  isForeign(foreign, "it is one of 4, another number");
  std::ofstream(other) << Cubes() << "# another\n";
  Run({"detect", other, "--clearance", "1"}, {"--shard", "3/3", "-o", foreign});
  isForeign(foreign, "its model is another");
  std::string manifest = ReadFile(shares[2] + "/share.json");
  const std::string version = "\"version\": \"";
  manifest.insert(manifest.find(version) + version.size(), "9");
  std::ofstream(foreign + "/share.json") << manifest;
  EXPECT_THAT(WhyRefused({foreign, shares[0], shares[1]}), HasSubstr("it was made by version 9"));
  EXPECT_THAT(WhyRefused({shares[0], folder_.Path("no")}), HasSubstr("/no: is no share"));
  std::ofstream(foreign + "/share.json") << manifest.substr(0, 200);
  EXPECT_THAT(WhyRefused({foreign, shares[0]}), HasSubstr("share.json: is damaged"));
  std::ofstream(model_, std::ios::app) << "# edited since\n";
  EXPECT_THAT(WhyRefused(shares), HasSubstr("is not the model that the shares were made of"));
}

TEST_F(Shares, AreMendedByWhatIsMissing) {
  MakeResult();
  const Words shares = MakeShares(PublishWords(), 2);
  const Words again = {"--shard", "1/2", "--resume", "-o", shares[0]};
  EXPECT_THAT(Run(PublishWords(), again).out, HasSubstr("was there already"));
  const auto whole = Content(shares[0]);
  const std::string picture = shares[0] + "/pictures/interference_1.jpg",
                    small = shares[0] + "/pictures/interference_1_product_1.jpg";
  std::ofstream(small) << "damaged";
  EXPECT_EQ(WhyRefused(shares), "lyra: " + small +
                                    ": is missing or damaged: share 1/2 must be done again, with "
                                    "--resume\n");
  fs::remove(shares[0] + "/pictures/interference_2.jpg");
  EXPECT_EQ(Run(PublishWords(), again).code, 0);
  EXPECT_THAT(Differences(shares[0], whole), IsEmpty());
  fs::remove(picture);
  EXPECT_THAT(WhyRefused(shares), HasSubstr("is missing or damaged"));
}

TEST_F(Shares, OfAPageInOneFileGoOn) {
  MakeResult();
  const std::string page = folder_.Path("page.html"), one = folder_.Path("one.html");
  ASSERT_EQ(Run(PublishWords(), {"-o", one}).code, 0);
  const std::string share = folder_.Path("share.html"), other = folder_.Path("other.html");
  const Words first = {"--shard", "1/2", "--resume", "-o", share};
  EXPECT_THAT(Run(PublishWords(), first).out, testing::EndsWith(" items\n"));
  EXPECT_THAT(Run(PublishWords(), first).out, HasSubstr("was there already"));
  const auto whole = Content(share);
  EXPECT_EQ(whole.count("pictures/interference_1.png"), 1u);
  // As a run leaves it that was killed between two pictures.
  std::string manifest = ReadFile(share + "/share.json");
  manifest.replace(manifest.find("\"complete\": true"), 16, "\"complete\": false");
  std::ofstream(share + "/share.json") << manifest;
  fs::remove(share + "/pictures/interference_2.png");
  EXPECT_THAT(Run({"gather", share, share, "-o", page}, {}).error, HasSubstr("is there twice"));
  EXPECT_EQ(Run(PublishWords(), first).code, 0);
  EXPECT_THAT(Differences(share, whole), IsEmpty());
  EXPECT_EQ(Run(PublishWords(), {"--shard", "2/2", "--resume", "-o", other}).code, 0);
  const CommandResult gathered = Gather({share, other}, page);
  EXPECT_EQ(gathered.error, "");
  EXPECT_THAT(Differences(page, Content(one)), IsEmpty());
  // What is asked for is another share now: nothing of this one stays.
  const CommandResult anew = Run({"publish", result_, "--model", model_, "--size", "20x20"}, first);
  EXPECT_EQ(anew.error, "lyra: warning: " + share +
                            ": held a foreign share: its option size is \"30x20\", another than is "
                            "asked for; it is made anew\n");
  EXPECT_NE(ReadFile(share + "/pictures/interference_1.png"),
            whole.at("pictures/interference_1.png"));
}

TEST_F(Shares, OfADetectionGoOnWhereTheyWereKilled) {
  ASSERT_EQ(Run(DetectWords(), {"-o", result_}).code, 0);
  const std::string share = folder_.Path("share"), checkpoint = share + "/findings.part";
  const Words whole = {"--shard", "1/1", "--resume", "--jobs", "1", "-o", share};
  // The end of a run that cannot write its findings leaves what a killed one does.
  const auto leftBy = [&](const Words& inWords) {
    fs::remove(share + "/findings.bin");
    fs::create_directories(share + "/findings.bin");
    EXPECT_EQ(Run(inWords, whole).code, 1);
    return ReadFile(checkpoint);
  };
  const std::string all = leftBy(DetectWords());
  std::ofstream(checkpoint) << all.substr(0, all.size() / 2);
  const std::string more = leftBy(DetectWords());
  EXPECT_EQ(more.substr(0, all.size() / 3), all.substr(0, all.size() / 3));
  EXPECT_GT(more.size(), all.size());                   // a second start, and nothing is lost
  EXPECT_LT(more.size(), all.size() + all.size() / 4);  // but nothing is found again
  const Words otherWords = {"detect", model_, "--clearance", "2"};
  const std::string others = leftBy(otherWords);  // does not go on with that of another work
  EXPECT_EQ(others.size(), all.size());
  leftBy(DetectWords());
  std::ofstream(checkpoint) << others;
  EXPECT_EQ(leftBy(DetectWords()).size(), all.size());
  std::ofstream(checkpoint, std::ios::app) << "cut off";
  fs::remove(share + "/findings.bin");
  EXPECT_EQ(Run(DetectWords(), whole).out, share + ": share 1/1, 28 items\n");
  EXPECT_FALSE(fs::exists(checkpoint));
  const std::string out = folder_.Path("gathered.xml");
  EXPECT_EQ(Gather({share}, out).error, "");
  EXPECT_EQ(ReadFile(out), ReadFile(result_));
}

TEST_F(Shares, ThatAreNoneAreWrongUsage) {
  for (const char* const shard : {"0/3", "4/3", "x/y", "1/0", "1", "1/3/5", "-1/3", "1/9999999"}) {
    const CommandResult refused = Run(DetectWords(), {"--shard", shard, "-o", folder_.Path("x")});
    EXPECT_EQ(refused.code, 2) << shard;
    EXPECT_THAT(refused.error, HasSubstr("is no share; it is K/N"));
  }
  EXPECT_EQ(Run(DetectWords(), {"--json", "-o", folder_.Path("x")}).code, 2);
  EXPECT_EQ(Run(DetectWords(), {"--plan", "--shares", "0"}).code, 2);
  EXPECT_EQ(Run(DetectWords(), {}).error, "lyra: detect: -o is required\nsee lyra --help\n");
}

TEST_F(Shares, OfAPlanHoldAllItems) {
  const CommandResult plan = Run(DetectWords(), {"--plan", "--shares", "3"});
  EXPECT_THAT(plan.out, StartsWith("Share  Items     Time  Memory [MB]\n  1/3 "));
  EXPECT_THAT(plan.out, HasSubstr("items, of which"));
  MakeResult();
  const CommandResult pictures = Run(PublishWords(), {"--plan", "--shares", "2"});
  EXPECT_THAT(pictures.out, HasSubstr("for 29 items, of which 24 were tried"));
  EXPECT_THAT(pictures.error, "");
}

}  // namespace
