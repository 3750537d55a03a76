// Review files, applied to a result.
#include "fuzz/Fuzz.h"
#include "toolkit/review/Carry.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  constexpr const char* kResult =
      "<ClashElement><ClashResult NbInterf=\"1\"><Interference Name=\"i\" Value=\"-1\" "
      "ResultType=\"Clash\" Status=\"Relevant\"><Product Alias=\"a\"/><Product Alias=\"b\"/>"
      "</Interference></ClashResult></ClashElement>";
  try {
    const ZORToolkit::ReviewFile review =
        ZORToolkit::ReadReviewFile("text", fuzz::Text(inBytes, inSize));
    ZORToolkit::ClashDocument document("result", kResult);
    const ZORToolkit::ReviewedResult result = ReadForReview(document);
    const ZORToolkit::ApplyPlan plan = PlanApply(result, review, {});
    ApplyReviewEdits(document, result, plan.edits);
  } catch (const ZORToolkit::Error&) {
    return 0;  // refused
  }
  return 0;
}
