// The option --lang.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tools/Command.h"

namespace {

const char kRefusal[] =
    "lyra: --lang: unknown word \"xx\"; known are de, en, es, fr, it, ja\nsee lyra --help\n";
/// Its statuses are in French.
const char kFrench[] = "samples/dissonance.clash.xml";

std::string Listed(const std::string& inLanguage) {
  const CommandResult result = RunCommand({"list", kFrench, "--csv", "--lang", inLanguage});
  EXPECT_EQ(result.code, 0) << result.error;
  return result.out;
}

}  // namespace

TEST(Language, UnknownOneIsWrongUsageAndNamesTheKnown) {
  const CommandResult result = RunCommand({"list", kFrench, "--lang", "xx"});
  EXPECT_EQ(result.code, 2);
  EXPECT_EQ(result.out, "");
  EXPECT_EQ(result.error, kRefusal);
}

TEST(Language, UnknownOneIsRefusedBeforeTheVerbToo) {
  const CommandResult result = RunCommand({"--lang", "xx_YY", "path", "a"});
  EXPECT_EQ(result.code, 2);
  EXPECT_EQ(result.error, kRefusal);
}

TEST(Language, LocaleIsItsLanguage) {
  ASSERT_NE(Listed("fr"), Listed("en"));
  EXPECT_EQ(Listed("fr_CA.UTF-8"), Listed("fr"));
  EXPECT_EQ(Listed("FR"), Listed("fr"));
}
