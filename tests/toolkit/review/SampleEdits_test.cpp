// Real results, edited by a seeded program that knows what it did.
#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <set>

#include "foundation/ReadWholeFile.h"
#include "toolkit/review/Carry.h"
#include "toolkit/review/EditedResults.h"

namespace {

using namespace ZORToolkit;
using review_tests::Loaded;

constexpr const char* kSamples[] = {"as1",         "dissonance",     "low_cost_robot_arm",
                                    "pushdevice",  "printable_case", "stamp_c6lora",
                                    "detected/as1"};

/// What an interference of the edited result is.
struct Truth {
  int old = -1;  ///< its position in the old result, -1 for a new one
  DiffClass itsClass = DiffClass::kPersisting;
};

void ReplaceAll(const std::string& inFrom, const std::string& inTo, std::string& ioText) {
  for (std::size_t at = 0; (at = ioText.find(inFrom, at)) != std::string::npos; at += inTo.size())
    ioText.replace(at, inFrom.size(), inTo);
}

/// Sets an attribute's value where it is found first from a position on.
void SetAttribute(const std::string& inName, const std::string& inValue, std::size_t inFrom,
                  std::string& ioText) {
  const std::size_t begin = ioText.find(" " + inName + "=\"", inFrom) + inName.size() + 3;
  ioText.replace(begin, ioText.find('"', begin) - begin, inValue);
}

class SampleEdit {
 public:
  SampleEdit(const std::string& inXml, const ReviewedResult& inResult, unsigned inSeed)
      : random_(inSeed), result_(inResult) {
    const std::size_t first = inXml.find("<Interference ");
    head_ = inXml.substr(0, first);
    for (std::size_t begin = first, next = 0; begin != std::string::npos; begin = next) {
      next = inXml.find("<Interference ", begin + 1);
      blocks_.push_back({inXml.substr(begin, next - begin), {static_cast<int>(blocks_.size())}});
    }
    const std::size_t end = blocks_.back().text.find("</Interference>") + 15;
    tail_ = blocks_.back().text.substr(end);
    blocks_.back().text.resize(end);
    for (const ReviewRecord& record : inResult.interferences) ++pairs_[PairOf(record)];
  }

  void Run() {
    MoveProducts();
    RenameProducts();
    for (Block& block : blocks_) EditOne(block);
    std::erase_if(blocks_, [](const Block& inBlock) { return inBlock.text.empty(); });
    for (std::size_t i = blocks_.size(); i-- > 0;)
      if (Chance(10)) AddElsewhere(blocks_[i]);
    std::ranges::shuffle(blocks_, random_);
  }

  std::string Xml() const {
    std::string xml = head_;
    for (const Block& block : blocks_) xml += block.text;
    return xml + tail_;
  }
  Truth Of(std::size_t inNew) const { return blocks_[inNew].truth; }
  std::size_t Count() const { return blocks_.size(); }
  const std::set<int>& Deleted() const { return deleted_; }
  /// Products that have another name, and interferences of which a product moved.
  std::pair<int, int> RenamedAndMoved() const { return {renamed_, moved_}; }

 private:
  struct Block {
    std::string text;
    Truth truth;
  };

  bool Chance(unsigned inPercent) { return random_() % 100 < inPercent; }

  static std::pair<int, int> PairOf(const ReviewRecord& inRecord) {
    return std::minmax(inRecord.products[0], inRecord.products[1]);
  }
  const ReviewRecord& Record(const Truth& inTruth) const {
    return result_.interferences[static_cast<std::size_t>(inTruth.old)];
  }

  /// Those that part and placement tell from all others.
  void RenameProducts() {
    std::map<std::pair<std::string_view, std::array<double, 3>>, int> seen;
    const auto spot = [&](const ReviewProduct& inProduct) {
      const Placement placement = result_.PlacementOf(inProduct.element).value_or(Placement{});
      return std::pair(inProduct.part,
                       std::array{std::round(placement[9] / 4), std::round(placement[10] / 4),
                                  std::round(placement[11] / 4)});
    };
    for (const ReviewProduct& product : result_.products) ++seen[spot(product)];
    for (const ReviewProduct& product : result_.products) {
      if (seen[spot(product)] > 1 || product.part.empty() || product.id.empty() ||
          !result_.PlacementOf(product.element) || product.id.find('&') != std::string_view::npos ||
          movedIds_.contains(product.id) || !Chance(10))
        continue;
      const std::string id(product.id), other = "renamed " + std::to_string(renamed_++);
      for (Block& block : blocks_)
        for (const char* const name : {" DescriptionID=\"", " Alias=\""})
          ReplaceAll(name + id + "\"", name + other + "\"", block.text);
    }
  }

  /// By three millimetres, one of a pair at most, where the pair has no other interference.
  void MoveProducts() {
    for (const ReviewProduct& product : result_.products) {
      const std::optional<Placement> placement = result_.PlacementOf(product.element);
      const std::string begin = " DescriptionID=\"" + std::string(product.id) + "\"";
      std::vector<Block*> blocks;
      bool isMovable = placement.has_value() && !product.id.empty() && Chance(15);
      for (Block& block : blocks_) {
        if (!isMovable || block.text.find(begin) == std::string::npos) continue;
        blocks.push_back(&block);
        isMovable = pairs_[PairOf(Record(block.truth))] == 1 &&
                    block.truth.itsClass == DiffClass::kPersisting;
      }
      if (!isMovable) continue;
      for (Block* const block : blocks) {
        const std::size_t point = block->text.find("<Point ", block->text.find(begin));
        SetAttribute("Ux", std::to_string((*placement)[9] + 3), point, block->text);
        block->truth.itsClass = DiffClass::kChanged;
      }
      moved_ += static_cast<int>(blocks.size());
      movedIds_.insert(product.id);
    }
  }

