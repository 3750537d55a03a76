// Numbers with units.
#include <cmath>

#include "fuzz/Fuzz.h"
#include "platform/knowledge/ZORParmDictionary.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  const std::string bytes = fuzz::Text(inBytes, inSize);
  const ZORUnicodeString text(bytes.c_str());
  for (const char* const name : {"LENGTH", "ANGLE", "AREA"}) {
    const ZORICkeUnit_var unit = ZORParmDictionary::FindMagnitude(name)->Unit();
    constexpr double kBefore = 77;
    double value = kBefore;
    if (unit->Decode(text, value) == ZORCke::True)
      fuzz::Require(std::isfinite(value), "a value that is not finite");
    else
      fuzz::Require(value == kBefore, "changed on failure");
  }
  return 0;
}
