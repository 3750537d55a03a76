// The way to the representation of an object.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORREPPATH_H
#define ZOR_PLATFORM_VISUALISATION_ZORREPPATH_H

#include <vector>

#include "platform/visualisation/ZORRep.h"

class ZORLyraRepPathBuilder;

/// The representations on the way to an object's own, which belong to their objects. Made by a
/// ZORLyraRepPathBuilder; ends with delete, or with its builder.
class ZOR_PLATFORM_EXPORT ZORRepPath {
 public:
  ~ZORRepPath();
  ZORRepPath(const ZORRepPath&) = delete;
  ZORRepPath& operator=(const ZORRepPath&) = delete;
  /// Goes back to the place at which NextChildRep gives the object's own representation.
  void Rewind();
  /// @return the next representation, null at the end.
  ZORRep* NextChildRep();

 private:
  friend class ZORLyraRepPathBuilder;
  ZORRepPath(ZORLyraRepPathBuilder* inBuilder, ZORRep* inRep);

  ZORLyraRepPathBuilder* builder_;  // null once the builder has let go
  std::vector<ZORRep*> reps_;
  std::size_t next_ = 0;
};

#endif
