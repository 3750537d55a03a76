#include "lyra/terminal/SafeText.h"

#include <algorithm>
#include <cstdio>
#include <vector>

#include "foundation/CharacterTables.h"
#include "foundation/Utf8.h"

namespace lyra {
namespace {

using ZORFoundation::IsAscii;

/// Where the printable ASCII that begins somewhere ends.
std::size_t PlainEnd(std::string_view inText, std::size_t inBegin) {
  while (inBegin < inText.size() && inText[inBegin] >= ' ' && inText[inBegin] < 0x7F) ++inBegin;
  return inBegin;
}

bool IsPlain(std::string_view inText) { return PlainEnd(inText, 0) == inText.size(); }

std::vector<char32_t> CodePoints(std::string_view inText) {
  std::vector<char32_t> points;
  points.reserve(inText.size());
  for (std::size_t position = 0; position < inText.size();)
    points.push_back(ZORFoundation::NextCharacter(inText, position));
  return points;
}

void AppendCodePoint(char32_t inPoint, std::string& ioText) {
  char bytes[4];
  ioText.append(bytes, ZORFoundation::EncodeCharacter(inPoint, bytes));
}

bool IsControl(char32_t inPoint) { return inPoint < 0x20 || (inPoint >= 0x7F && inPoint < 0xA0); }

// Marks, embeddings, overrides and isolates of the direction of writing; line and paragraph
// separators; tags, which are invisible.
bool IsDeceptive(char32_t inPoint) {
  return inPoint == 0x061C || (inPoint >= 0x200E && inPoint <= 0x200F) ||
         (inPoint >= 0x2028 && inPoint <= 0x202E) || (inPoint >= 0x2066 && inPoint <= 0x2069) ||
         (inPoint >= 0xE0000 && inPoint <= 0xE007F);
}

std::string Hex(const char* inFormat, char32_t inPoint) {
  char digits[16];
  std::snprintf(digits, sizeof digits, inFormat, static_cast<unsigned int>(inPoint));
  return digits;
}

int ColumnsOf(char32_t inPoint) {
  const int columns = ZORFoundation::ColumnsOfCharacter(inPoint);
  return columns < 0 ? 1 : columns;  // not in the tables: most characters take one column
}

int ColumnsOf(const std::vector<char32_t>& inPoints) {
  int width = 0;
  for (char32_t point : inPoints) width += ColumnsOf(point);
  return width;
}

}  // namespace

std::string Printable(std::string_view inText) {
  if (IsPlain(inText)) return std::string(inText);
  std::string shown;
  for (char32_t point : CodePoints(inText)) {
    if (IsControl(point) || IsDeceptive(point))
      shown += Hex("\\u{%X}", point);
    else
      AppendCodePoint(point, shown);
  }
  return shown;
}

std::string EscapedForJson(std::string inJson) {
  if (IsAscii(inJson) && inJson.find('\x7F') == std::string::npos) return inJson;
  std::string escaped;
  escaped.reserve(inJson.size() + inJson.size() / 8);
  for (std::size_t at = 0; at < inJson.size();) {
    // What most of a line is goes over as a whole.
    const std::size_t end = PlainEnd(inJson, at);
    escaped.append(inJson, at, end - at);
    if ((at = end) == inJson.size()) break;
    const char32_t point = ZORFoundation::NextCharacter(inJson, at);
    if (!IsControl(point) && !IsDeceptive(point))
      AppendCodePoint(point, escaped);
    else if (point < 0x10000)
      escaped += Hex("\\u%04x", point);
    else
      escaped += Hex("\\u%04x", 0xD7C0 + (point >> 10)) + Hex("\\u%04x", 0xDC00 + (point & 0x3FF));
  }
  return escaped;
}

int DisplayWidth(std::string_view inText) {
  return IsAscii(inText) ? static_cast<int>(inText.size()) : ColumnsOf(CodePoints(inText));
}

std::string Fitted(std::string_view inText, int inWidth, Cut inCut) {
  if (DisplayWidth(inText) <= inWidth) return std::string(inText);
  std::vector<char32_t> points = CodePoints(inText);
  if (inCut == Cut::kStart) std::reverse(points.begin(), points.end());
  int width = 1;  // of the sign that something is missing
  std::size_t kept = 0;
  while (kept < points.size() && width + ColumnsOf(points[kept]) <= inWidth)
    width += ColumnsOf(points[kept++]);
  points.resize(kept);
  points.push_back(U'…');
  if (inCut == Cut::kStart) std::reverse(points.begin(), points.end());
  std::string fitted;
  for (char32_t point : points) AppendCodePoint(point, fitted);
  return fitted;
}

}  // namespace lyra
