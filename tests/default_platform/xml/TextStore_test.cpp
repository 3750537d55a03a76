// How texts are kept: a byte a character where all fit, and where they lie.
#include "default_platform/xml/TextStore.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

TEST(TextStore, TextsThatFitBytesAreNarrow) {
  TextStore texts;
  EXPECT_FALSE(texts[texts.Add(std::u16string_view(u"plain"))].IsWide());
  EXPECT_FALSE(texts[texts.Add(std::u16string_view(u"\u00FF"))].IsWide());
  EXPECT_TRUE(texts[texts.Add(std::u16string_view(u"\u0100"))].IsWide());
  EXPECT_EQ(texts[texts.Add(std::u16string_view(u"\u00E9"))].View().ToUtf16(), u"\u00E9");
  EXPECT_EQ(texts[texts.Add(std::u16string_view(u"\u90E8"))].View().ToUtf16(), u"\u90E8");
}

TEST(TextStore, EqualTextsAreKeptOnceInWhateverFormTheyCome) {
  TextStore texts;
  EXPECT_EQ(texts.Add(std::u16string_view(u"NO")), texts.Add(std::string_view("NO")));
  EXPECT_NE(texts.Add(std::string_view("NO")), texts.Add(std::string_view("No")));
  TextSeries series;
  EXPECT_EQ(texts.Add("NO", series), texts.Add(std::string_view("NO")));
}

// Around the sizes of pages, of which a large text takes several.
TEST(TextStore, TextsOfEverySizeComeBack) {
  TextStore texts;
  std::vector<TextRef> narrow, wide;
  const std::vector<std::size_t> sizes = {0,      1,       63,     64,      65,     4'000,
                                          4'096,  16'383,  16'384, 65'531,  65'532, 65'533,
                                          70'000, 131'072, 3,      500'000, 7};
  for (const std::size_t size : sizes) {
    narrow.push_back(texts.Add(std::string_view(std::string(size, 'n'))));
    wide.push_back(texts.Add(std::u16string_view(std::u16string(size, u'\u90E8'))));
  }
  for (std::size_t i = 0; i < sizes.size(); ++i) {
    EXPECT_EQ(texts[narrow[i]].View().ToUtf16(), std::u16string(sizes[i], u'n'));
    EXPECT_EQ(texts[wide[i]].View().ToUtf16(), std::u16string(sizes[i], u'\u90E8'));
  }
}

TEST(TextStore, WidenedTextsStayWhereTheyAre) {
  TextStore texts;
  const DOM_Text& text = texts[texts.Add(std::string_view("caf\xE9"))];
  const char16_t* const units = texts.Widen(text);
  for (int i = 0; i < 10'000; ++i)
    texts.Widen(texts[texts.Add(std::string_view(std::to_string(i)))]);
  EXPECT_EQ(texts.Widen(text), units);
  EXPECT_EQ(std::u16string_view(units, 4), u"caf\u00E9");
}

// The sizes at which blocks of eight end, and one character of them that differs.
TEST(Latin1, IsWidenedAndComparedAtEverySize) {
  for (std::size_t size = 0; size < 40; ++size) {
    std::string narrow;
    for (std::size_t i = 0; i < size; ++i) narrow += static_cast<char>(0xF0 + i);
    std::u16string wide(size + 1, u'#');
    WidenLatin1(narrow, wide.data());
    EXPECT_EQ(wide.back(), u'#');
    wide.pop_back();
    for (std::size_t i = 0; i < size; ++i) EXPECT_EQ(wide[i], (0xF0 + i) & 0xFF) << size;
    EXPECT_TRUE(IsSameText(wide, narrow)) << size;
    EXPECT_FALSE(IsSameText(wide + u"x", narrow)) << size;
    for (std::size_t i = 0; i < size; ++i) {
      std::u16string other = wide;
      other[i] = static_cast<char16_t>(other[i] + 0x100);
      EXPECT_FALSE(IsSameText(other, narrow)) << size << ' ' << i;
    }
  }
}

TEST(NameTable, NamesAreFoundByTheirTextWhereverItLies) {
  TextStore texts;
  NameTable names(texts);
  const std::uint32_t alias = names.Intern(u"Alias");
  char asked[] = "Alias";
  EXPECT_EQ(names.FindAscii(asked), alias);
  asked[0] = 'a';  // the same place holds another name now
  EXPECT_EQ(names.FindAscii(asked), 0u);
  const std::uint32_t other = names.Intern(u"alias");
  EXPECT_EQ(names.FindAscii(asked), other);
  asked[0] = 'A';
  EXPECT_EQ(names.FindAscii(asked), alias);
  names.Intern(u"\u00E9");
  EXPECT_EQ(names.FindAscii("\xE9"), 0u);
  EXPECT_EQ(names.FindAscii("\u00E9"), 0u);
}
