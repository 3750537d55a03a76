#include "toolkit/publishing/pictures/Deviations.h"

namespace ZORToolkit {
namespace {

/// "1 product", "2 products".
std::string Counted(std::size_t inCount, const std::string& inThing) {
  return std::to_string(inCount) + " " + inThing + (inCount == 1 ? "" : "s");
}

/// A text of UTF-8 for one line among others.
std::string Shortened(const std::string& inText) {
  constexpr std::size_t kMaxShown = 160;
  if (inText.size() <= kMaxShown) return inText;
  std::size_t end = kMaxShown;
  while (end > 0 && (inText[end] & 0xC0) == 0x80) --end;
  return inText.substr(0, end) + "…";
}

/// Which of a set of texts there are: the first few and how many more.
std::string Listed(const std::set<std::string>& inTexts) {
  constexpr std::size_t kMaxListed = 3;
  std::string list;
  std::size_t listed = 0;
  for (const std::string& text : inTexts) {
    if (++listed > kMaxListed)
      return list + " and " + std::to_string(inTexts.size() - kMaxListed) + " more";
    list += (listed == 1 ? "\"" : ", \"") + Shortened(text) + "\"";
  }
  return list;
}

}  // namespace

void Deviations::Add(int inNumber, const InterferenceRecord& inRecord,
                     const ResolvedInterference& inResolved) {
  bool isComplete = true;
  for (std::size_t i = 0; i < 2; ++i) {
    const ResolvedProduct& product = inResolved.products[i];
    if (!inRecord.products[i].exists || !product.shown.product.IsNull()) continue;
    missing_.insert(product.path.empty() ? "(no name)" : product.path);
    isComplete = false;
  }
  incomplete_ += isComplete ? 0 : 1;
  const std::string& why = inResolved.whyAsInModel;
  if (inResolved.HasProduct() && !why.empty() && movedBack_++ == 0)
    whyMovedBack_ = std::to_string(inNumber) + ": " + Shortened(why);
}

void Deviations::Report(const std::function<void(const std::string& inWarning)>& inWarn) const {
  if (!inWarn) return;
  if (incomplete_ > 0)
    inWarn("the model lacks " + Counted(missing_.size(), "product") + " of " +
           Counted(incomplete_, "interference") + ": " + Listed(missing_));
  if (movedBack_ > 0)
    inWarn("the products of " + Counted(movedBack_, "interference") +
           " are drawn where they stand in the model; interference " + whyMovedBack_);
}

}  // namespace ZORToolkit
