#include "toolkit/review/ReviewSource.h"

#include <algorithm>

#include "foundation/Utf8.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

struct KnownName {
  std::string_view text;
  Named named;
};
constexpr KnownName kNames[] = {
    {"Alias", Named::kAlias},
    {"ClashResult", Named::kClashResult},
    {"ClashSpec", Named::kClashSpec},
    {"Clearance", Named::kClearance},
    {"Comment", Named::kComment},
    {"ComputationCase", Named::kComputationCase},
    {"CorrespondingData", Named::kCorrespondingData},
    {"DescriptionID", Named::kDescriptionId},
    {"DisplayableID", Named::kDisplayableId},
    {"DistanceClearance", Named::kDistanceClearance},
    {"GeometricAspect", Named::kGeometricAspect},
    {"Interference", Named::kInterference},
    {"Matrix", Named::kMatrix},
    {"Name", Named::kName},
    {"Point", Named::kPoint},
    {"ProdListe1", Named::kProdListe1},
    {"ProdListe2", Named::kProdListe2},
    {"Product", Named::kProduct},
    {"ProductsInSpec", Named::kProductsInSpec},
    {"ResultType", Named::kResultType},
    {"ResultTypeNoNLS", Named::kResultTypeNoNls},
    {"RetrieveInf", Named::kRetrieveInf},
    {"ShapeName", Named::kShapeName},
    {"Specification", Named::kSpecification},
    {"Status", Named::kStatus},
    {"Type", Named::kType},
    {"TypeCalc", Named::kTypeCalc},
    {"Ux", Named::kUx},
    {"Uy", Named::kUy},
    {"Uz", Named::kUz},
    {"Value", Named::kValue},
    {"Vector", Named::kVector},
    {"ViolatedRule", Named::kViolatedRule},
    {"Vx", Named::kVx},
    {"Vy", Named::kVy},
    {"Vz", Named::kVz},
};

Named NamedAs(std::u16string_view inName) {
  const auto known = std::ranges::find_if(
      kNames, [&](const KnownName& inKnown) { return IsSameText(inName, inKnown.text); });
  return known == std::end(kNames) ? Named::kOther : known->named;
}

constexpr std::size_t kFirstSlots = 256;
constexpr std::uint64_t kFactor = 0x9E3779B97F4A7C15u;

std::uint64_t Mix(std::uint64_t inHash, std::uint64_t inPart) {
  inHash = (inHash ^ inPart) * kFactor;
  return inHash ^ (inHash >> 31);
}

std::string EncodedLatin1(std::string_view inText) {
  std::string encoded;
  encoded.reserve(inText.size() + inText.size() / 4 + 4);
  for (const char byte : inText) {
    const auto code = static_cast<unsigned char>(byte);
    if (code >= 0x80) encoded += static_cast<char>(0xC0 | (code >> 6));
    encoded += static_cast<char>(code < 0x80 ? code : 0x80 | (code & 0x3F));
  }
  return encoded;
}

std::string EncodedUnits(std::u16string_view inUnits) {
  std::string encoded(ZORFoundation::Utf8Length(inUnits), '\0');
  ZORFoundation::EncodeUtf8(inUnits, encoded.data());
  return encoded;
}

/// By the short way where the text is a plain decimal number: digits that fit a double exactly,
/// divided by a power of ten that does, are rounded once and so rightly (W. D. Clinger, "How to read
/// floating point numbers accurately", 1990).
std::optional<double> PlainNumber(std::string_view inText) {
  constexpr double kPowers[] = {1e0, 1e1, 1e2,  1e3,  1e4,  1e5,  1e6,  1e7,
                                1e8, 1e9, 1e10, 1e11, 1e12, 1e13, 1e14, 1e15};
  const char* at = inText.data();
  const char* const end = at + inText.size();
  const bool isNegative = at != end && *at == '-';
  if (isNegative) ++at;
  if (end - at > 16) return std::nullopt;  // with the point at most fifteen digits
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
      return std::nullopt;
    }
  }
  if (at == first || (point == nullptr && end - first > 15) ||
      (point != nullptr && point + 1 == end))
    return std::nullopt;
  const double whole = static_cast<double>(digits);
  const double value = point == nullptr ? whole : whole / kPowers[end - point - 1];
  return isNegative ? -value : value;
}

std::optional<double> NumberIn(StoredText inText) {
  if (inText == nullptr) return std::nullopt;
  if (inText->head == 1) {  // one narrow character: most numbers of a rotation
    const int digit = *inText->Latin1() - '0';
    if (digit >= 0 && digit <= 9) return digit;
  }
  const TextView view = inText->View();
  if (view.IsWide()) return Number(EncodedUnits(view.Units())).value;
  const std::optional<double> plain = PlainNumber(view.Latin1());
  return plain ? plain : Number(EncodedLatin1(view.Latin1())).value;
}

constexpr std::size_t kNoColumn = 3;

