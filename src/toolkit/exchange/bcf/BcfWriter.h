// Clash results as BCF files.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_WRITER_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_WRITER_H

#include <cstddef>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "platform/product_structure/ZORIProduct.h"
#include "toolkit/publishing/PictureOptions.h"
#include "toolkit/records/RecordFilter.h"
#include "toolkit/review/Group.h"

namespace ZORToolkit {

/// The versions of BCF that are written.
enum class BcfVersion { k21, k30 };

/// The longest side of a picture in a BCF file, in pixels.
inline constexpr int kMaxSnapshotSize = 1500;

/// What is written, and with which pictures.
struct BcfOptions {
  BcfVersion version = BcfVersion::k21;
  std::optional<GroupOptions> grouping;  ///< nothing: a topic for each interference
  RecordFilter filter;                   ///< of a group those members that it accepts
  /// Of drawn pictures, each side at most kMaxSnapshotSize.
  PictureSize size;
  /// A published page, whose pictures are taken instead of drawing; empty: the pictures that the
  /// result refers to are taken when there is no model.
  std::string page;
  int processes = 1;        ///< that draw; at least 1
  std::string resultBytes;  ///< of the result's file, which goes into the BCF file whole
  /// Called with the numbers of pictures that are drawn and of all. May be empty.
  std::function<void(std::size_t inDone, std::size_t inAll)> drawn;
};

/// Something of a result that a format has no place for.
struct NotCarried {
  std::string what;
  int count = 0;     ///< of the interferences that have it
  std::string kept;  ///< where it is to be found nevertheless; empty: nowhere
};

/// What was written, and what BCF has no place for.
struct BcfWritten {
  std::size_t topics = 0, interferences = 0;
  std::size_t pictures = 0;  ///< topics whose picture shows one of their products
  std::vector<NotCarried> notCarried;
  std::vector<std::string> warnings;
};

/// Writes a topic for each interference, or for each group of the first level, with a viewpoint, a
/// picture and the components of its products. The same input makes the same bytes: times are the
/// document's date, else that of SOURCE_DATE_EPOCH. GUIDs are made of stable identifiers.
/// @param inOpenModel answers the root of the model that pictures show; empty without one: pictures
///                    that are not taken from elsewhere show the place alone.
/// @param inPath      of the file to write.
/// Raises Error and what inOpenModel raises.
ZOR_TOOLKIT_EXPORT BcfWritten WriteBcf(ClashDocument& ioResult, const BcfOptions& inOptions,
                                       const std::function<ZORIProduct_var()>& inOpenModel,
                                       const std::string& inPath);

}  // namespace ZORToolkit

#endif
