#include "platform/visualisation/ZORRepPath.h"

#include "default_platform/system/ObjectCounters.h"
#include "platform/visualisation/ZORLyraRepPathBuilder.h"

namespace {

ZORDefault::ObjectCounter& Counter() {
  static ZORDefault::ObjectCounter& counter = ZORDefault::CounterOf("ZORRepPath");
  return counter;
}

}  // namespace

ZORRepPath::ZORRepPath(ZORLyraRepPathBuilder* inBuilder, ZORRep* inRep)
    : builder_(inBuilder), reps_{inRep} {
  ++Counter().built;
}

ZORRepPath::~ZORRepPath() {
  if (builder_) std::erase(builder_->paths_, this);
  ++Counter().released;
}

void ZORRepPath::Rewind() { next_ = 0; }

ZORRep* ZORRepPath::NextChildRep() { return next_ < reps_.size() ? reps_[next_++] : nullptr; }
