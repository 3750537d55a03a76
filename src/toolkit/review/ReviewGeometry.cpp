// What a document says of the geometry of interferences: as it is written, and as numbers.
#include <algorithm>
#include <bit>
#include <utility>

#include "foundation/Bytes.h"
#include "foundation/Utf8.h"
#include "toolkit/review/ReviewSource.h"

namespace ZORToolkit {
namespace {

constexpr std::uint64_t kOtherFactor = 0xC2B2AE3D27D4EB4Fu;
constexpr std::uint64_t kElementMark = 0xE1E3 + (std::uint64_t{1} << 48);  // no attribute has it

constexpr double kPowersOfTen[] = {1e0, 1e1, 1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                   1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};

constexpr std::uint64_t EightTimes(std::uint64_t inByte) { return inByte * 0x0101010101010101u; }

/// One to eight bytes as the last ones of eight, of which the others are '0'; the first byte is the
/// lowest.
inline std::uint64_t LastOfEight(const char* inBytes, std::size_t inCount) {
  const auto at = [&](std::size_t inFrom) {
    std::uint32_t four = 0;
    std::memcpy(&four, inBytes + inFrom, 4);
    return std::uint64_t{four};
  };
  const auto byte = [&](std::size_t inFrom) {
    return std::uint64_t{static_cast<unsigned char>(inBytes[inFrom])};
  };
  const std::size_t shift = 8 * (8 - inCount);
  const std::uint64_t filler = EightTimes('0') & ~(~std::uint64_t{0} << shift);
  if (inCount >= 4) return filler | at(inCount - 4) << 32 | at(0) << shift;
  return filler | byte(inCount - 1) << 56 | byte(inCount / 2) << (shift + 8 * (inCount / 2)) |
         byte(0) << shift;
}

/// One to eight digits, one point or comma between them at most, eight bytes at once (D. Lemire,
/// "Number parsing at a gigabyte per second", 2021).
inline bool ReadShortNumber(const char* inBytes, std::size_t inCount, double& outNumber) {
  std::uint64_t bytes = LastOfEight(inBytes, inCount);
  constexpr std::uint64_t kLowBits = EightTimes(0x7F);
  const std::uint64_t different = (bytes & ~EightTimes('.' ^ ',')) ^ EightTimes('.' & ',');
  const std::uint64_t marks = ~(((different & kLowBits) + kLowBits) | different | kLowBits);
  std::size_t decimals = 0;
  if (marks != 0) {
    const auto point = static_cast<std::size_t>(std::countr_zero(marks)) / 8;
    if (point == 7 || point + inCount == 8) return false;  // the last, or the first
    const std::uint64_t before = (std::uint64_t{1} << (8 * point)) - 1;
    bytes = (bytes & (~before << 8)) | (bytes & before) << 8 | '0';
    decimals = 7 - point;
  }
  const std::uint64_t isDigit =
      (bytes & EightTimes(0xF0)) | (((bytes + EightTimes(0x06)) & EightTimes(0xF0)) >> 4);
  if (isDigit != EightTimes(0x33)) return false;
  bytes = (bytes & EightTimes(0x0F)) * 2561 >> 8;
  bytes = (bytes & 0x00FF00FF00FF00FFu) * 6553601 >> 16;
  bytes = (bytes & 0x0000FFFF0000FFFFu) * 42949672960001u >> 32;
  outNumber = static_cast<double>(bytes) / kPowersOfTen[decimals];
  return true;
}

/// By the short way where the text is a plain decimal number: digits that fit a double exactly,
/// divided by a power of ten that does, are rounded once and so rightly (W. D. Clinger, "How to read
/// floating point numbers accurately", 1990).
bool ReadPlainNumber(std::string_view inText, double& outNumber) {
  const char* at = inText.data();
  const char* const end = at + inText.size();
  const bool isNegative = at != end && *at == '-';
  if (isNegative) ++at;
  const auto count = static_cast<std::size_t>(end - at);
  double value = 0;
  if (count - 1 < 8) {
    if (!ReadShortNumber(at, count, value)) return false;
    outNumber = isNegative ? -value : value;
    return true;
  }
  if (count == 0 || count > 16) return false;  // with the point at most fifteen digits
  std::uint64_t digits = 0;
  const char* point = nullptr;
  const char* const first = at;
  for (; at != end; ++at) {
    const unsigned int digit = static_cast<unsigned int>(*at) - '0';
    if (digit <= 9) {
      digits = digits * 10 + digit;
    } else if ((*at == '.' || *at == ',') && point == nullptr && at != first) {
      point = at;
    } else {
      return false;
    }
  }
  if ((point == nullptr && count > 15) || (point != nullptr && point + 1 == end)) return false;
  value = static_cast<double>(digits);
  if (point != nullptr) value /= kPowersOfTen[end - point - 1];
  outNumber = isNegative ? -value : value;
  return true;
}

/// One that is not written plainly.
[[gnu::noinline]] bool ReadOtherNumber(const DOM_Text& inText, double& outNumber) {
  const TextView view = inText.View();
  std::u16string widened;
  if (!view.IsWide())
    for (const char byte : view.Latin1()) widened += static_cast<unsigned char>(byte);
  const std::u16string_view units = view.IsWide() ? view.Units() : widened;
  std::string encoded(ZORFoundation::Utf8Length(units), '\0');
  ZORFoundation::EncodeUtf8(units, encoded.data());
  const std::optional<double> number = Number(std::move(encoded)).value;
  outNumber = number.value_or(0);
  return number.has_value();
}

inline bool ReadNumber(const DOM_Text& inText, double& outNumber) {
  if (inText.head == 1) {  // one narrow character: most numbers of a rotation
    const int digit = *inText.Latin1() - '0';
    if (digit >= 0 && digit <= 9) {
      outNumber = digit;
      return true;
    }
  }
  return (!inText.IsWide() && ReadPlainNumber({inText.Latin1(), inText.head}, outNumber)) ||
         ReadOtherNumber(inText, outNumber);
}

constexpr std::size_t kNoColumn = 3;

/// Which column of a rotation "Rx", "Ry" or "Rz" is; kNoColumn for any other text.
std::size_t ColumnNamed(StoredText inText) {
  if (inText->head != 2 || inText->Latin1()[0] != 'R') return kNoColumn;
  const std::size_t column = static_cast<std::size_t>(inText->Latin1()[1] - 'x');
  return std::min(column, kNoColumn);
}

}  // namespace

/// Of each what it is and its value, of which the last eight bytes come last.
void ReviewSource::AddAttributes(Element inElement, std::uint64_t& ioHash) const {
  std::uint64_t hash = ioHash;
  ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
    const char* const bytes = inText->Latin1();
    const std::size_t count = inText->View().Bytes();
    const auto eight = [&](std::size_t inAt) {
      std::uint64_t part = 0;
      std::memcpy(&part, bytes + inAt, sizeof part);
      return part;
    };
    for (std::size_t at = 0; at + 8 < count; at += 8) hash = Mix(hash, eight(at));
    const std::uint64_t last =
        count <= 8 ? ZORFoundation::ShortBytes(bytes, count) : eight(count - 8);
    const std::uint64_t what = static_cast<std::uint64_t>(inNamed) << 32 | inText->head;
    hash = Mix(hash, last * kOtherFactor + what);
  });
  ioHash = hash;
}

