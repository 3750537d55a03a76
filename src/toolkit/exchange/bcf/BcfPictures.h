// The pictures and the cameras of the topics of a BCF file; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_PICTURES_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_PICTURES_H

#include <array>
#include <filesystem>
#include <optional>
#include <string>
#include <vector>

#include "foundation/TemporaryFile.h"
#include "foundation/Vector3.h"
#include "toolkit/exchange/bcf/BcfWriter.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

/// Lengths in millimetres, angles in radians.
struct SnapshotCamera {
  bool isPerspective = true;
  ZORFoundation::Vector3d eye, sight, up;
  double focusDistance = 0, viewAngle = 0, viewHeight = 0;
};

struct Snapshot {
  SnapshotCamera camera;
  /// Path of a PNG or JPEG file; empty: there is none, and a white one stands in.
  std::string picture;
  double aspectRatio = 1;
  std::array<std::string, 2> colours;  ///< RRGGBB, upper case
  bool showsProducts = false;
};

/// Takes or draws the pictures of interferences, in a folder of its own that goes with it.
class SnapshotMaker {
 public:
  SnapshotMaker(const BcfOptions& inOptions, const std::string& inResultPath);
  SnapshotMaker(const SnapshotMaker&) = delete;
  SnapshotMaker& operator=(const SnapshotMaker&) = delete;

  /// @return one for each record, in their order.
  std::vector<Snapshot> Make(const std::vector<const InterferenceRecord*>& inRecords,
                             const std::function<ZORIProduct_var()>& inOpenModel);
  /// The picture of an interference on the published page; empty when there is none.
  std::string PagePicture(int inNumber) const;

 private:
  std::string ReadyPicture(const InterferenceRecord& inRecord, bool inHasModel) const;
  /// @param inResolved of those that are wanted, in their order.
  void Draw(const std::vector<std::size_t>& inWanted,
            const std::vector<ResolvedInterference>& inResolved,
            std::vector<Snapshot>& ioSnapshots);

  const BcfOptions& options_;
  std::filesystem::path resultFolder_;
  std::optional<ZORFoundation::ScratchFolder> folder_;  // once something is drawn
};

/// The size of a PNG picture; nothing for another file.
std::optional<PictureSize> SizeOfPng(const std::string& inPath);
/// The same of a PNG or a JPEG picture.
std::optional<PictureSize> SizeOfPicture(const std::string& inPath);

/// A white picture of one pixel.
std::string WhitePng();

}  // namespace ZORToolkit

#endif
