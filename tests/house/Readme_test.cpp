// What the README shows is what the checks build and run.
#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <string>

namespace {
std::string ReadAll(const std::string& inPath) {
  std::ifstream stream(inPath, std::ios::binary);
  EXPECT_TRUE(stream) << inPath;
  std::ostringstream text;
  text << stream.rdbuf();
  return text.str();
}

/// The first fenced block of a language, without its fences; empty when there is none.
std::string FencedBlock(const std::string& inText, const std::string& inLanguage) {
  const std::string fence = "```" + inLanguage + "\n";
  const std::size_t start = inText.find(fence);
  if (start == std::string::npos) return {};
  const std::size_t first = start + fence.size();
  return inText.substr(first, inText.find("```", first) - first);
}
}  // namespace

TEST(Readme, FencedBlockIsTheTextBetweenTheFences) {
  EXPECT_EQ(FencedBlock("a\n```sh\nb\n```\n```cpp\nint c;\n```\n", "cpp"), "int c;\n");
  EXPECT_EQ(FencedBlock("no block", "cpp"), "");
}

TEST(Readme, ShowsTheProgramThatTheConsumerTestBuilds) {
  const std::string shown = FencedBlock(ReadAll(ZOR_SOURCE_DIR "/README.md"), "cpp");
  EXPECT_EQ(shown, ReadAll(ZOR_SOURCE_DIR "/tests/consumer/project/main.cpp"));
}
