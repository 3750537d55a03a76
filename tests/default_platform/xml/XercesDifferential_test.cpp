// Our tree against the XML library's own one: the same kinds, names and values for every text, and
// the same refusals at the same place.
#include <filesystem>
#include <span>

#include "XMLCorpus.h"
#include "XercesPeer.h"
#include "support/EncodedText.h"
#include "support/PlatformFolder.h"

using peer::ReadByBoth;
using peer::RefusedByBoth;

namespace {

void ExpectReadByBoth(std::span<const std::string_view> inTexts) {
  for (const std::string_view text : inTexts) EXPECT_TRUE(ReadByBoth(std::string(text)));
}

void ExpectRefusedByBoth(std::span<const std::string_view> inTexts) {
  for (const std::string_view text : inTexts) EXPECT_TRUE(RefusedByBoth(std::string(text)));
}

/// All that must be read, of the whole corpus.
std::vector<std::string> AllReadable() {
  std::vector<std::string> texts;
  for (const std::span<const std::string_view> part :
       {std::span<const std::string_view>(corpus::kElements),
        {corpus::kAttributes},
        {corpus::kTexts},
        {corpus::kSections},
        {corpus::kComments},
        {corpus::kInstructions},
        {corpus::kDeclarations},
        {corpus::kDoctypes},
        {corpus::kEntities}})
    texts.insert(texts.end(), part.begin(), part.end());
  return texts;
}

constexpr const char* kLatin =
    "Pi\xC3\xA8"
    "ce \xC3\xBC\xC3\xB1";
constexpr const char* kJapanese = "\xE9\x83\xA8\xE5\x93\x81";
constexpr const char* kRussian = "\xD0\xB4\xD0\xB5\xD1\x82";
constexpr const char* kAll = "\xC3\xA9\xE9\x83\xA8\xF0\x9F\x98\x80";

struct EncodingCase {
  const char* declared;
  const char* converter;
  const char* value;
};

constexpr EncodingCase kEncodings[] = {
    {"UTF-8", "UTF-8", kAll},
    {"utf8", "UTF-8", kAll},
    {"US-ASCII", "US-ASCII", "plain"},
    {"ISO-8859-1", "ISO-8859-1", kLatin},
    {"latin1", "ISO-8859-1", kLatin},
    {"ISO-8859-2", "ISO-8859-2", "\xC5\x82\xC3\xB3"},
    {"ISO-8859-3", "ISO-8859-3", "\xC4\x89"},
    {"ISO-8859-4", "ISO-8859-4", "\xC4\x81"},
    {"ISO-8859-5", "ISO-8859-5", kRussian},
    {"ISO-8859-7", "ISO-8859-7", "\xCE\xA9"},
    {"ISO-8859-9", "ISO-8859-9", "\xC4\x9F"},
    {"ISO-8859-13", "ISO-8859-13", "\xC4\x85"},
    {"ISO-8859-15", "ISO-8859-15", "\xE2\x82\xAC"},
    {"windows-1250", "CP1250", "\xC5\x82"},
    {"windows-1251", "CP1251", kRussian},
    {"windows-1252", "CP1252", "\xE2\x82\xAC\xC3\xA9"},
    {"KOI8-R", "KOI8-R", kRussian},
    {"Shift_JIS", "SHIFT_JIS", kJapanese},
    {"EUC-JP", "EUC-JP", kJapanese},
    {"ISO-2022-JP", "ISO-2022-JP", kJapanese},
    {"GB2312", "GB2312", "\xE9\x83\xA8"},
    {"GBK", "GBK", "\xE9\x83\xA8"},
    {"GB18030", "GB18030", kAll},
    {"Big5", "BIG5", "\xE9\x83\xA8"},
    {"EUC-KR", "EUC-KR", "\xEB\xB6\x80\xED\x92\x88"},
    {"ebcdic-cp-us", "IBM037", kLatin},
    {"IBM1140", "IBM1140", kLatin},
    {"UTF-16", "UTF-16LE", kAll},
    {"UTF-16", "UTF-16BE", kAll},
    {"UTF-16LE", "UTF-16LE", kAll},
    {"UTF-16BE", "UTF-16BE", kAll},
    {"UCS-4", "UTF-32LE", kAll},
    {"UCS-4", "UTF-32BE", kAll},
    {"ISO-10646-UCS-4", "UTF-32BE", kAll},
};

std::string Declared(const EncodingCase& inCase) {
  return std::string("<?xml version='1.0' encoding='") + inCase.declared + "'?>\n<a k='" +
         inCase.value + "'>" + inCase.value + "\n<b/></a>";
}

constexpr const char* kRich =
    "<?xml version=\"1.0\"?>\n<!-- c --><!DOCTYPE a PUBLIC \"p\" \"s\" [<!ELEMENT a (b,c?)+>"
    "<!ATTLIST b k (x|y) 'x' l NMTOKENS ' u  v '><!ENTITY e '<c/>t&#38;lt;'><!ENTITY % p "
    "'<!ELEMENT d ANY>'> %p;]>\n<?q?><a x=\"1&#10;\t\">t&e;<![CDATA[s]]>]<b k='y' l=' 1  2 '/>"
    "<![CDATA[]]><!-- d --><?q r?>&#233;&lt;<b>\r\n</b>\n</a><!--e-->";

}  // namespace

