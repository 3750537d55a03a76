// Pages in one file, what they give back, and what tells whether they are up to date.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "tools/Command.h"

using testing::EndsWith;

namespace fs = std::filesystem;

namespace {

const std::string kResult = "samples/as1.clash.xml";
const std::string kModel = "samples/as1-oc-214.stp";

class OneFile : public testing::Test {
 protected:
  CommandResult Publish(const std::string& inOutput, std::vector<std::string> inMore = {}) {
    std::vector<std::string> words = {"publish",       kResult,  "--model", kModel, "--only",
                                      "product=plate", "--size", "90x60",   "-o",   inOutput};
    words.insert(words.end(), inMore.begin(), inMore.end());
    return RunCommand(words);
  }
  CommandResult Extract(std::vector<std::string> inMore = {}) {
    inMore.insert(inMore.begin(), {"extract", page_, "-o", extracted_});
    return RunCommand(inMore);
  }

  TemporaryDirectory directory_;
  std::string page_ = directory_.Path("Page.HTML"), extracted_ = directory_.Path("back.xml");
};

}  // namespace

TEST_F(OneFile, HoldsEverythingAndGivesTheResultBack) {
  const CommandResult made = Publish(page_);
  ASSERT_EQ(made.code, 0) << made.error;
  EXPECT_THAT(made.out, EndsWith(" with a picture\n"));
  const std::string page = ReadFile(page_);
  EXPECT_NE(page.find("img-src data:;"), std::string::npos);
  EXPECT_NE(page.find("href=\"data:image/webp;base64,"), std::string::npos);
  EXPECT_EQ(page.find("src=\"pictures"), std::string::npos);
  EXPECT_EQ(std::distance(fs::directory_iterator(directory_.Path("")), {}), 1);

  ASSERT_EQ(Extract().code, 0);
  EXPECT_EQ(ReadFile(extracted_), ReadFile(ZOR_SOURCE_DIR "/" + kResult));
  EXPECT_EQ(RunCommand({"extract", page_, "--manifest", "-o", "-"}).out.substr(0, 29),
            "{\n \"format\": \"zorlyra-page/1\"");

  ASSERT_EQ(Publish(page_).code, 0);
  EXPECT_TRUE(ReadFile(page_) == page) << "other bytes the second time";
}

TEST_F(OneFile, DamageIsFound) {
  ASSERT_EQ(Publish(page_).code, 0);
  std::string page = ReadFile(page_);
  const std::string start = "id=\"zor-block-result\">";
  char& digit = page[page.find(start) + start.size() + 2000];
  digit = digit == 'A' ? 'B' : 'A';
  directory_.Write("Page.HTML", page);
  const CommandResult result = Extract();
  EXPECT_EQ(result.code, 1);
  EXPECT_EQ(result.error,
            "lyra: " + page_ + ": the result in the page is damaged: its hash is another\n");
  EXPECT_FALSE(fs::exists(extracted_));
  EXPECT_EQ(RunCommand({"publish", "--verify", page_}).code, 3);

  directory_.Write("Page.HTML", "<html></html>");
  EXPECT_EQ(Extract().error, "lyra: " + page_ + ": is no page of lyra publish, or is cut off\n");
}

TEST_F(OneFile, VerifySaysWhatChanged) {
  for (const std::string& output : {page_, directory_.Path("folder")}) {
    ASSERT_EQ(Publish(output).code, 0);
    EXPECT_EQ(Publish(output, {"--verify"}).out, output + ": nothing has changed\n");
    EXPECT_EQ(RunCommand({"publish", "--verify", output}).code, 0);
    const CommandResult other = RunCommand({"publish", "--verify", "samples/dissonance.clash.xml",
                                            "--only", "product=plate", "-o", output});
    EXPECT_EQ(other.code, 3);
    EXPECT_EQ(other.out,
              "result: changed\nmodel: not given any more\n"
              "setting size: \"90x60\" became \"756x506\"\n");
  }
  const std::string picture = directory_.Path("folder/pictures/interference_9.jpg");
  ASSERT_TRUE(fs::exists(picture));
  fs::remove(picture);
  EXPECT_EQ(RunCommand({"publish", "--verify", directory_.Path("folder")}).out,
            "pictures/interference_9.jpg: missing\n");
  EXPECT_EQ(RunCommand({"publish", "--verify", directory_.Path("none")}).code, 1);
}

TEST_F(OneFile, FolderOfThatNameStaysOne) {
  fs::create_directory(page_);
  ASSERT_EQ(Publish(page_).code, 0);
  EXPECT_TRUE(fs::exists(page_ + "/index.html"));
  EXPECT_EQ(RunCommand({"publish", kResult}).code, 2);
}
