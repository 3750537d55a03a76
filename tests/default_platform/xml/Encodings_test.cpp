// Every encoding, with and without byte-order mark.
#include <gtest/gtest.h>

#include <string>

#include "support/EncodedText.h"
#include "support/XMLText.h"

using support::Encoded;
using support::Narrow;
using support::ParseErrorOf;
using support::RootOf;

namespace {

void ExpectRead(const std::string& inBytes, const std::string& inValue) {
  ASSERT_FALSE(inBytes.empty());
  ASSERT_EQ(ParseErrorOf(inBytes), "");
  const DOM_Element root = RootOf(inBytes);
  EXPECT_EQ(Narrow(root.getAttribute("k")), inValue);
  EXPECT_EQ(Narrow(root.getFirstChild().getNodeValue()), inValue);
}

std::string TextWith(const std::string& inValue, const std::string& inDeclared) {
  const std::string declaration =
      inDeclared.empty() ? "" : "<?xml version=\"1.0\" encoding=\"" + inDeclared + "\"?>\n";
  return declaration + "<a k=\"" + inValue + "\">" + inValue + "</a>";
}

struct EncodingCase {
  const char* declared;
  const char* converter;
  const char* value;
};

constexpr const char* kLatin =
    "Pi\xC3\xA8"
    "ce \xC3\xBC\xC3\xB1";
constexpr const char* kJapanese = "\xE9\x83\xA8\xE5\x93\x81";  // "parts"
constexpr const char* kAll = "\xC3\xA9\xE9\x83\xA8\xF0\x9F\x98\x80";

}  // namespace

TEST(Encodings, DeclaredEncodingsAreRead) {
  const EncodingCase cases[] = {
      {"UTF-8", "UTF-8", kAll},
      {"utf-8", "UTF-8", kAll},
      {"US-ASCII", "US-ASCII", "plain"},
      {"ISO-8859-1", "ISO-8859-1", kLatin},
      {"ISO-8859-2", "ISO-8859-2", "\xC5\x82\xC3\xB3"},
      {"ISO-8859-5", "ISO-8859-5", "\xD0\xB4\xD0\xB5\xD1\x82"},
      {"ISO-8859-15", "ISO-8859-15", "\xE2\x82\xAC"},
      {"windows-1252", "CP1252", "\xE2\x82\xAC\xC3\xA9"},
      {"windows-1251", "CP1251", "\xD0\xB4\xD0\xB5\xD1\x82"},
      {"KOI8-R", "KOI8-R", "\xD0\xB4\xD0\xB5\xD1\x82"},
      {"Shift_JIS", "SHIFT_JIS", kJapanese},
      {"EUC-JP", "EUC-JP", kJapanese},
      {"ISO-2022-JP", "ISO-2022-JP", kJapanese},
      {"GB2312", "GB2312", "\xE9\x83\xA8"},
      {"GB18030", "GB18030", kAll},
      {"Big5", "BIG5", "\xE9\x83\xA8"},
      {"EUC-KR", "EUC-KR", "\xEB\xB6\x80\xED\x92\x88"},
      {"ebcdic-cp-us", "IBM037", kLatin},
      {"IBM1140", "IBM1140", kLatin},
  };
  for (const EncodingCase& one : cases) {
    SCOPED_TRACE(one.declared);
    ExpectRead(Encoded(TextWith(one.value, one.declared), one.converter), one.value);
  }
}

TEST(Encodings, WideEncodingsAreReadWithAndWithoutMark) {
  const EncodingCase cases[] = {
      {"UTF-16", "UTF-16LE", kAll}, {"UTF-16", "UTF-16BE", kAll}, {"", "UTF-16LE", kAll},
      {"", "UTF-16BE", kAll},       {"UCS-4", "UTF-32LE", kAll},  {"UCS-4", "UTF-32BE", kAll},
  };
  for (const EncodingCase& one : cases) {
    const std::string text = TextWith(one.value, one.declared);
    for (const char* const mark : {"", "\xEF\xBB\xBF"}) {
      SCOPED_TRACE(std::string(one.declared) + " in " + one.converter + (*mark ? " marked" : ""));
      if (*mark == 0 && *one.declared == 0) continue;  // nothing tells the encoding then
      ExpectRead(Encoded(mark + text, one.converter), one.value);
    }
  }
}

