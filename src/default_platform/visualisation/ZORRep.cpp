#include "platform/visualisation/ZORRep.h"

#include <algorithm>

#include "platform/visualisation/ZOR3DRep.h"

ZORRep::ZORRep() = default;
ZORRep::~ZORRep() = default;

void ZORRep::SetColorRGBA(unsigned int inRed, unsigned int inGreen, unsigned int inBlue,
                          unsigned int inAlpha) {
  const unsigned int wanted[4] = {inRed, inGreen, inBlue, inAlpha};
  for (int i = 0; i < 4; ++i) colour_[i] = std::min(wanted[i], 255u);
}

void ZORRep::SetInheritanceMode(unsigned int inMode) { inheritanceMode_ = inMode; }
unsigned int ZORRep::GetInheritanceMode() const { return inheritanceMode_; }

void ZORRep::GetColorRGBA(unsigned int outColour[4]) const {
  std::copy(colour_, colour_ + 4, outColour);
}

void ZORRep::Destroy() { delete this; }

ZOR3DRep::ZOR3DRep() = default;
ZOR3DRep::~ZOR3DRep() = default;