/// Which column of a rotation "Rx", "Ry" or "Rz" is; kNoColumn for any other text.
std::size_t ColumnNamed(StoredText inText) {
  const TextView text = inText->View();
  if (text.IsWide() || text.Length() != 2 || text.Latin1()[0] != 'R') return kNoColumn;
  const std::size_t column = std::string_view("xyz").find(text.Latin1()[1]);
  return column == std::string_view::npos ? kNoColumn : column;
}

}  // namespace

ReviewSource::ReviewSource(const DOM_Node& inRoot)
    : tree_(inRoot), meanings_(tree_.NameEnd()), slots_(kFirstSlots) {
  for (ZORDefault::TreeReader::Name name = 1; name < tree_.NameEnd(); ++name)
    meanings_[name] = NamedAs(tree_.NameText(name));
}

StoredText ReviewSource::Attribute(Element inElement, Named inName) const {
  StoredText found = nullptr;
  ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
    if (inNamed == inName) found = inText;
  });
  return found;
}

std::string_view ReviewSource::Keep(std::string_view inText) {
  constexpr std::size_t kBlock = std::size_t{64} * 1024;
  if (inText.size() > room_) {
    room_ = std::max(kBlock, inText.size());
    blocks_.emplace_back(new char[room_]);
    free_ = blocks_.back().get();
  }
  char* const kept = std::ranges::copy(inText, free_).out - inText.size();
  free_ += inText.size();
  room_ -= inText.size();
  return {kept, inText.size()};
}

std::string_view ReviewSource::Text(StoredText inText) {
  if (inText == nullptr) return {};
  const TextView view = inText->View();
  if (view.IsWide()) return Keep(EncodedUnits(view.Units()));
  const std::string_view bytes = view.Latin1();
  unsigned char all = 0;
  for (const char byte : bytes) all |= static_cast<unsigned char>(byte);
  return all < 0x80 ? bytes : Keep(EncodedLatin1(bytes));
}

// ---- products

bool ReviewSource::IsSame(const ProductKey& inA, const ProductKey& inB) {
  return inA.hash == inB.hash && std::ranges::equal(inA.texts, inB.texts, ZORToolkit::IsSame);
}

ReviewSource::ProductKey ReviewSource::KeyOf(StoredText inId, StoredText inAlias,
                                             StoredText inPart) {
  if (inId != nullptr && inId->Length() != 0) return {HashOf(inId), {inId, nullptr, nullptr}};
  static constexpr DOM_Text kEmpty{0};
  const auto text = [](StoredText inText) { return inText == nullptr ? &kEmpty : inText; };
  const StoredText alias = text(inAlias), part = text(inPart);
  return {Mix(HashOf(alias), HashOf(part)), {nullptr, alias, part}};
}

std::size_t ReviewSource::SlotOf(const ProductKey& inKey) const {
  const std::size_t mask = slots_.size() - 1;
  const auto tag = static_cast<std::uint32_t>(inKey.hash >> 32);
  std::size_t slot = inKey.hash & mask;
  while (slots_[slot].product != 0 &&
         (slots_[slot].tag != tag || !IsSame(products_[slots_[slot].product - 1], inKey)))
    slot = (slot + 1) & mask;
  return slot;
}

int ReviewSource::Find(const ProductKey& inKey, int inGuess) const {
  if (inGuess >= 0 && inGuess < ProductCount() && IsSame(Key(inGuess), inKey)) return inGuess;
  return static_cast<int>(slots_[SlotOf(inKey)].product) - 1;
}

void ReviewSource::Add(const ProductKey& inKey) {
  products_.push_back(inKey);
  const auto count = static_cast<std::uint32_t>(products_.size());
  if (products_.size() * 2 <= slots_.size()) {
    slots_[SlotOf(inKey)] = {static_cast<std::uint32_t>(inKey.hash >> 32), count};
    return;
  }
  slots_.assign(slots_.size() * 4, {});
  const std::size_t mask = slots_.size() - 1;
  for (std::uint32_t i = 0; i < count; ++i) {
    std::size_t slot = products_[i].hash & mask;
    while (slots_[slot].product != 0) slot = (slot + 1) & mask;
    slots_[slot] = {static_cast<std::uint32_t>(products_[i].hash >> 32), i + 1};
  }
}

// ---- geometry

ReviewSource::Element ReviewSource::NextNamed(Element inElement, Named inName) const {
  while (inElement != 0 && Meaning(tree_.NameOf(inElement)) != inName)
    inElement = tree_.NextElement(inElement);
  return inElement;
}

bool ReviewSource::HasAttributesOf(Element inElement, const ReviewSource& inOther,
                                   Element inOtherElement) const {
  const auto* at = tree_.FirstAttribute(inElement);
  const auto* other = inOther.tree_.FirstAttribute(inOtherElement);
  for (; at != nullptr && other != nullptr;
       at = tree_.Next(*at), other = inOther.tree_.Next(*other))
    if (Meaning(at->name) != inOther.Meaning(other->name) ||
        !ZORToolkit::IsSame(&tree_.TextOf(*at), &inOther.tree_.TextOf(*other)))
      return false;
  return at == other;
}

