// Everything about one interference, as texts.
#ifndef ZOR_TOOLS_LYRA_INTERFERENCE_RECORD_H
#define ZOR_TOOLS_LYRA_INTERFERENCE_RECORD_H

#include <array>
#include <optional>
#include <string>
#include <vector>

#include "lyra/InterferenceWalk.h"

namespace lyra {

using TextTriple = std::array<std::string, 3>;
/// The columns Rx, Ry, Rz of a rotation, then a translation in millimetres.
using Placement = std::array<double, 12>;

struct RuleRecord {
  std::string name, clearance, severity, penetrationCandidate;
};

struct ProductRecord {
  std::string id, alias, instance, label, alien, processMode, shape, shapeSource, preview;
  std::optional<Placement> position;  // absent with the product; all zeros without "Matrix"
};

struct ViewpointRecord {
  std::string projection, focusDistance, nearPlane, farPlane;
  TextTriple point, sight;
};

/// The texts are those of the reader, in UTF-8; empty where the document has none. UTF-8 text.
struct InterferenceRecord {
  int index = 0;
  std::string result, name, value, type, clearance, status, computationCase, retrieve;
  RuleRecord rule;
  std::array<ProductRecord, 2> products;
  std::string comment, picture;
  std::string curveLength, distance;
  std::vector<TextTriple> points;
  std::optional<ViewpointRecord> viewpoint;
};

/// kRow: what a row of a list shows and is chosen by; labels, previews, placements, points, viewpoint
/// and picture stay empty, which saves a third of the reading.
enum class RecordPart { kAll, kRow };

InterferenceRecord ReadInterference(ClashResultFile& ioFile, const PlacedInterference& inPlaced,
                                    RecordPart inPart = RecordPart::kAll);

}  // namespace lyra

#endif
