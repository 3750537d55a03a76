// Our tree against the XML library's own one, on documents by chance and on what damage makes of
// them.
#include "FastPathReader.h"
#include "RandomXML.h"
#include "XercesPeer.h"
#include "support/XMLText.h"

namespace {

// The sanitizers make each document ten times as slow.
#if defined(__SANITIZE_ADDRESS__)
constexpr int kDocuments = 1'000;
#else
constexpr int kDocuments = 25'000;
#endif

/// Whether a document is XML 1.0 in UTF-8 and without a document type.
bool IsForFastPath(const std::string& inText) {
  return inText.find('\0') == std::string::npos && inText.find("ISO-8859-1") == std::string::npos &&
         inText.find("version='1.1'") == std::string::npos &&
         inText.find("<!DOCTYPE") == std::string::npos;
}

/// Compares so many documents, and every second one damaged.
void CompareDocuments(unsigned int inSeed) {
  std::mt19937 random(inSeed);
  peer::Tally whole;
  peer::Tally damaged;
  int eligible = 0;
  int fast = 0;
  for (int i = 0; i < kDocuments; ++i) {
    const std::string text = RandomDocument(random);
    ASSERT_TRUE(peer::ReadAlike(text, whole)) << "document " << i;
    ASSERT_EQ(whole.read, i + 1) << support::ParseErrorOf(text) << "\n" << text;
    eligible += IsForFastPath(text);
    fast += IsReadByFastPath(text);
    if (i % 2 == 0) continue;
    ASSERT_TRUE(peer::ReadAlike(Damaged(text, random), damaged)) << "damaged document " << i;
  }
  // A fast path that never read anything would also compare well.
  EXPECT_EQ(fast, eligible);
  EXPECT_GT(fast, kDocuments * 2 / 5);
  EXPECT_GT(damaged.read, kDocuments / 40);
  EXPECT_GT(damaged.refused, kDocuments / 4);
}

}  // namespace

// A hundred thousand in all; in four parts, which run side by side.
TEST(XercesDifferentialRandom, FirstDocumentsAreReadOrRefusedAlike) { CompareDocuments(1); }
TEST(XercesDifferentialRandom, SecondDocumentsAreReadOrRefusedAlike) { CompareDocuments(2); }
TEST(XercesDifferentialRandom, ThirdDocumentsAreReadOrRefusedAlike) { CompareDocuments(3); }
TEST(XercesDifferentialRandom, FourthDocumentsAreReadOrRefusedAlike) { CompareDocuments(4); }
