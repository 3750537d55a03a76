#include "default_platform/product_structure/model_reader/ObjFaces.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstdlib>

#include "default_platform/ReaderProgram.h"

namespace ZORDefault {
namespace {

constexpr std::size_t kMaxCorners = 1024;

// ---- statements: lines, with those that a backslash continues

struct Statement {
  std::string_view text;
  std::size_t line = 0;  // of its beginning, from 1
};

class Statements {
 public:
  explicit Statements(std::string_view inText) : rest_(inText) {}

  bool Next(Statement& outStatement) {
    if (rest_.empty()) return false;
    outStatement.line = line_;
    std::size_t end = 0;
    bool isContinued = true;
    while (isContinued && end < rest_.size()) {
      const std::size_t feed = std::min(rest_.find('\n', end), rest_.size());
      const std::string_view line = rest_.substr(end, feed - end);
      const std::size_t last = line.find_last_not_of(" \t\r");
      isContinued = last != std::string_view::npos && line[last] == '\\';
      end = std::min(feed + 1, rest_.size());
      ++line_;
    }
    outStatement.text = rest_.substr(0, end);
    rest_.remove_prefix(end);
    return true;
  }

 private:
  std::string_view rest_;
  std::size_t line_ = 1;
};

std::vector<std::string_view> WordsOf(std::string_view inText) {
  constexpr char kSpace[] = " \t\r\n\\";
  std::vector<std::string_view> words;
  for (std::size_t at = inText.find_first_not_of(kSpace); at != std::string_view::npos;) {
    const std::size_t end = std::min(inText.find_first_of(kSpace, at), inText.size());
    words.push_back(inText.substr(at, end - at));
    at = inText.find_first_not_of(kSpace, end);
  }
  return words;
}

bool IsOf(const Statement& inStatement, char inKind) {
  const std::size_t at = inStatement.text.find_first_not_of(" \t");
  return at != std::string_view::npos && inStatement.text[at] == inKind &&
         at + 1 < inStatement.text.size() &&
         (inStatement.text[at + 1] == ' ' || inStatement.text[at + 1] == '\t');
}

// A corner takes two characters at least.
bool IsLargeFace(const Statement& inStatement) {
  return inStatement.text.size() > 2 * kMaxCorners && IsOf(inStatement, 'f') &&
         WordsOf(inStatement.text).size() > kMaxCorners + 1;
}

Point PointOf(std::string_view inStatement) {
  const std::vector<std::string_view> words = WordsOf(inStatement);
  Point point{};
  for (std::size_t i = 0; i < 3 && i + 1 < words.size(); ++i)
    point[i] = std::strtod(std::string(words[i + 1]).c_str(), nullptr);
  return point;
}

/// Numbers count from 1, negative ones backwards from the last vertex so far.
const Point& CornerOf(std::string_view inWord, const std::vector<Point>& inPoints,
                      std::size_t inLine) {
  long number = 0;
  std::from_chars(inWord.data(), inWord.data() + inWord.size(), number);
  const long count = static_cast<long>(inPoints.size());
  const long position = number > 0 ? number - 1 : count + number;
  if (number == 0 || position < 0 || position >= count)
    throw Refusal{"line " + std::to_string(inLine) + ": a face refers to a missing vertex"};
  return inPoints[static_cast<std::size_t>(position)];
}

void AppendTriangles(const Statement& inFace, const std::vector<Point>& inPoints,
                     std::string& ioText) {
  std::vector<std::string_view> words = WordsOf(inFace.text);
  words.erase(words.begin());
  std::vector<Point> polygon;
  for (const std::string_view word : words)
    polygon.push_back(CornerOf(word, inPoints, inFace.line));
  for (const auto& triangle : TrianglesOf(polygon)) {
    ioText += 'f';
    for (const std::size_t corner : triangle) ioText.append(" ").append(words[corner]);
    ioText += '\n';
  }
}

// ---- triangulation

using Point2 = std::array<double, 2>;

double Cross(const Point2& inA, const Point2& inB, const Point2& inC) {
  return (inB[0] - inA[0]) * (inC[1] - inA[1]) - (inB[1] - inA[1]) * (inC[0] - inA[0]);
}

/// Newell's normal, as long as twice the area (Tampieri, "Newell's method for computing the plane
/// equation of a polygon", Graphics Gems III, 1992).
Point NormalOf(const std::vector<Point>& inPolygon) {
  Point normal{};
  for (std::size_t i = 0; i < inPolygon.size(); ++i) {
    const Point &a = inPolygon[i], &b = inPolygon[(i + 1) % inPolygon.size()];
    for (std::size_t k = 0; k < 3; ++k) {
      const std::size_t u = (k + 1) % 3, v = (k + 2) % 3;
      normal[k] += (a[u] - b[u]) * (a[v] + b[v]);
    }
  }
  return normal;
}

/// Leaves out the axis along which the polygon is seen largest; counterclockwise.
std::vector<Point2> Flattened(const std::vector<Point>& inPolygon) {
  const Point normal = NormalOf(inPolygon);
  const auto longest = std::ranges::max_element(
      normal, [](double inA, double inB) { return std::abs(inA) < std::abs(inB); });
  const auto axis = static_cast<std::size_t>(longest - normal.begin());
  std::size_t u = (axis + 1) % 3, v = (axis + 2) % 3;
  if (*longest < 0) std::swap(u, v);
  std::vector<Point2> flat;
  for (const Point& point : inPolygon) flat.push_back({point[u], point[v]});
  return flat;
}

/// Ear clipping (Meisters, "Polygons have ears", 1975): only corners that turn inwards can lie in
/// an ear.
class EarClipping {
 public:
  explicit EarClipping(const std::vector<Point>& inPolygon)
      : points_(Flattened(inPolygon)), next_(points_.size()), previous_(points_.size()) {
    const std::size_t count = points_.size();
    for (std::size_t i = 0; i < count; ++i) {
      next_[i] = (i + 1) % count;
      previous_[i] = (i + count - 1) % count;
    }
    for (std::size_t i = 0; i < count; ++i)
      if (TurnsInwards(i)) inward_.push_back(i);
  }

