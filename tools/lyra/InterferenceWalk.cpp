#include "lyra/InterferenceWalk.h"

#include "lyra/CommandErrors.h"

namespace lyra {

int CountInterferences(const ClashResultFile& inFile) {
  int count = 0;
  ForEachInterference(inFile, [&](const PlacedInterference&) { ++count; });
  return count;
}

PlacedInterference FindInterference(const ClashResultFile& inFile, long long inNumber) {
  std::optional<PlacedInterference> found;
  int count = 0;
  ForEachInterference(inFile, [&](const PlacedInterference& inPlaced) {
    ++count;
    if (inPlaced.number == inNumber) found = inPlaced;
  });
  if (found) return *found;
  const std::string held = count == 0   ? "no interference"
                           : count == 1 ? "1 interference"
                                        : std::to_string(count) + " interferences";
  throw InputError(inFile.Name() + ": there is no interference " + std::to_string(inNumber) +
                   ": the document has " + held);
}

}  // namespace lyra
