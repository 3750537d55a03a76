// Making a long text safe for XML.
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

template <class Output, class AppendUnit>
void AppendEscaped(std::u16string_view inText, Output& ioOutput, const AppendUnit& inAppendUnit) {
  for (char16_t unit : inText) {
    switch (unit) {
      case u'"':
        ioOutput += u"&quot;";
        break;
      case u'&':
        ioOutput += u"&amp;";
        break;
      case u'<':
        ioOutput += u"&lt;";
        break;
      case u'>':
        ioOutput += u"&gt;";
        break;
      default:
        inAppendUnit(unit);
    }
  }
}

// The platform's string under the operators that AppendEscaped uses.
struct PlatformOutput {
  ZORUnicodeString text;
  void operator+=(std::u16string_view inLiteral) {
    text.AppendUTF16(inLiteral.data(), inLiteral.size());
  }
};

std::uint64_t HashOf(std::u16string_view inText) {
  ResultHash hash;
  hash.Add(inText);
  return hash.Value();
}
}  // namespace

Steps EscapeWithZORLyra(const Arguments& inArguments) {
  Steps steps;
  ZORUnicodeString text = StringOf(TextOf(std::stoul(inArguments.at(0))));
  ZORUnicodeString escaped;
  TimeStep("escape", steps, [&] { BuildPath::CheckXMLString(text, escaped); });
  steps[0].hash = HashOf(Units(escaped));
  return steps;
}

Steps EscapeByCharacter(const Arguments& inArguments) {
  Steps steps;
  const ZORUnicodeString text = StringOf(TextOf(std::stoul(inArguments.at(0))));
  PlatformOutput escaped;
  TimeStep("escape", steps, [&] {
    AppendEscaped(Units(text), escaped, [&](char16_t inUnit) {
      ZORUnicodeChar character;
      character.BuildFromUC2Bytes(inUnit);
      escaped.text += character;
    });
  });
  steps[0].hash = HashOf(Units(escaped.text));
  return steps;
}

Steps EscapeByPushBack(const Arguments& inArguments) {
  Steps steps;
  const std::u16string text = TextOf(std::stoul(inArguments.at(0)));
  std::u16string escaped;
  TimeStep("escape", steps, [&] {
    AppendEscaped(text, escaped, [&](char16_t inUnit) { escaped.push_back(inUnit); });
  });
  steps[0].hash = HashOf(escaped);
  return steps;
}