  std::vector<std::array<std::size_t, 3>> Run() {
    std::size_t at = 0, tried = 0;
    for (std::size_t left = points_.size(); left > 2;) {
      // A polygon that crosses itself may have no ear: something is cut off all the same.
      if (!IsEar(at) && tried++ < left) {
        at = next_[at];
        continue;
      }
      triangles_.push_back({previous_[at], at, next_[at]});
      next_[previous_[at]] = next_[at];
      previous_[next_[at]] = previous_[at];
      std::erase_if(inward_, [&](std::size_t i) { return i == at || IsFreed(i, at); });
      at = next_[next_[at]];
      tried = 0;
      --left;
    }
    return std::move(triangles_);
  }

 private:
  bool TurnsInwards(std::size_t inAt) const {
    return Cross(points_[previous_[inAt]], points_[inAt], points_[next_[inAt]]) <= 0;
  }
  /// Whether a neighbour of the one that was cut off turns inwards no longer.
  bool IsFreed(std::size_t inAt, std::size_t inCut) const {
    return (inAt == previous_[inCut] || inAt == next_[inCut]) && !TurnsInwards(inAt);
  }
  bool IsEar(std::size_t inAt) const {
    if (TurnsInwards(inAt)) return false;
    const Point2 &a = points_[previous_[inAt]], &b = points_[inAt], &c = points_[next_[inAt]];
    return std::ranges::none_of(inward_, [&](std::size_t i) {
      const Point2& point = points_[i];
      return point != a && point != b && point != c && Cross(a, b, point) >= 0 &&
             Cross(b, c, point) >= 0 && Cross(c, a, point) >= 0;
    });
  }

  std::vector<Point2> points_;
  std::vector<std::size_t> next_, previous_, inward_;
  std::vector<std::array<std::size_t, 3>> triangles_;
};

}  // namespace

std::vector<std::array<std::size_t, 3>> TrianglesOf(const std::vector<Point>& inPolygon) {
  return inPolygon.size() < 3 ? std::vector<std::array<std::size_t, 3>>()
                              : EarClipping(inPolygon).Run();
}

std::optional<std::string> ObjWithoutLargeFaces(std::string_view inText) {
  Statement statement;
  bool hasLarge = false;
  for (Statements all(inText); !hasLarge && all.Next(statement);) hasLarge = IsLargeFace(statement);
  if (!hasLarge) return std::nullopt;
  std::string text;
  std::vector<Point> points;
  for (Statements all(inText); all.Next(statement);) {
    if (IsOf(statement, 'v')) points.push_back(PointOf(statement.text));
    if (IsLargeFace(statement))
      AppendTriangles(statement, points, text);
    else
      text += statement.text;
  }
  return text;
}

}  // namespace ZORDefault
