// Where pictures deviate from the result.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_DEVIATIONS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_DEVIATIONS_H

#include <cstddef>
#include <functional>
#include <set>
#include <string>

#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

/// Collects the products that the model lacks, and the interferences whose products are drawn as in
/// the model since their placements in the result cannot be trusted.
class Deviations {
 public:
  /// @param inNumber of the interference, as warnings call it.
  void Add(int inNumber, const InterferenceRecord& inRecord,
           const ResolvedInterference& inResolved);
  /// A line for each kind, if there is any.
  void Report(const std::function<void(const std::string& inWarning)>& inWarn) const;

 private:
  std::set<std::string> missing_;
  std::size_t incomplete_ = 0, movedBack_ = 0;
  std::string whyMovedBack_;
};

}  // namespace ZORToolkit

#endif