TEST(Encodings, Utf8IsReadWithMarkAndWithoutDeclaration) {
  ExpectRead(TextWith(kAll, ""), kAll);
  ExpectRead("\xEF\xBB\xBF" + TextWith(kAll, ""), kAll);
  ExpectRead("\xEF\xBB\xBF" + TextWith(kAll, "UTF-8"), kAll);
}

TEST(Encodings, WronglyDeclaredEncodingIsRefused) {
  // Latin text that claims to be UTF-8, and UTF-8 that claims to be something unlike it.
  EXPECT_NE(ParseErrorOf(Encoded(TextWith(kLatin, "UTF-8"), "ISO-8859-1")), "");
  EXPECT_NE(ParseErrorOf(TextWith(kAll, "ebcdic-cp-us")), "");
  EXPECT_NE(ParseErrorOf(TextWith(kAll, "US-ASCII")), "");
}

// Programs that copy a declaration along with the text write this; the first bytes tell better.
TEST(Encodings, WideEncodingDeclaredInBytewiseTextIsPassedOver) {
  ExpectRead(TextWith(kAll, "UTF-16"), kAll);
  ExpectRead(TextWith(kAll, "UCS-4"), kAll);
}

TEST(Encodings, BytesThatAreNoneOfTheEncodingAreRefusedWithTheirPlace) {
  const struct {
    const char* declared;
    const char* bytes;
    const char* reason;
  } cases[] = {
      {"GB18030", "\x81 ", "invalid byte 81 in the encoding gb18030"},
      {"GB18030", "\xFF", "invalid byte FF in the encoding gb18030"},
      {"ISO-8859-7", "\xFF", "invalid byte FF in the encoding iso-8859-7"},
      {"windows-1255", "\xD9", "invalid byte D9 in the encoding windows-1255"},
      {"ISO-2022-JP", "\x1B$B\xFF\xFF\x1B(B", "invalid bytes FF FF in the encoding iso-2022-jp"},
      {"UTF-7", "\xFF", "invalid byte FF in the encoding utf-7"},
      {"Shift_JIS", "\x81 ", "invalid byte 81 in the encoding shift_jis"},
      {"EUC-JP", "\xA4", "invalid byte A4 in the encoding euc-jp"},
  };
  for (const auto& one : cases) {
    SCOPED_TRACE(one.declared);
    const std::string text = TextWith("v\n" + std::string(one.bytes), one.declared);
    EXPECT_EQ(ParseErrorOf(text), std::string("LIDPipodIBM:3:2: ") + one.reason);
    // Far behind the beginning, and as the very last byte.
    const std::string far = TextWith("v" + std::string(100'000, '\n') + one.bytes, one.declared);
    EXPECT_EQ(ParseErrorOf(far), std::string("LIDPipodIBM:100002:2: ") + one.reason);
  }
  EXPECT_NE(ParseErrorOf(TextWith("v", "GB18030") + "\n\x81"), "");
}

TEST(Encodings, ReplacementCharacterOfTheTextItselfIsRead) {
  ExpectRead(TextWith("\x84\x31\xA4\x37", "GB18030"), "\xEF\xBF\xBD");
  ExpectRead(TextWith("+//0-", "UTF-7"), "\xEF\xBF\xBD");
}

TEST(Encodings, UnknownEncodingIsRefused) {
  EXPECT_NE(ParseErrorOf(TextWith("v", "no-such-encoding")), "");
  EXPECT_NE(ParseErrorOf(TextWith("v", "-")), "");
}

// A sequence of several bytes may lie across two reads of the file.
TEST(Encodings, LongTextsSurviveTheBordersOfReads) {
  std::string value;
  for (int i = 0; i < 40000; ++i) value += kAll;
  for (int shift = 0; shift < 9; ++shift) {
    const std::string text =
        "<a k=\"" + std::string(static_cast<std::size_t>(shift), 'x') + value + "\"/>";
    const DOM_Element root = RootOf(text);
    ASSERT_EQ(Narrow(root.getAttribute("k")).substr(static_cast<std::size_t>(shift)), value);
  }
}
