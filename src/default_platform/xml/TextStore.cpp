#include "default_platform/xml/TextStore.h"

#include <algorithm>
#include <limits>
#include <stdexcept>
#include <utility>

#include "foundation/Utf8.h"

namespace {

constexpr std::size_t kFirstBlock = std::size_t{4} * 1024;
constexpr std::size_t kFirstSlots = 64;
constexpr std::uint32_t kMaxNewInARow = 100;

bool IsLatin1(std::u16string_view inUnits) {
  char16_t all = 0;
  for (const char16_t unit : inUnits) all |= unit;
  return all < 0x100;
}

// Stored texts are as narrow as they can be, so equal ones have units of one size.
bool AreSameAsStored(TextView inA, TextView inB) {
  return inA.IsWide() == inB.IsWide() && inA.Length() == inB.Length() &&
         ZORFoundation::AreSameBytes(static_cast<const char*>(inA.Data()),
                                     static_cast<const char*>(inB.Data()), inA.Bytes());
}

}  // namespace

void TextView::CopyTo(char16_t* outUnits) const {
  if (isWide_) {
    std::copy_n(static_cast<const char16_t*>(units_), length_, outUnits);
  } else {
    WidenLatin1(Latin1(), outUnits);
  }
}

std::u16string TextView::ToUtf16() const {
  std::u16string text(length_, u'\0');
  CopyTo(text.data());
  return text;
}

bool IsSameText(TextView inA, TextView inB) {
  if (inA.Length() != inB.Length()) return false;
  if (inA.IsWide() == inB.IsWide())
    return inA.Length() == 0 || std::memcmp(inA.Data(), inB.Data(), inA.Bytes()) == 0;
  return inA.IsWide() ? IsSameText(inA.Units(), inB.Latin1())
                      : IsSameText(inB.Units(), inA.Latin1());
}

TextStore::TextStore() : shared_(new Shared[kSharedSlots]()) {
  blocks_.emplace_back(new char[kFirstBlock]);
  pages_.push_back(blocks_.back().get());
  free_ = 1;  // 0 means no text
  end_ = kFirstBlock / kStep;
}

inline TextRef TextStore::Allocate(std::size_t inBytes) {
  const std::size_t steps = (inBytes + kStep - 1) / kStep;
  if (end_ - free_ < steps) {
    if (steps > kPageSteps / 4) {  // pages of its own; the current one stays in use
      const auto ref = static_cast<TextRef>(pages_.size() << kPageBits);
      AddPages(inBytes);
      return ref;
    }
    free_ = static_cast<TextRef>(pages_.size() << kPageBits);
    AddPages(kPageBytes);
    end_ = free_ + kPageSteps;
  }
  const TextRef ref = free_;
  free_ += static_cast<TextRef>(steps);
  return ref;
}

TextRef TextStore::Add(TextView inText) {
  if (!inText.IsWide() || !IsLatin1(inText.Units())) return AddStored(inText);
  narrowed_.assign(inText.Units().begin(), inText.Units().end());
  return AddStored(std::string_view(narrowed_));
}

TextRef TextStore::AddStored(TextView inText) {
  return inText.Length() > kMaxShared ? AddUnshared(inText) : AddShared(inText);
}

inline TextRef TextStore::AddShared(TextView inText) {
  const std::uint64_t hash = ZORFoundation::HashOfBytes(inText.Data(), inText.Bytes());
  Shared& slot = shared_[hash % kSharedSlots];
  if (slot.text == 0 || slot.hash != hash || !AreSameAsStored((*this)[slot.text].View(), inText))
    slot = {hash, AddUnshared(inText)};
  return slot.text;
}

TextRef TextStore::AddOther(std::string_view inLatin1, TextSeries& ioSeries) {
  if (ioSeries.newInARow == kMaxNewInARow) {
    ioSeries.lastRef = AddUnshared(inLatin1);
  } else {
    const TextRef before = free_;
    ioSeries.lastRef = AddStored(inLatin1);
    ioSeries.newInARow = free_ == before ? 0 : ioSeries.newInARow + 1;
  }
  ioSeries.last = &(*this)[ioSeries.lastRef];
  return ioSeries.lastRef;
}

