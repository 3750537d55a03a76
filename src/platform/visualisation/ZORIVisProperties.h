// Colours and the like of an object.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORIVISPROPERTIES_H
#define ZOR_PLATFORM_VISUALISATION_ZORIVISPROPERTIES_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORInterfaceHandle.h"

/// What ZORIVisProperties fills.
class ZOR_PLATFORM_EXPORT ZORVisPropertiesValues {
 public:
  /// @param inPropertyType 0: the colour.
  /// @param outFlag non-zero when the property is imposed on all below.
  /// @return S_OK; E_FAIL when the property is not set, E_INVALIDARG for an unknown type.
  HRESULT GetInheritance(int inPropertyType, unsigned int& outFlag) const;
  /// Each component 0 to 255. @return S_OK, or E_FAIL when no colour is set.
  HRESULT GetColor(unsigned int& outRed, unsigned int& outGreen, unsigned int& outBlue) const;

#if ZOR_PLATFORM_ADDITIONS
  enum PropertyType { kColour = 0 };
  void SetColor(unsigned int inRed, unsigned int inGreen, unsigned int inBlue);
  void SetInheritance(int inPropertyType, unsigned int inFlag);
#endif

 private:
  bool hasColour_ = false;
  unsigned int colour_[3] = {0, 0, 0};
  unsigned int colourInheritance_ = 0;
};

class ZOR_PLATFORM_EXPORT ZORIVisProperties : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// @param inProperties 11: all properties. @param inGeometry 5: of the object as a whole.
  /// @return S_OK; E_INVALIDARG for other selectors.
  virtual HRESULT GetPropertiesAtt(ZORVisPropertiesValues& outValues, int inProperties,
                                   int inGeometry, int inReserved = 0, int inAlsoReserved = 0) = 0;

#if ZOR_PLATFORM_ADDITIONS
  /// Sets the colour of the object as a whole and whether it is imposed on all below.
  virtual HRESULT SetPropertiesAtt(const ZORVisPropertiesValues& inValues) = 0;
#endif
};

typedef ZORInterfaceHandle<ZORIVisProperties> ZORIVisProperties_var;

#endif
