#include "FormerTree.h"

#include <algorithm>
#include <limits>
#include <stdexcept>

namespace former {

namespace {
constexpr std::size_t kFirstBlock = std::size_t{4} * 1024;
constexpr std::size_t kMaxBlock = std::size_t{1024} * 1024;
constexpr std::size_t kFirstSlots = 64;
constexpr std::uint32_t kMaxNewInARow = 100;
}  // namespace

TextStore::TextStore() : nextBlock_(kFirstBlock), shared_(new Shared[kSharedSlots]()) {}

const DOM_Text* TextStore::Add(std::u16string_view inText) {
  if (inText.size() > kMaxShared) return AddUnshared(inText);
  const std::uint64_t hash = HashOfText(inText);
  Shared& slot = shared_[hash % kSharedSlots];
  if (slot.hash != hash || slot.text == nullptr || !IsSameText(slot.text->View(), inText))
    slot = {hash, AddUnshared(inText)};
  return slot.text;
}

const DOM_Text* TextStore::Add(std::u16string_view inText, TextSeries& ioSeries) {
  if (ioSeries.last != nullptr && IsSameText(ioSeries.last->View(), inText)) {
    ioSeries.newInARow = 0;
    return ioSeries.last;
  }
  if (ioSeries.newInARow == kMaxNewInARow) return ioSeries.last = AddUnshared(inText);
  const char* const before = free_;
  ioSeries.last = Add(inText);
  ioSeries.newInARow = free_ == before ? 0 : ioSeries.newInARow + 1;
  return ioSeries.last;
}

const DOM_Text* TextStore::AddUnshared(std::u16string_view inText) {
  if (inText.size() > std::numeric_limits<std::uint32_t>::max())
    throw std::length_error("a text is longer than 4,294,967,295 units");
  const std::size_t bytes = sizeof(DOM_Text) + inText.size() * sizeof(char16_t);
  DOM_Text* text = new (Allocate((bytes + 3) & ~std::size_t{3}))
      DOM_Text{static_cast<std::uint32_t>(inText.size())};
  std::copy(inText.begin(), inText.end(), text->Units());
  return text;
}

char* TextStore::Allocate(std::size_t inBytes) {
  if (static_cast<std::size_t>(end_ - free_) < inBytes) return AllocateBlock(inBytes);
  char* const place = free_;
  free_ += inBytes;
  return place;
}

char* TextStore::AllocateBlock(std::size_t inBytes) {
  if (inBytes > nextBlock_ / 4) {  // a block of its own; the current one stays in use
    blocks_.emplace_back(new char[inBytes]);
    return blocks_.back().get();
  }
  blocks_.emplace_back(new char[nextBlock_]);
  free_ = blocks_.back().get();
  end_ = free_ + nextBlock_;
  nextBlock_ = std::min(nextBlock_ * 2, kMaxBlock);
  return Allocate(inBytes);
}

NameTable::NameTable(TextStore& ioTexts) : texts_(ioTexts), names_(1), slots_(kFirstSlots) {
  names_[0] = texts_.Add({});
}

std::size_t NameTable::SlotOf(std::u16string_view inName) const {
  const std::size_t mask = slots_.size() - 1;
  std::size_t slot = HashOfText(inName) & mask;
  while (slots_[slot] != 0 && !IsSameText(names_[slots_[slot]]->View(), inName))
    slot = (slot + 1) & mask;
  return slot;
}

std::uint32_t NameTable::Find(std::u16string_view inName) const { return slots_[SlotOf(inName)]; }

std::uint32_t NameTable::Intern(std::u16string_view inName) {
  const std::size_t slot = SlotOf(inName);
  if (slots_[slot] != 0) return slots_[slot];
  const std::uint32_t name = End();
  names_.push_back(texts_.AddUnshared(inName));
  slots_[slot] = name;
  if (names_.size() * 2 > slots_.size()) Grow();
  return name;
}

void NameTable::Grow() {
  slots_.assign(slots_.size() * 2, 0);
  for (std::uint32_t name = 1; name < End(); ++name) slots_[SlotOf(names_[name]->View())] = name;
}

std::uint32_t Tree::Append(std::uint32_t inParent, Kind inKind, std::uint32_t inName,
                           const DOM_Text* inText) {
  const std::uint32_t number = nodes.Add();
  Node& node = nodes[number];
  node = Node();
  node.kind = inKind;
  node.name = inName;
  if (inKind == kText || inKind == kOther)
    node.text = inText;
  else
    node.children = {0, 0};
  if (inParent == 0) return number;
  Node& parent = nodes[inParent];
  node.parent = inParent;
  node.previous = parent.children.last;
  (parent.children.last == 0 ? parent.children.first : nodes[parent.children.last].next) = number;
  parent.children.last = number;
  return number;
}

std::uint32_t Tree::AppendAttribute(std::uint32_t inElement, std::uint32_t inLast,
                                    std::uint32_t inName, const DOM_Text* inValue) {
  const std::uint32_t number = attributes.Add();
  attributes[number] = {inValue, inName, 0};
  (inLast == 0 ? nodes[inElement].firstAttribute : attributes[inLast].next) = number;
  return number;
}

void HashTree(const Tree& inTree, std::uint32_t inNode, std::size_t inDepth, TreeHash& ioHash) {
  const Node& node = inTree.nodes[inNode];
  if (node.kind == kText) return ioHash.AddText(inDepth, node.text->View());
  if (node.kind == kOther) return;
  if (node.kind == kElement) {
    ioHash.AddElement(inDepth, inTree.names.TextOf(node.name)->View());
    for (std::uint32_t at = node.firstAttribute; at != 0; at = inTree.attributes[at].next)
      ioHash.AddAttribute(inTree.names.TextOf(inTree.attributes[at].name)->View(),
                          inTree.attributes[at].value->View());
  }
  for (std::uint32_t child = node.children.first; child != 0; child = inTree.nodes[child].next)
    HashTree(inTree, child, inDepth + 1, ioHash);
}

}  // namespace former