TextRef TextStore::AddUnshared(TextView inText) {
  if (inText.Length() > DOM_Text::kMaxLength)
    throw std::length_error("a text is longer than 2,147,483,647 characters");
  const TextRef ref = Allocate(sizeof(DOM_Text) + inText.Bytes());
  const auto length = static_cast<std::uint32_t>(inText.Length());
  DOM_Text* const text =
      new (PlaceOf(ref)) DOM_Text{inText.IsWide() ? length | DOM_Text::kWide : length};
  if (length != 0) std::memcpy(text + 1, inText.Data(), inText.Bytes());
  return ref;
}

const DOM_Text* TextStore::AddWide(std::u16string_view inUnits) {
  return &(*this)[AddUnshared(inUnits)];
}

const char16_t* TextStore::Widen(const DOM_Text& inText) {
  if (inText.IsWide()) return inText.Units();
  if (widenedCount_ * 2 >= widened_.size()) GrowWidened();
  Widened& known = SlotOf(&inText);
  if (known.narrow == nullptr) {
    const TextRef ref = Allocate(sizeof(DOM_Text) + inText.Length() * sizeof(char16_t));
    DOM_Text* const wide = new (PlaceOf(ref)) DOM_Text{inText.Length() | DOM_Text::kWide};
    inText.View().CopyTo(wide->Units());
    known = {&inText, wide};
    ++widenedCount_;
  }
  return known.wide->Units();
}

TextStore::Widened& TextStore::SlotOf(const DOM_Text* inNarrow) {
  const std::size_t mask = widened_.size() - 1;
  const auto address = reinterpret_cast<std::uintptr_t>(inNarrow);
  std::size_t slot = ZORFoundation::HashOfBytes(&address, sizeof address) & mask;
  while (widened_[slot].narrow != nullptr && widened_[slot].narrow != inNarrow)
    slot = (slot + 1) & mask;
  return widened_[slot];
}

void TextStore::GrowWidened() {
  const std::vector<Widened> before =
      std::exchange(widened_, std::vector<Widened>(std::max(widened_.size() * 2, kFirstSlots)));
  for (const Widened& known : before)
    if (known.narrow != nullptr) SlotOf(known.narrow) = known;
}

void TextStore::AddPages(std::size_t inBytes) {
  const std::size_t count = (inBytes + kPageBytes - 1) / kPageBytes;
  if (pages_.size() + count > (std::size_t{1} << (32 - kPageBits)))
    throw std::length_error("a document has more than 16 GB of texts");
  blocks_.emplace_back(new char[std::max(inBytes, kPageBytes)]);
  for (std::size_t page = 0; page < count; ++page)
    pages_.push_back(blocks_.back().get() + page * kPageBytes);
}

NameTable::NameTable(TextStore& ioTexts) : texts_(ioTexts), names_(1), slots_(kFirstSlots) {
  names_[0] = texts_.AddWide({});
}

std::size_t NameTable::SlotOf(std::u16string_view inName) const {
  const std::size_t mask = slots_.size() - 1;
  std::size_t slot =
      ZORFoundation::HashOfBytes(inName.data(), inName.size() * sizeof(char16_t)) & mask;
  while (slots_[slot] != 0 && !IsSameText(UnitsOf(slots_[slot]), inName)) slot = (slot + 1) & mask;
  return slot;
}

std::uint32_t NameTable::FindNewAscii(std::string_view inName) const {
  if (!ZORFoundation::IsAscii(inName)) return 0;
  const std::uint32_t name = slots_[SlotOf(TextView(inName).ToUtf16())];
  Found& found = found_[PlaceOf(inName.data())];
  if (name != 0 && inName.size() < sizeof(found.text)) {
    found.name = name;
    *std::copy(inName.begin(), inName.end(), found.text) = '\0';
  }
  return name;
}

std::uint32_t NameTable::Intern(std::u16string_view inName) {
  const std::size_t slot = SlotOf(inName);
  if (slots_[slot] != 0) return slots_[slot];
  const std::uint32_t name = End();
  if (name == kMaxNames) throw std::length_error("a document has more than 16,777,215 names");
  names_.push_back(texts_.AddWide(inName));
  slots_[slot] = name;
  if (names_.size() * 2 > slots_.size()) Grow();
  return name;
}

void NameTable::Grow() {
  slots_.assign(slots_.size() * 2, 0);
  for (std::uint32_t name = 1; name < End(); ++name) slots_[SlotOf(UnitsOf(name))] = name;
}
