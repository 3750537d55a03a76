// What is shown of an object.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORREP_H
#define ZOR_PLATFORM_VISUALISATION_ZORREP_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/visualisation/ZOR3DBoundingSphere.h"

/// A node of a scene. Representations are not counted: whoever made one, or was given it by name,
/// calls Destroy; a product's own representation belongs to the product.
class ZOR_PLATFORM_EXPORT ZORRep {
 public:
  /// Sets the node's colour, each component 0 to 255 (an alpha of 255 is opaque). Shown as the
  /// inheritance mode says.
  void SetColorRGBA(unsigned int inRed, unsigned int inGreen, unsigned int inBlue,
                    unsigned int inAlpha);
  /// @param inMode a sum of 0x1000 (the node's colour replaces the colours of all below it) and
  ///               0x0004 (it is shown where nothing above imposes one); 0 at first: not shown.
  void SetInheritanceMode(unsigned int inMode);
  /// Ends the node; nodes below it that it does not own stay.
  void Destroy();

#if ZOR_PLATFORM_ADDITIONS
  static constexpr unsigned int kImposeColour = 0x1000;
  static constexpr unsigned int kOwnColour = 0x0004;
  unsigned int GetInheritanceMode() const;
  void GetColorRGBA(unsigned int outColour[4]) const;
#endif

 protected:
  ZORRep();
  virtual ~ZORRep();
  ZORRep(const ZORRep&) = delete;
  ZORRep& operator=(const ZORRep&) = delete;

 private:
  unsigned int colour_[4] = {210, 210, 210, 255};
  unsigned int inheritanceMode_ = 0;
};

#endif
