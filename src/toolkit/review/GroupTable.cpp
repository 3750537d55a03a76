#include "toolkit/review/GroupTable.h"

#include <algorithm>
#include <charconv>

#include "toolkit/review/HashInput.h"
#include "toolkit/review/StableIds.h"

namespace ZORToolkit {
namespace {

void AddRounded(double inNumber, std::string& ioText) {
  constexpr double kPlain = 100'000;  // below it a number needs no exponent
  const double rounded = std::round(inNumber) + 0.0;
  if (!(std::abs(rounded) < kPlain)) {
    ioText += Number(rounded).text;
    return;
  }
  char digits[8];
  ioText.append(digits, std::to_chars(digits, std::end(digits), static_cast<int>(rounded)).ptr);
}

}  // namespace

void GroupTable::AddLabel(std::size_t inLevel, std::size_t inPosition, std::string& ioText) const {
  const Level& level = levels_[inLevel];
  const Group& group = level.groups[inPosition];
  if (level.by == GroupBy::kPlace)
    AddPlace(group, level.members[group.begin], ioText);
  else if (level.by == GroupBy::kProduct)
    ioText += level.labels.Text(group.key);
  else
    ioText.append(level.labels.Text(group.key >> 32))
        .append(" x ")
        .append(level.labels.Text(group.key & 0xFFFF'FFFF));
}

void GroupTable::AddPlace(const Group& inGroup, int inFirst, std::string& ioText) const {
  if (inGroup.key == kNoPlace) {
    ioText += "no place";
    return;
  }
  ioText.append("place ").append(std::to_string(inGroup.key + 1)).append(", near");
  const Position place = PlaceOf(inFirst).value_or(Position{});
  for (const double coordinate : place) {
    ioText += ' ';
    AddRounded(coordinate, ioText);
  }
}

std::optional<Position> GroupTable::PlaceOf(int inMember) const {
  const auto member = static_cast<std::size_t>(inMember);
  return result_.places.empty() ? result_.PlaceOf(result_.interferences[member])
                                : result_.places[member];
}

const std::vector<std::uint64_t>& GroupTable::NumbersOf(std::size_t inLevel) const {
  std::call_once(areNumbered_, [&] { NumberAll(); });
  return levels_[inLevel].numbers;
}

/// What is grouped by place has no other name than its interferences.
void GroupTable::NumberAll() const {
  std::vector<std::uint64_t> ids;
  if (std::ranges::count(levels_, GroupBy::kPlace, &Level::by) > 0) ids = StableIdNumbers(result_);
  HashInput input;
  std::string text, around;
  const auto id = [&](int inMember) { return ids[static_cast<std::size_t>(inMember)]; };
  for (std::size_t level = 0; level < levels_.size(); ++level) {
    const GroupBy by = levels_[level].by;
    std::vector<std::uint64_t>& numbers = levels_[level].numbers;
    numbers.reserve(levels_[level].Count());
    for (std::size_t outer = 0, i = 0; i < levels_[level].Count(); ++i) {
      if (level > 0 && (i == 0 || levels_[level - 1].groups[outer + 1].inner == i)) {
        outer += i == 0 ? 0 : 1;
        around = ZORFoundation::HexText(levels_[level - 1].numbers[outer]);
      }
      text.clear();
      if (by == GroupBy::kPlace)
        text = ZORFoundation::HexText(id(*std::ranges::min_element(MembersOf(level, i), {}, id)));
      else
        AddLabel(level, i, text);
      input.Clear();
      input.AddText(around);
      input.AddText(Name(by));
      input.AddText(text);
      numbers.push_back(input.Hash());
    }
  }
}

// Groups, as they are handed on

GroupBy InterferenceGroup::By() const { return table_->Levels()[level_].by; }
std::string InterferenceGroup::Label() const { return table_->LabelOf(level_, position_); }
std::span<const int> InterferenceGroup::Members() const {
  return table_->MembersOf(level_, position_);
}
int InterferenceGroup::Representative() const {
  return table_->At(level_, position_).representative;
}

std::optional<double> InterferenceGroup::Worst() const {
  const double worst = table_->At(level_, position_).worst;
  return std::isnan(worst) ? std::nullopt : std::optional(worst);
}

GroupList InterferenceGroup::Groups() const {
  if (level_ + 1 == table_->Levels().size()) return {*table_, level_ + 1, 0, 0};
  return {*table_, level_ + 1, table_->At(level_, position_).inner,
          table_->At(level_, position_ + 1).inner};
}

std::uint64_t InterferenceGroup::Number() const { return table_->NumbersOf(level_)[position_]; }
std::string InterferenceGroup::Id() const { return ZORFoundation::HexText(Number()); }

InterferenceGroups::InterferenceGroups(std::shared_ptr<const GroupTable> inTable)
    : GroupList(*inTable, 0, 0, inTable->Levels().empty() ? 0 : inTable->Levels()[0].Count()),
      table_(std::move(inTable)) {}

std::optional<InterferenceGroup> InterferenceGroups::Find(std::string_view inId) const {
  std::uint64_t number = 0;
  std::from_chars(inId.data(), inId.data() + inId.size(), number, 16);
  if (ZORFoundation::HexText(number) != inId) return std::nullopt;
  for (std::size_t level = 0; level < table_->Levels().size(); ++level) {
    const std::vector<std::uint64_t>& numbers = table_->NumbersOf(level);
    const auto found = std::ranges::find(numbers, number);
    if (found != numbers.end())
      return InterferenceGroup(*table_, level, static_cast<std::size_t>(found - numbers.begin()));
  }
  return std::nullopt;
}

const char* Name(GroupBy inBy) {
  constexpr const char* kNames[] = {"parts", "assemblies", "place", "product"};
  return kNames[static_cast<std::size_t>(inBy)];
}

}  // namespace ZORToolkit
