// What pictures show otherwise than the result has it.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_DEVIATIONS_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_DEVIATIONS_H

#include <cstddef>
#include <functional>
#include <set>
#include <string>

#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

class Deviations {
 public:
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
