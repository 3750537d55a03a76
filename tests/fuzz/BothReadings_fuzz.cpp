// What the fast path reads, the full scanner reads as the same tree. It gets the text as UTF-16, which
// the fast path leaves to it.
#include "default_platform/xml/FastPathReader.h"
#include "foundation/Utf8.h"
#include "fuzz/Fuzz.h"
#include "support/TreeEquality.h"

namespace {

std::string AsUtf16(std::string_view inText) {
  std::u16string units(inText.size() + 1, u'\xFEFF');
  const std::size_t count = ZORFoundation::DecodeUtf8(inText, units.data() + 1);
  return {reinterpret_cast<const char*>(units.data()), (count + 1) * sizeof(char16_t)};
}

std::string_view WithoutMark(std::string_view inText) {
  return inText.substr(inText.starts_with("\xEF\xBB\xBF") ? 3 : 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  const std::string text = fuzz::Text(inBytes, inSize);
  const std::size_t piece = inSize == 0 ? 1 : 1 + inBytes[inSize - 1];
  const bool isRead = IsReadByFastPath(text);
  fuzz::Require(isRead == IsReadByFastPath(text, piece), "the borders of reads matter");
  const std::string refusal = support::ParseErrorOf(text);
  fuzz::Require(!isRead || refusal.empty(), "read by the fast path and refused: " + refusal);
  const bool saysEncoding = text.substr(0, text.find("?>")).find("encoding") != std::string::npos;
  if (!isRead || saysEncoding || text.empty()) return 0;
  const std::string wide = AsUtf16(WithoutMark(text));
  const std::string wideRefusal = support::ParseErrorOf(wide);
  fuzz::Require(wideRefusal.empty(), "read by the fast path only: " + wideRefusal);
  const std::string difference =
      support::TreeDifference(support::ParseText(text), support::ParseText(wide));
  fuzz::Require(difference.empty(), difference);
  return 0;
}