// ---- the same trees

TEST(XercesDifferential, AllSamplesGiveTheSameTree) {
  int samples = 0;
  for (const auto& entry : std::filesystem::directory_iterator(ZOR_SOURCE_DIR "/samples")) {
    if (!entry.path().string().ends_with(".clash.xml")) continue;
    EXPECT_TRUE(ReadByBoth(support::ReadFile(entry.path()))) << entry.path();
    ++samples;
  }
  EXPECT_GT(samples, 0);
}

TEST(XercesDifferential, RichDocumentGivesTheSameTree) { EXPECT_TRUE(ReadByBoth(kRich)); }
TEST(XercesDifferential, ElementsGiveTheSameTree) { ExpectReadByBoth(corpus::kElements); }
TEST(XercesDifferential, AttributesGiveTheSameTree) { ExpectReadByBoth(corpus::kAttributes); }
TEST(XercesDifferential, TextsGiveTheSameTree) { ExpectReadByBoth(corpus::kTexts); }
TEST(XercesDifferential, SectionsGiveTheSameTree) { ExpectReadByBoth(corpus::kSections); }
TEST(XercesDifferential, CommentsGiveTheSameTree) { ExpectReadByBoth(corpus::kComments); }
TEST(XercesDifferential, InstructionsGiveTheSameTree) { ExpectReadByBoth(corpus::kInstructions); }
TEST(XercesDifferential, DeclarationsGiveTheSameTree) { ExpectReadByBoth(corpus::kDeclarations); }
TEST(XercesDifferential, DocumentTypesGiveTheSameTree) { ExpectReadByBoth(corpus::kDoctypes); }
TEST(XercesDifferential, EntitiesGiveTheSameTree) { ExpectReadByBoth(corpus::kEntities); }

TEST(XercesDifferential, EncodingsGiveTheSameTree) {
  for (const EncodingCase& one : kEncodings) {
    SCOPED_TRACE(std::string(one.declared) + " in " + one.converter);
    const std::string text = support::Encoded(Declared(one), one.converter);
    ASSERT_FALSE(text.empty());
    EXPECT_TRUE(ReadByBoth(text));
  }
}

TEST(XercesDifferential, WideTextsGiveTheSameTree) {
  for (const std::string& text : AllReadable()) {
    if (text.find("encoding") != std::string::npos || text.starts_with("\xEF\xBB\xBF")) continue;
    for (const char* const encoding : {"UTF-16LE", "UTF-16BE"})
      EXPECT_TRUE(ReadByBoth(support::Encoded("\xEF\xBB\xBF" + text, encoding)));
  }
}