/// By the child elements, what they are and their attributes.
bool ReviewSource::HasPartsOf(Element inElement, const ReviewSource& inOther,
                              Element inOtherElement) const {
  Element part = tree_.FirstElement(inElement);
  Element other = inOther.tree_.FirstElement(inOtherElement);
  for (; part != 0 && other != 0;
       part = tree_.NextElement(part), other = inOther.tree_.NextElement(other))
    if (Meaning(tree_.NameOf(part)) != inOther.Meaning(inOther.tree_.NameOf(other)) ||
        !HasAttributesOf(part, inOther, other))
      return false;
  return part == other;
}

bool ReviewSource::HasPlacementOf(Element inProduct, const ReviewSource& inOther,
                                  Element inOtherProduct) const {
  Element matrix = FirstNamed(inProduct, Named::kMatrix);
  Element other = inOther.FirstNamed(inOtherProduct, Named::kMatrix);
  for (; matrix != 0 && other != 0;
       matrix = Following(matrix, Named::kMatrix), other = inOther.Following(other, Named::kMatrix))
    if (!HasPartsOf(matrix, inOther, other)) return false;
  return matrix == other;
}

bool ReviewSource::HasPoints(const ReviewRecord& inRecord) const {
  bool hasPoints = false;
  ForEachGeometry(inRecord, [&](Element inGeometry) {
    hasPoints = hasPoints || FirstNamed(inGeometry, Named::kPoint) != 0;
  });
  return hasPoints;
}

bool ReviewSource::HasPointsOf(const ReviewRecord& inRecord, const ReviewSource& inOther,
                               const ReviewRecord& inOtherRecord) const {
  if (inRecord.hasMoreGeometry || inOtherRecord.hasMoreGeometry)
    return false;  // compared by numbers
  if (inRecord.geometry == 0 || inOtherRecord.geometry == 0)
    return inRecord.geometry == inOtherRecord.geometry;
  Element point = FirstNamed(inRecord.geometry, Named::kPoint);
  Element other = inOther.FirstNamed(inOtherRecord.geometry, Named::kPoint);
  for (; point != 0 && other != 0;
       point = Following(point, Named::kPoint), other = inOther.Following(other, Named::kPoint))
    if (!HasAttributesOf(point, inOther, other)) return false;
  return point == other;
}

template <class Other>
bool ReviewSource::ReadTriple(Element inElement, Named inFirst, double* outTriple,
                              const Other& inOther) const {
  int count = 0;
  ForEachAttribute(inElement, [&](Named inNamed, StoredText inText) {
    const int place = static_cast<int>(inNamed) - static_cast<int>(inFirst);
    if (place < 0 || place > 2) return inOther(inNamed, inText);
    const std::optional<double> number = NumberIn(inText);
    if (!number) return;
    outTriple[place] = *number;
    ++count;
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

// ---- records

std::optional<double> WrittenNumber::Value() const {
  const std::optional<double> plain = PlainNumber(text);
  return plain ? plain : Number(std::string(text)).value;
}

std::string ReviewProduct::Key() const {
  if (!id.empty()) return std::string(id);
  return std::string(1, '\0').append(alias).append(1, '\0').append(part);
}

ElementHandle ReviewedResult::ElementOf(const ReviewRecord& inRecord) const {
  return ElementHandle(source->Tree().Handle(inRecord.element));
}

std::optional<Placement> ReviewedResult::PlacementOf(ElementNumber inProduct) const {
  if (inProduct == 0) return std::nullopt;
  return source->PlacementOf(inProduct);
}

std::optional<Position> ReviewedResult::PlaceOf(const ReviewRecord& inRecord) const {
  return source->PlaceOf(inRecord);
}

bool ReviewedResult::HasPlacementOf(ElementNumber inProduct, const ReviewedResult& inOther,
                                    ElementNumber inOtherProduct) const {
  if (inProduct == 0 || inOtherProduct == 0) return inProduct == inOtherProduct;
  return source->HasPlacementOf(inProduct, *inOther.source, inOtherProduct);
}

bool ReviewedResult::HasPlacement(ElementNumber inProduct) const {
  return inProduct != 0 && source->HasPlacement(inProduct);
}

bool ReviewedResult::HasPoints(const ReviewRecord& inRecord) const {
  return source->HasPoints(inRecord);
}

bool ReviewedResult::HasPointsOf(const ReviewRecord& inRecord, const ReviewedResult& inOther,
                                 const ReviewRecord& inOtherRecord) const {
  return source->HasPointsOf(inRecord, *inOther.source, inOtherRecord);
}

int ReviewedResult::FindProduct(const ReviewedResult& inOther, int inProduct, int inGuess) const {
  return source->Find(inOther.source->Key(inProduct), inGuess);
}

}  // namespace ZORToolkit