  void EditOne(Block& ioBlock) {
    if (Chance(8)) {
      deleted_.insert(ioBlock.truth.old);
      ioBlock.text.clear();
    } else if (ioBlock.truth.itsClass == DiffClass::kPersisting && Chance(10)) {
      ioBlock.truth.itsClass = DiffClass::kChanged;
      SetAttribute("Value", "-77.125", 0, ioBlock.text);
    }
  }

  /// Another one of the pair, a metre away.
  void AddElsewhere(const Block& inBlock) {
    const std::optional<Position> place = result_.PlaceOf(Record(inBlock.truth));
    if (!place || pairs_[PairOf(Record(inBlock.truth))] > 1) return;
    Block added{inBlock.text, {-1, DiffClass::kNew}};
    std::size_t at = added.text.find("<GeometricAspect");
    while ((at = added.text.find("<Point ", at)) != std::string::npos) {
      SetAttribute("Ux", std::to_string((*place)[0] + 1000), at, added.text);
      at += 7;
    }
    blocks_.push_back(std::move(added));
  }

  std::mt19937 random_;
  const ReviewedResult& result_;
  std::string head_, tail_;
  std::vector<Block> blocks_;
  std::set<int> deleted_;
  std::map<std::pair<int, int>, int> pairs_;
  std::set<std::string_view> movedIds_;
  int renamed_ = 0, moved_ = 0;
};

std::string SampleText(const std::string& inName) {
  return ZORFoundation::ReadWholeFile(ZOR_SOURCE_DIR "/samples/" + inName + ".clash.xml").bytes;
}

class EditedSamples : public testing::TestWithParam<const char*> {};

TEST_P(EditedSamples, ClassesAreRightAndDecisionsArrive) {
  const std::string text = SampleText(GetParam());
  int renamed = 0, moved = 0;
  constexpr const char* kStatuses[] = {"Relevant", "Irrelevant", "Not inspected"};
  for (unsigned seed = 1; seed <= 3; ++seed) {
    SCOPED_TRACE(seed);
    Loaded was(text);
    SampleEdit edit(text, was.result, seed);
    edit.Run();
    renamed += edit.RenamedAndMoved().first;
    moved += edit.RenamedAndMoved().second;
    // Decisions of all kinds
    std::vector<ReviewEdit> decisions;
    std::mt19937 random(seed);
    for (const ReviewRecord& record : was.result.interferences)
      decisions.push_back({record.index - 1, kStatuses[random() % 3],
                           "note " + std::to_string(record.index), std::nullopt});
    ApplyReviewEdits(*was.document, was.result, decisions);
    const ReviewedResult old = ReadForReview(*was.document);
    Loaded is(edit.Xml());
    ASSERT_EQ(edit.Count(), is.result.interferences.size());

    const ResultDiff diff = Diff(old, is.result);
    const CarryPlan plan = PlanCarry(old, is.result, diff);
    ApplyReviewEdits(*is.document, is.result, plan.edits);
    const ReviewedResult carried = ReadForReview(*is.document);
    for (const DiffEntry& entry : diff.entries) {
      if (entry.newPosition < 0) {
        EXPECT_TRUE(edit.Deleted().contains(entry.oldPosition)) << entry.reason;
        continue;
      }
      const auto position = static_cast<std::size_t>(entry.newPosition);
      const Truth truth = edit.Of(position);
      ASSERT_EQ(truth.old, entry.oldPosition) << entry.reason;
      const ReviewRecord& now = carried.interferences[position];
      if (truth.old < 0) {
        EXPECT_EQ(DiffClass::kNew, entry.itsClass);
        EXPECT_EQ("New", now.retrieve);
        continue;
      }
      EXPECT_EQ(truth.itsClass == DiffClass::kChanged, entry.IsReopened()) << entry.reason;
      const ReviewRecord& before = old.interferences[static_cast<std::size_t>(truth.old)];
      const bool isSettled = before.status != "Not inspected";
      const std::string_view wanted = !isSettled ? is.result.interferences[position].status
                                      : entry.IsReopened() ? "Not inspected"
                                                           : before.status;
      EXPECT_EQ(wanted, now.status) << entry.reason;
      EXPECT_TRUE(now.comment.starts_with(before.comment)) << now.comment;
      EXPECT_EQ("Old", now.retrieve);
    }
    EXPECT_EQ(edit.Deleted().size(),
              static_cast<std::size_t>(diff.Count(DiffClass::kResolved) +
                                       diff.Count(DiffClass::kNotComparable)));
  }
  EXPECT_GT(renamed + moved, 0);
}

INSTANTIATE_TEST_SUITE_P(Samples, EditedSamples, testing::ValuesIn(kSamples),
                         [](const auto& inInfo) {
                           std::string name = inInfo.param;
                           std::ranges::replace(name, '/', '_');
                           return name;
                         });

}  // namespace
