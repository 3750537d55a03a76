// What the library shows to others, and what it needs from them.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <regex>
#include <set>

#include "house/Program.h"

using house::LinesOf;
using testing::Contains;
using testing::ElementsAre;
using testing::IsEmpty;
using testing::Not;

namespace {
using Names = std::vector<std::string>;

const std::string kLibrary = ZOR_BINARY_DIR "/lib/libZORLyra.so";
const std::string kPlatform = ZOR_BINARY_DIR "/lib/libZORDefaultPlatform.so";

/// The symbols that `nm` lists, without address and kind.
Names SymbolsOf(const std::string& inOptions, const std::string& inFile) {
  Names names;
  const std::regex line(R"(^[0-9a-f ]{16} [A-Za-z] (.*)$)");
  for (const std::string& text : LinesOf("nm -D " + inOptions + " '" + inFile + "'")) {
    std::smatch match;
    if (std::regex_match(text, match, line)) names.push_back(match[1]);
  }
  return names;
}

/// Those that belong to none of the exported classes.
Names Strangers(const Names& inDemangled) {
  static const std::regex kOurs(
      "((vtable|typeinfo|typeinfo name) for )?"
      "(ZORClashParsing|ZORLyraXMLServices|BuildPath|ZORLyraGeneralServices|PrintPictures)(::.*)?");
  Names strangers;
  std::ranges::copy_if(inDemangled, std::back_inserter(strangers),
                       [](const std::string& name) { return !std::regex_match(name, kOurs); });
  return strangers;
}

/// Those that come neither from the platform nor from the compiler's and the system's libraries.
Names Unexpected(const Names& inNeeded, const Names& inPlatform) {
  static const std::regex kSystem(
      ".*@(GLIBC|GLIBCXX|CXXABI|GCC)_.*|__(gmon_start__|cxa_finalize)|_ITM_.*");
  const std::set<std::string> platform(inPlatform.begin(), inPlatform.end());
  Names unexpected;
  std::ranges::copy_if(inNeeded, std::back_inserter(unexpected), [&](const std::string& name) {
    if (name.find("xercesc") != std::string::npos) return true;
    return !platform.contains(name) && !std::regex_match(name, kSystem);
  });
  return unexpected;
}
}  // namespace

TEST(Symbols, LibraryExportsItsClassesAlone) {
  const Names exported = SymbolsOf("-C --defined-only", kLibrary);
  EXPECT_THAT(exported, Contains(testing::StartsWith("ZORClashParsing::LoadSequence(")));
  EXPECT_THAT(Strangers(exported), IsEmpty());
}

TEST(Symbols, OtherExportsAreNoticed) {
  EXPECT_THAT(Strangers({"BuildPath::AppendSlash(ZORUnicodeString&)", "vtable for ZORClashParsing",
                         "ZORClashParsingHelper::Run()", "names::Alias",
                         "std::vector<int>::push_back(int const&)", "xercesc_3_2::DOMNode::x()"}),
              ElementsAre("ZORClashParsingHelper::Run()", "names::Alias",
                          "std::vector<int>::push_back(int const&)", "xercesc_3_2::DOMNode::x()"));
}

TEST(Symbols, LibraryNeedsThePlatformAndTheSystemAlone) {
  const Names needed = SymbolsOf("--undefined-only", kLibrary);
  EXPECT_THAT(needed, Contains(testing::StartsWith("_ZN16ZORUnicodeString")));
  EXPECT_THAT(Unexpected(needed, SymbolsOf("--defined-only", kPlatform)), IsEmpty());
}

TEST(Symbols, OtherNeedsAreNoticed) {
  EXPECT_THAT(Unexpected({"_ZN7ZORTimeC1Ev", "malloc@GLIBC_2.2.5", "_Znwm@GLIBCXX_3.4",
                          "__gmon_start__", "_ZN11xercesc_3_27DOMNode1xEv", "xmlReadFile"},
                         {"_ZN7ZORTimeC1Ev", "_ZN11xercesc_3_27DOMNode1xEv"}),
              ElementsAre("_ZN11xercesc_3_27DOMNode1xEv", "xmlReadFile"));
}

TEST(Symbols, LibraryLoadsNoThirdParty) {
  Names needed;
  for (const std::string& line : LinesOf("readelf -d '" + kLibrary + "'")) {
    std::smatch match;
    if (std::regex_search(line, match, std::regex(R"(\(NEEDED\).*\[(.*)\])"))) {
      needed.push_back(match[1]);
    }
  }
  EXPECT_THAT(needed, Contains(testing::StartsWith("libZORDefaultPlatform.so")));
  const testing::Matcher<std::string> known = testing::MatchesRegex(
      "(libZORDefaultPlatform|libstdc\\+\\+|libm|libc|libgcc_s|ld-linux.*)\\.so."
      "*");
  EXPECT_THAT(needed, testing::Each(known));
}

#ifdef ZOR_HAS_COMMAND
namespace {
/// The libraries that the command loads while it shows a document, also those loaded by name.
Names LoadedFor(const std::string& inDocument) {
  return LinesOf("LD_DEBUG=files '" ZOR_BINARY_DIR "/bin/lyra' info '" + inDocument +
                 "' 2>&1 >/dev/null | grep 'calling init'");
}
}  // namespace

TEST(Symbols, CommandReadsPlainDocumentsWithoutTheXmlLibrary) {
  const Names loaded = LoadedFor(ZOR_SOURCE_DIR "/samples/as1.clash.xml");
  EXPECT_THAT(loaded, Contains(testing::HasSubstr("libZORDefaultPlatform")));
  for (const char* other : {"libxerces-c", "libZORXmlScanner", "libZORExchange", "libzip",
                            "libcurl", "libgnutls", "libldap"})
    EXPECT_THAT(loaded, Not(Contains(testing::HasSubstr(other))));
}

TEST(Symbols, TheXmlLibraryIsLoadedForADocumentThatNeedsIt) {
  const std::string path = testing::TempDir() + "latin1.clash.xml";
  std::ofstream(path) << "<?xml version='1.0' encoding='ISO-8859-1'?><a/>";
  EXPECT_THAT(LoadedFor(path), Contains(testing::HasSubstr("libxerces-c")));
}
#endif