/// Of each "Matrix" the child elements, what they are and their attributes.
std::uint64_t ReviewSource::WrittenPlacement(Element inProduct) const {
  if (inProduct == 0) return 0;
  std::uint64_t hash = 1;
  ForEachChild(inProduct, [&](Element inMatrix, Named inNamed) {
    if (inNamed != Named::kMatrix) return;
    hash = Mix(hash, kElementMark);
    ForEachChild(inMatrix, [&](Element inPart, Named inPartNamed) {
      hash = Mix(hash, kElementMark + static_cast<std::uint64_t>(inPartNamed));
      AddAttributes(inPart, hash);
    });
  });
  return hash;
}

std::uint64_t ReviewSource::WrittenPoints(const ReviewRecord& inRecord) const {
  if (inRecord.hasMoreGeometry) return WrittenGeometry::kNeverAlike;  // compared by numbers
  if (inRecord.geometry == 0) return WrittenGeometry::kNoGeometry;
  std::uint64_t hash = WrittenGeometry::kNoPoints;
  ForEachChild(inRecord.geometry, [&](Element inPoint, Named inNamed) {
    if (inNamed != Named::kPoint) return;
    hash = Mix(hash, kElementMark);
    AddAttributes(inPoint, hash);
  });
  return hash;
}

WrittenGeometry ReviewSource::GeometryOf(const ReviewRecord& inRecord) const {
  return {{WrittenPlacement(inRecord.productElements[0]),
           WrittenPlacement(inRecord.productElements[1])},
          WrittenPoints(inRecord)};
}

