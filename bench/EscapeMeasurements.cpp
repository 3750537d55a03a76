// Making texts safe for XML.
#include <functional>

#include "BuildPath.h"
#include "Measurement.h"
#include "ResultHash.h"
#include "ZORTree.h"

namespace {
// Letters and spaces, and one special character in a thousand.
std::u16string TextOf(std::size_t inCount) {
  constexpr std::u16string_view kSpecials = u"\"&<>";
  std::u16string text(inCount, u' ');
  for (std::size_t i = 0; i < inCount; ++i) {
    if (i % 1000 == 999)
      text[i] = kSpecials[i / 1000 % kSpecials.size()];
    else if (i % 7 != 0)
      text[i] = static_cast<char16_t>(u'a' + i % 26);
  }
  return text;
}

ZORUnicodeString StringOf(const std::u16string& inText) {
  ZORUnicodeString string;
  string.BuildFromUTF16(inText.data(), inText.size());
  return string;
}

std::u16string_view View(const ZORUnicodeString& inText) { return Units(inText); }
std::u16string_view View(const std::u16string& inText) { return inText; }

template <class AppendLiteral, class AppendUnit>
void AppendEscaped(std::u16string_view inText, const AppendLiteral& inAppendLiteral,
                   const AppendUnit& inAppendUnit) {
  for (char16_t unit : inText) {
    switch (unit) {
      case u'"':
        inAppendLiteral(u"&quot;");
        break;
      case u'&':
        inAppendLiteral(u"&amp;");
        break;
      case u'<':
        inAppendLiteral(u"&lt;");
        break;
      case u'>':
        inAppendLiteral(u"&gt;");
        break;
      default:
        inAppendUnit(unit);
    }
  }
}

constexpr std::size_t kShortText = 100'000;

// Times the conversion of one long text and, in the second step, of as many characters in texts of
// kShortText each: a long output is new memory, whose first touch costs more than the conversion.
template <class Text, class Make, class Convert>
Steps TimeConversions(std::size_t inCount, const Make& inMake, const Convert& inConvert) {
  Steps steps;
  ResultHash longHash, shortHash;
  {
    Text text = inMake(TextOf(inCount));
    Text escaped;
    TimeStep("one text", steps, [&] { inConvert(text, escaped); });
    longHash.Add(View(escaped));
  }
  Text text = inMake(TextOf(kShortText));
  std::size_t length = 0;
  TimeStep("many texts", steps, [&] {
    for (std::size_t done = 0; done < inCount; done += kShortText) {
      Text escaped;
      inConvert(text, escaped);
      length += View(escaped).size();
    }
  });
  Text escaped;
  inConvert(text, escaped);
  shortHash.Add(View(escaped));
  shortHash.Add(std::uint64_t{length});
  steps[0].hash = longHash.Value();
  steps[1].hash = shortHash.Value();
  return steps;
}

std::size_t CountOf(const Arguments& inArguments) { return std::stoul(inArguments.at(0)); }
}  // namespace

Steps EscapeWithZORLyra(const Arguments& inArguments) {
  return TimeConversions<ZORUnicodeString>(
      CountOf(inArguments), StringOf, [](ZORUnicodeString& inText, ZORUnicodeString& ioOutput) {
        BuildPath::CheckXMLString(inText, ioOutput);
      });
}

Steps EscapeByCharacter(const Arguments& inArguments) {
  return TimeConversions<ZORUnicodeString>(
      CountOf(inArguments), StringOf,
      [](const ZORUnicodeString& inText, ZORUnicodeString& ioOutput) {
        AppendEscaped(
            Units(inText),
            [&](std::u16string_view inLiteral) {
              ioOutput.AppendUTF16(inLiteral.data(), inLiteral.size());
            },
            [&](char16_t inUnit) {
              ZORUnicodeChar character;
              character.BuildFromUC2Bytes(inUnit);
              ioOutput += character;
            });
      });
}

Steps EscapeByPushBack(const Arguments& inArguments) {
  return TimeConversions<std::u16string>(
      CountOf(inArguments), std::identity(),
      [](const std::u16string& inText, std::u16string& ioOutput) {
        AppendEscaped(
            inText, [&](std::u16string_view inLiteral) { ioOutput += inLiteral; },
            [&](char16_t inUnit) { ioOutput.push_back(inUnit); });
      });
}
