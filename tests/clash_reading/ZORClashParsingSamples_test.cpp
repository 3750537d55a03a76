// Every answer about the real clash results, compared with one worked out on another parser's tree.
#include <gtest/gtest.h>

#include <string>

#include "clash_reading/Answers.h"
#include "support/LoadedReader.h"
#include "support/PlatformFolder.h"
#include "support/ScopedVariable.h"

namespace clash_reading_test {
namespace {

using support::PlatformFolder;
using support::ScopedVariable;
using support::SharedReader;
using support::Text;

struct Sample {
  const char* name;
  int interferences;
};

class Samples : public testing::TestWithParam<Sample> {
 protected:
  // Settings come from a folder of the test, words from the catalogues that are shipped.
  Samples() { folder_.WriteSettings("ClashPublish", "PublishDefDir = \"/pub\"\n"); }

  std::string ReadText() const {
    return support::ReadFile(ZOR_SOURCE_DIR "/samples/" + std::string(GetParam().name) +
                             ".clash.xml");
  }
  void CompareIn(const char* inLanguage) const {
    const ScopedVariable language("ZOR_LANG", inLanguage);
    const std::string text = ReadText();
    const pugi::xml_document parsed = Parsed(text);
    const pugi::xml_node root = parsed.document_element();
    const Ranges ranges = RangesOf(root);
    ASSERT_EQ(GetParam().interferences, ranges.interferences);
    SharedReader reader(text);
    const int questions =
        ExpectSameAnswers(NaiveAnswers(root, "ClashElement", ranges, inLanguage),
                          ReaderAnswers(*reader, reader.root, ranges), GetParam().name);
    EXPECT_GE(questions, 6 * GetParam().interferences);
  }

 private:
  PlatformFolder folder_;
  ScopedVariable catalogues_{"ZOR_CATALOGUE_PATH", ZOR_SOURCE_DIR "/resources/catalogues"};
};

TEST_P(Samples, AllAnswersInEnglish) { CompareIn("en"); }
TEST_P(Samples, AllAnswersInFrench) { CompareIn("fr"); }

INSTANTIATE_TEST_SUITE_P(All, Samples,
                         testing::Values(Sample{"as1", 32}, Sample{"dissonance", 20},
                                         Sample{"printable_case", 27}, Sample{"pushdevice", 157},
                                         Sample{"low_cost_robot_arm", 402},
                                         Sample{"stamp_c6lora", 906}),
                         [](const auto& inInfo) { return std::string(inInfo.param.name); });

constexpr const char* kFrenchSample = ZOR_SOURCE_DIR "/samples/dissonance.clash.xml";

// Read from disk as the host would, where the other tests read from memory.
TEST(Sample, AnswersFromTheFileAreThoseFromMemory) {
  const std::string text = support::ReadFile(kFrenchSample);
  const pugi::xml_document parsed = Parsed(text);
  const Ranges ranges = RangesOf(parsed.document_element());
  SharedReader fromMemory(text);
  std::string path = kFrenchSample;
  ZORClashParsing fromFile(path.data());
  DOM_Document document;
  ZORUnicodeString kind;
  ASSERT_EQ(S_OK, fromFile.LoadSequence(document, kind));
  ExpectSameAnswers(ReaderAnswers(*fromMemory, fromMemory.root, ranges),
                    ReaderAnswers(fromFile, document.getDocumentElement(), ranges), kFrenchSample);
}

// The one that is written in French: what its words mean depends on the reader's language.
TEST(Sample, DissonanceHasFrenchWordsAndDecimalCommas) {
  const ScopedVariable language("ZOR_LANG", "fr");
  const support::LoadedReader loaded(support::ReadFile(kFrenchSample));
  EXPECT_EQ("ClashElement", Text(loaded.kind));
  EXPECT_EQ("dissonance", Text(loaded.reference));
  EXPECT_EQ("1.2", Text(loaded.version));
  SharedReader reader(support::ReadFile(kFrenchSample));
  support::ClashInfos infos;
  infos.Read(*reader, "1.2", 12);
  EXPECT_EQ("dissonance.Result.1", Text(infos.resultName));
  EXPECT_EQ("Clash", infos[1]);
  EXPECT_EQ("Relevant", infos[3]);
  EXPECT_EQ("New", infos[5]);
  EXPECT_EQ("Assembly 2 <1> --++-- CONNECTOR,JST PH SERIES,FEMALE_02 (PHR-2).1", infos[8]);
  EXPECT_EQ("7.57681", infos[25]);
  EXPECT_EQ("-13.97/38.6472/8.98/-13.97/38.6472/8.98", infos[28]);
  EXPECT_EQ("Cylindric", infos[32]);
  infos.Read(*reader, "1.2", 1);
  EXPECT_EQ("Clash", infos[1]);
  EXPECT_EQ("Not inspected", infos[3]);
  EXPECT_EQ("154.643", infos[25]);
  EXPECT_EQ("NOVIEWPOINT", infos[32]);
}

}  // namespace
}  // namespace clash_reading_test
