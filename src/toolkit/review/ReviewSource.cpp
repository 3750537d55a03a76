#include "toolkit/review/ReviewSource.h"

#include <algorithm>
#include <bit>
#include <new>

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

constexpr std::size_t kLeastSlots = 256;

/// @param outBytes room for two bytes a character.
/// @return the end of what was written.
char* EncodeLatin1(std::string_view inText, char* outBytes) {
  for (const char byte : inText) {
    const auto code = static_cast<unsigned char>(byte);
    if (code >= 0x80) *outBytes++ = static_cast<char>(0xC0 | (code >> 6));
    *outBytes++ = static_cast<char>(code < 0x80 ? code : 0x80 | (code & 0x3F));
  }
  return outBytes;
}

}  // namespace

ReviewSource::ReviewSource(const DOM_Node& inRoot, std::size_t inUsualProducts)
    : tree_(inRoot), meanings_(tree_.NameEnd()) {
  products_.reserve(inUsualProducts);
  MakeSlots(std::bit_ceil(std::max(kLeastSlots, 2 * inUsualProducts)));
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

char* ReviewSource::RoomFor(std::size_t inBytes) {
  constexpr std::size_t kBlock = std::size_t{64} * 1024;
  if (inBytes > room_) {
    room_ = std::max(kBlock, inBytes);
    blocks_.emplace_back(new char[room_]);
    free_ = blocks_.back().get();
  }
  return free_;
}

std::string_view ReviewSource::Kept(std::size_t inBytes) {
  const char* const kept = free_;
  free_ += inBytes;
  room_ -= inBytes;
  return {kept, inBytes};
}

std::string_view ReviewSource::Keep(std::string_view inText) {
  std::ranges::copy(inText, RoomFor(inText.size()));
  return Kept(inText.size());
}

std::string_view ReviewSource::OtherText(StoredText inText) {
  // Texts that repeat are one in the tree.
  const auto place = reinterpret_cast<std::uintptr_t>(inText) / alignof(DOM_Text);
  RecentText& recent = recentTexts_[(place ^ (place >> 6)) % recentTexts_.size()];
  if (recent.stored != inText) recent = {inText, Encoded(*inText)};
  return recent.text;
}

std::string_view ReviewSource::Encoded(const DOM_Text& inText) {
  const TextView view = inText.View();
  if (!view.IsWide()) {
    char* const begin = RoomFor(2 * view.Length());
    return Kept(static_cast<std::size_t>(EncodeLatin1(view.Latin1(), begin) - begin));
  }
  const std::size_t count = ZORFoundation::Utf8Length(view.Units());
  ZORFoundation::EncodeUtf8(view.Units(), RoomFor(count));
  return Kept(count);
}

// ---- products

ReviewSource::ProductKey ReviewSource::KeyOf(StoredText inId, StoredText inAlias,
                                             StoredText inPart) {
  if (inId != nullptr && inId->Length() != 0) return {HashOf(inId), {inId, nullptr}};
  static constexpr DOM_Text kEmpty{0};
  const auto text = [](StoredText inText) { return inText == nullptr ? &kEmpty : inText; };
  const StoredText alias = text(inAlias), part = text(inPart);
  return {Mix(HashOf(alias), HashOf(part)), {alias, part}};
}

void ReviewSource::MakeSlots(std::size_t inCount) {
  // Zeroed by the system, which gives no memory where nothing is written.
  slots_.reset(static_cast<Slot*>(std::calloc(inCount, sizeof(Slot))));
  if (slots_ == nullptr) throw std::bad_alloc();
  slotCount_ = inCount;
}

std::size_t ReviewSource::SlotOf(const ProductKey& inKey) const {
  const std::size_t mask = slotCount_ - 1;
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

int ReviewSource::FindOrAdd(const ProductKey& inKey) {
  Slot& found = slots_[SlotOf(inKey)];
  if (found.product != 0) return static_cast<int>(found.product) - 1;
  products_.push_back(inKey);
  found = {static_cast<std::uint32_t>(inKey.hash >> 32),
           static_cast<std::uint32_t>(products_.size())};
  if (products_.size() * 2 > slotCount_) GrowSlots();
  return ProductCount() - 1;
}

void ReviewSource::GrowSlots() {
  MakeSlots(slotCount_ * 4);
  const std::size_t mask = slotCount_ - 1;
  for (std::uint32_t i = 0; i < products_.size(); ++i) {
    std::size_t slot = products_[i].hash & mask;
    while (slots_[slot].product != 0) slot = (slot + 1) & mask;
    slots_[slot] = {static_cast<std::uint32_t>(products_[i].hash >> 32), i + 1};
  }
}

ReviewSource::Element ReviewSource::NextNamed(Element inElement, Named inName) const {
  while (inElement != 0 && Meaning(tree_.NameOf(inElement)) != inName)
    inElement = tree_.NextElement(inElement);
  return inElement;
}

std::string ReviewProduct::Key() const {
  if (!id.empty()) return std::string(id);
  return std::string(1, '\0').append(alias).append(1, '\0').append(part);
}

ElementHandle ReviewedResult::ElementOf(const ReviewRecord& inRecord) const {
  return ElementHandle(source->Tree().Handle(inRecord.element));
}

int ReviewedResult::FindProduct(const ReviewedResult& inOther, int inProduct, int inGuess) const {
  return source->Find(inOther.source->Key(inProduct), inGuess);
}

}  // namespace ZORToolkit
