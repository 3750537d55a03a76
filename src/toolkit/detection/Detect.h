// Computes a clash result from a CAD model.
#ifndef ZOR_TOOLKIT_DETECTION_DETECT_H
#define ZOR_TOOLKIT_DETECTION_DETECT_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "ZORToolkitExport.h"
#include "toolkit/sharding/Plan.h"
#include "toolkit/sharding/Shard.h"

namespace ZORToolkit {

/// What a surface that encloses nothing means when it enters a solid deeper than the tolerance.
enum class SheetsMean { kClash, kContact, kNothing };

/// Lengths in millimetres; texts in UTF-8. Patterns have "*" for any text and "?" for any
/// character; they are matched against the alias path and the part name of a product and of the
/// assemblies above it.
struct DetectionOptions {
  double tolerance = 0.01;   ///< a clash is deeper; not negative
  double contactGap = 1e-5;  ///< products that are at most this far apart touch; not negative
  double clearance = 0;      ///< 0: clearances are not looked for; else not below the contact gap
  /// Products at this level below the root (1: its children) count as one with all below them;
  /// otherwise the leaves of the tree are looked at.
  std::optional<int> level;
  std::vector<std::string> only;    ///< products that match one of them; empty: all
  std::vector<std::string> ignore;  ///< but none that matches one of these
  std::optional<std::pair<std::string, std::string>> between;  ///< one selection against another
  SheetsMean sheets = SheetsMean::kClash;
  unsigned threads = 0;  ///< 0: as many as there are processors
  /// Processor time in seconds and memory in bytes that reading the model may take; 0: by its size.
  double maxSeconds = 0;
  std::uint64_t maxMemory = 0;
  bool isStrict = false;  ///< a model of which something cannot be read is an error, not a warning
  bool hasViewpoints = false;  ///< each interference gets the viewpoint of its picture

  Shard shard;                     ///< only the verdicts of this share are found
  std::vector<std::string> known;  ///< findings of other runs, which are not looked for again
  int kept = -1;          ///< an open file to which records of what is found are appended; -1: none
  std::size_t tried = 0;  ///< more than 0: only so many verdicts, timed one after another

  /// Called with the share that is read, 0 to 1; may be empty.
  std::function<void(double)> readingProgress;
  /// Called with the pairs done and all; false: stop.
  std::function<bool(std::size_t, std::size_t)> progress;
  std::function<void(const std::string&)> warn;  ///< called with one line; may be empty
};

/// A product that was checked, or several that count as one.
struct DetectedProduct {
  std::string path;      ///< aliases from below the root, joined by " --++-- "
  std::string partName;  ///< may be empty
  /// The columns of its rotation, then its translation.
  std::array<double, 12> rootFromProduct{};
};

/// In perspective, in millimetres.
struct DetectedViewpoint {
  std::array<double, 3> eye{}, sight{};  ///< the sight is a unit vector
  double focusDistance = 0, nearPlane = 0, farPlane = 0;
};

/// A clash, contact or clearance violation of two products. Lengths in millimetres.
struct DetectedInterference {
  enum class Kind { kClash, kContact, kClearance };
  std::size_t first = 0, second = 0;  ///< positions in DetectionResult::products
  Kind kind = Kind::kContact;
  double value = 0;  ///< minus the depth of a clash, 0, or the distance
  std::array<std::array<double, 3>, 2> points{};
  double curveLength = 0;
  std::vector<std::array<double, 3>> curve;  ///< some points along it
  bool isDuplicate = false;                  ///< the same geometry at the same place
  bool isSheetInSolid = false;
  std::optional<DetectedViewpoint> viewpoint;
  /// How far the triangles may be off where there is no exact geometry.
  std::optional<double> meshPrecision;
};

/// The result of a detection, or of a share of it.
struct DetectionResult {
  std::string model;     ///< the file's name
  std::string document;  ///< the root's alias
  std::vector<DetectedProduct> products;
  std::vector<DetectedInterference> interferences;  ///< each pair once, in tree order
  /// What could not be judged, one line each.
  std::vector<std::string> unjudged;
  std::size_t productsChecked = 0, pairsNear = 0;
  bool isStopped = false;
  /// Encoded, for `known` of a later run on a machine of the same kind; with those that were
  /// known.
  std::string findings;
  std::vector<int> judged;  ///< the verdicts in them, by number
  WorkSample work;          ///< the costs of all verdicts, and the times of those that were tried
  double tolerance = 0, contactGap = 0, clearance = 0;
  std::string computationCase;
};

/// A day of the Gregorian calendar.
struct CalendarDate {
  int day = 1, month = 1, year = 1970;
};

/// Today's date, or that of SOURCE_DATE_EPOCH, as reproducible builds want it.
ZOR_TOOLKIT_EXPORT CalendarDate DateOfWriting();

/// Why options are refused, one line; empty when they are valid.
ZOR_TOOLKIT_EXPORT std::string FindFault(const DetectionOptions& inOptions);

/// Finds all interferences of a STEP, IGES, glTF, GLB, OBJ or STL file, in a process of its own, so
/// that a damaged file cannot crash the caller's. The number of threads does not change the result.
/// Raises Error when the model cannot be read, when there are not two products to check, or when a
/// selection is empty.
ZOR_TOOLKIT_EXPORT DetectionResult Detect(const std::string& inModel,
                                          const DetectionOptions& inOptions);

/// Writes a clash result of version 1.2.
/// @param inPath UTF-8; the file is made or overwritten.
/// Raises Error when it cannot be written.
ZOR_TOOLKIT_EXPORT void WriteClashResult(const DetectionResult& inResult,
                                         const CalendarDate& inDate, const std::string& inPath);

}  // namespace ZORToolkit

#endif
