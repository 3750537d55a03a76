#include "platform/visualisation/ZORIVisProperties.h"

HRESULT ZORVisPropertiesValues::GetInheritance(int inPropertyType, unsigned int& outFlag) const {
  if (inPropertyType != kColour) return E_INVALIDARG;
  if (!hasColour_) return E_FAIL;
  outFlag = colourInheritance_;
  return S_OK;
}

HRESULT ZORVisPropertiesValues::GetColor(unsigned int& outRed, unsigned int& outGreen,
                                         unsigned int& outBlue) const {
  if (!hasColour_) return E_FAIL;
  outRed = colour_[0];
  outGreen = colour_[1];
  outBlue = colour_[2];
  return S_OK;
}

void ZORVisPropertiesValues::SetColor(unsigned int inRed, unsigned int inGreen,
                                      unsigned int inBlue) {
  hasColour_ = true;
  colour_[0] = inRed;
  colour_[1] = inGreen;
  colour_[2] = inBlue;
}

void ZORVisPropertiesValues::SetInheritance(int inPropertyType, unsigned int inFlag) {
  if (inPropertyType == kColour) colourInheritance_ = inFlag;
}