template <class Other>
bool ReviewSource::ReadTriple(Element inElement, Named inFirst, double* outTriple,
                              const Other& inOther) const {
  int count = 0;
  ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
    const int place = static_cast<int>(inNamed) - static_cast<int>(inFirst);
    if (place < 0 || place > 2) return inOther(inNamed, inText);
    count += ReadNumber(*inText, outTriple[place]);
  });
  return count == 3;
}

bool ReviewSource::ReadTriple(Element inElement, Named inFirst, double* outTriple) const {
  return ReadTriple(inElement, inFirst, outTriple, [](Named, StoredText) {});
}

std::optional<Placement> ReviewSource::PlacementIn(Element inMatrix) const {
  Placement placement{};
  unsigned int found = 0;  // a bit for each column and the translation
  bool isWhole = true;
  ForEachChild(inMatrix, [&](Element inChild, Named inNamed) {
    if (inNamed == Named::kPoint) {
      isWhole = ReadTriple(inChild, Named::kUx, &placement[9]) && isWhole;
      found |= 8;
    } else if (inNamed == Named::kVector) {
      std::size_t column = kNoColumn;
      double triple[3];
      const bool hasAll =
          ReadTriple(inChild, Named::kVx, triple, [&](Named inName, StoredText inText) {
            if (inName == Named::kCorrespondingData) column = ColumnNamed(inText);
          });
      if (column == kNoColumn) return;
      isWhole = hasAll && isWhole;
      if (hasAll) std::copy_n(triple, 3, &placement[3 * column]);
      found |= 1u << column;
    }
  });
  if (!isWhole || found != 15) return std::nullopt;
  return placement;
}

std::optional<Placement> ReviewSource::PlacementOf(Element inProduct) const {
  std::optional<Placement> placement;
  ForEachChild(inProduct, [&](Element inMatrix, Named inNamed) {
    if (inNamed == Named::kMatrix) placement = PlacementIn(inMatrix);
  });
  return placement;
}

/// The mean of the points that have all their numbers.
std::optional<Position> ReviewSource::PlaceOf(const ReviewRecord& inRecord) const {
  Position sum{};
  int count = 0;
  ForEachGeometry(inRecord, [&](Element inGeometry) {
    ForEachChild(inGeometry, [&](Element inPoint, Named inNamed) {
      Position point{};
      if (inNamed != Named::kPoint || !ReadTriple(inPoint, Named::kUx, point.data())) return;
      for (std::size_t i = 0; i < 3; ++i) sum[i] += point[i];
      ++count;
    });
  });
  if (count == 0) return std::nullopt;
  for (double& coordinate : sum) coordinate /= count;
  return sum;
}

std::optional<double> WrittenNumber::Value() const {
  double number = 0;
  if (ReadPlainNumber(text, number)) return number;
  return Number(std::string(text)).value;
}

std::optional<Placement> ReviewedResult::PlacementOf(ElementNumber inProduct) const {
  if (inProduct == 0) return std::nullopt;
  return source->PlacementOf(inProduct);
}

std::optional<Position> ReviewedResult::PlaceOf(const ReviewRecord& inRecord) const {
  return source->PlaceOf(inRecord);
}

std::uint64_t ReviewedResult::WrittenPlacement(ElementNumber inProduct) const {
  return source->WrittenPlacement(inProduct);
}

std::uint64_t ReviewedResult::WrittenPlacementOf(int inProduct) const {
  const ReviewProduct& product = products[static_cast<std::size_t>(inProduct)];
  return geometries.empty() ? WrittenPlacement(product.element) : product.placement;
}

WrittenGeometry ReviewedResult::GeometryOf(const ReviewRecord& inRecord) const {
  if (geometries.empty()) return source->GeometryOf(inRecord);
  return geometries[static_cast<std::size_t>(inRecord.index) - 1];
}

bool ReviewedResult::HasPlacement(ElementNumber inProduct) const {
  return inProduct != 0 && source->HasPlacement(inProduct);
}

}  // namespace ZORToolkit
