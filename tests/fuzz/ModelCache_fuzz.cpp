// A model in the form of the cache: refused, or the same after writing it.
#include "fuzz/Fuzz.h"
#include "support/SmallModel.h"

namespace {

using ZORDefault::ModelData;

/// Changes bytes of an entry: three bytes of the input each, the place and the new byte. What is left
/// over is added to the end.
std::string Patched(std::string inEntry, const std::string& inChanges) {
  std::size_t i = 0;
  for (; i + 2 < inChanges.size(); i += 3) {
    const auto byte = [&](std::size_t j) { return static_cast<unsigned char>(inChanges[i + j]); };
    inEntry[(byte(0) * 256u + byte(1)) % inEntry.size()] = inChanges[i + 2];
  }
  return inEntry + inChanges.substr(i);
}

void ReadAndWrite(const std::string& inEntry) {
  ModelData model, again;
  if (!DecodeModel(inEntry, model)) return;
  const std::string written = EncodeModel(model);
  fuzz::Require(DecodeModel(written, again), "what was written is not read");
  fuzz::Require(EncodeModel(again) == written, "written otherwise the second time");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  static const std::string entry = EncodeModel(support::TwoInstances());
  const std::string bytes = fuzz::Text(inBytes, inSize);
  ReadAndWrite(bytes);
  ReadAndWrite(Patched(entry, bytes));
  return 0;
}