// The scanner reads 48 KB at a time; whatever stands there must not matter.
TEST(XercesDifferential, TextsAcrossTheBordersOfReadsGiveTheSameTree) {
  constexpr std::size_t kBorder = 48 * 1024;
  for (const std::string& text : AllReadable()) {
    if (text.find("<?xml ") != std::string::npos || text.find("<?xml\n") != std::string::npos)
      continue;
    const std::string rest = text.starts_with("\xEF\xBB\xBF") ? text.substr(3) : text;
    const std::size_t before = kBorder - 7 - rest.size() / 2;
    EXPECT_TRUE(ReadByBoth("<!--" + std::string(before, 'x') + "-->" + rest));
  }
}

// The library leaves out a character that the end of the text cuts through.
TEST(XercesDifferential, CharacterCutOffAtTheEndIsReadAlike) {
  EXPECT_TRUE(ReadByBoth("<a/>\xC3"));
  EXPECT_TRUE(ReadByBoth("<a/>\n\xE9\x83"));
}

// There is no limit to those that need no declaration.
TEST(XercesDifferential, ManyPredefinedEntitiesGiveTheSameTree) {
  std::string text = "<a k='";
  for (int i = 0; i < 60'000; ++i) text += "&amp;";
  EXPECT_TRUE(ReadByBoth(text + "'/>"));
}

TEST(XercesDifferential, ManyAttributesGiveTheSameTree) {
  std::string text = "<a";
  for (int i = 0; i < 300; ++i)
    text += " n" + std::to_string(i * 7 % 300) + "='" + std::to_string(i) + "'";
  EXPECT_TRUE(ReadByBoth(text + "/>"));
  EXPECT_TRUE(RefusedByBoth(text + " n7='again'/>"));
}

// ---- the same refusals

TEST(XercesDifferential, BrokenTagsAreRefusedAlike) { ExpectRefusedByBoth(corpus::kBrokenTags); }
TEST(XercesDifferential, BrokenTextsAreRefusedAlike) { ExpectRefusedByBoth(corpus::kBrokenTexts); }
TEST(XercesDifferential, BrokenMarkupIsRefusedAlike) { ExpectRefusedByBoth(corpus::kBrokenMarkup); }
TEST(XercesDifferential, BrokenDocumentTypesAreRefusedAlike) {
  ExpectRefusedByBoth(corpus::kBrokenDoctypes);
}
TEST(XercesDifferential, BrokenBytesAreRefusedAlike) { ExpectRefusedByBoth(corpus::kBrokenBytes); }

TEST(XercesDifferential, BrokenBytesFarInAreRefusedAlike) {
  const std::string before = "<r>" + std::string(50'000, '\n') + std::string(50'000, 'x');
  for (const std::string_view bytes : corpus::kBrokenBytes)
    EXPECT_TRUE(RefusedByBoth(before + std::string(bytes)));
}

TEST(XercesDifferential, EveryTruncationIsRefusedAlike) {
  const std::string text = kRich;
  for (std::size_t length = 1; length + sizeof("\n<!--e-->") < text.size(); ++length) {
    if (length == text.rfind("</a>") + 4) continue;  // whole again
    EXPECT_TRUE(RefusedByBoth(text.substr(0, length))) << length;
  }
}

TEST(XercesDifferential, WrongEncodingsAreRefusedAlike) {
  constexpr EncodingCase kWrong[] = {
      {"UTF-8", "ISO-8859-1", kLatin}, {"US-ASCII", "UTF-8", kAll},
      {"ebcdic-cp-us", "UTF-8", kAll}, {"no-such-encoding", "UTF-8", "v"},
      {"UTF-8", "UTF-16LE", "v"},
  };
  for (const EncodingCase& one : kWrong) {
    SCOPED_TRACE(std::string(one.declared) + " in " + one.converter);
    EXPECT_TRUE(RefusedByBoth(support::Encoded(Declared(one), one.converter)));
  }
}
