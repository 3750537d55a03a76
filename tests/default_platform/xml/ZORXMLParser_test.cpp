#include "platform/xml/ZORXMLParser.h"

#include <gtest/gtest.h>

#include <memory>
#include <thread>
#include <vector>

#include "platform/xml/DOMParser.h"
#include "support/XMLText.h"

namespace {
const unsigned char* Bytes(const char* inText) {
  return reinterpret_cast<const unsigned char*>(inText);
}
}  // namespace

TEST(ZORXMLParser, InitializeMayBeRepeated) {
  EXPECT_EQ(ZORXMLParser::Initialize(), S_OK);
  EXPECT_EQ(ZORXMLParser::Initialize(), S_OK);
}

TEST(ZORXMLParser, ThreadsMayInitializeAndParseAtOnce) {
  std::vector<std::thread> threads;
  std::vector<int> read(8, 0);
  for (std::size_t i = 0; i < read.size(); ++i)
    threads.emplace_back([&read, i] {
      EXPECT_EQ(ZORXMLParser::Initialize(), S_OK);
      for (int j = 0; j < 50; ++j)
        read[i] += support::WrittenText(support::ParseText("<a x='1'>t</a>")) == "<a x=\"1\">t</a>";
    });
  for (std::thread& thread : threads) thread.join();
  for (const int count : read) EXPECT_EQ(count, 50);
}

TEST(ZORXMLParser, MemorySourceIsReadByAParser) {
  InputSource* source = nullptr;
  ASSERT_EQ(ZORXMLParser::CreateMemBufInputSource(Bytes("<a/>rest"), 4, "name", 0, source), S_OK);
  const std::unique_ptr<InputSource> owner(source);
  DOMParser parser;
  parser.parse(*source);
  EXPECT_EQ(support::WrittenText(parser.getDocument()), "<a/>");
  parser.parse(*source);
  EXPECT_EQ(support::WrittenText(parser.getDocument()), "<a/>");
}

TEST(ZORXMLParser, MemorySourceIsNamedByItsIdentifierInErrors) {
  try {
    support::ParseText("<a>", "MyIdentifier");
    FAIL();
  } catch (const ZORXMLParseError& error) {
    EXPECT_EQ(error.source, "MyIdentifier");
  }
}

TEST(ZORXMLParser, AdoptedBytesAreDeletedWithTheSource) {
  // The address checker tells when they are not.
  unsigned char* const bytes = new unsigned char[4]{'<', 'a', '/', '>'};
  InputSource* source = nullptr;
  ASSERT_EQ(ZORXMLParser::CreateMemBufInputSource(bytes, 4, "name", 1, source), S_OK);
  ASSERT_NE(source, nullptr);
  delete source;
}

TEST(ZORXMLParser, NullBytesWithoutCountGiveAnEmptyDocument) {
  InputSource* source = nullptr;
  ASSERT_EQ(ZORXMLParser::CreateMemBufInputSource(nullptr, 0, "name", 0, source), S_OK);
  const std::unique_ptr<InputSource> owner(source);
  DOMParser parser;
  parser.parse(*source);
  EXPECT_FALSE(parser.getDocument().isNull());
  EXPECT_TRUE(parser.getDocument().getDocumentElement().isNull());
}

TEST(ZORXMLParser, NullBytesWithACountAreRefused) {
  InputSource* source = reinterpret_cast<InputSource*>(1);
  EXPECT_EQ(ZORXMLParser::CreateMemBufInputSource(nullptr, 1, "name", 0, source), E_INVALIDARG);
  EXPECT_EQ(source, nullptr);
}

TEST(ZORXMLParser, CountBeyondTheIntegersIsRefused) {
  InputSource* source = nullptr;
  EXPECT_EQ(ZORXMLParser::CreateMemBufInputSource(Bytes(""), 0x80000000u, "name", 0, source),
            E_INVALIDARG);
  EXPECT_EQ(source, nullptr);
}
