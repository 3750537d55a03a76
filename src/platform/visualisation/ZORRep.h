// What is shown of an object.
#ifndef ZOR_PLATFORM_VISUALISATION_ZORREP_H
#define ZOR_PLATFORM_VISUALISATION_ZORREP_H

#include "ZORPlatformExport.h"
#include "platform/visualisation/ZOR3DBoundingSphere.h"

/// A node of a scene. Representations are not counted: whoever made one, or was given it by name,
/// calls Destroy; a product's own representation belongs to the product.
class ZOR_PLATFORM_EXPORT ZORRep {
 public:
  /// The colour of all that is below this node takes the place of its own colours.
  static constexpr unsigned int kImposeColour = 0x1000;
  /// The colour of this node is shown where nothing above imposes one.
  static constexpr unsigned int kOwnColour = 0x0004;

  /// Sets the node's colour, each component 0 to 255 (an alpha of 255 is opaque). Shown as the
  /// inheritance mode says.
  void SetColorRGBA(unsigned int inRed, unsigned int inGreen, unsigned int inBlue,
                    unsigned int inAlpha);
  /// @param inMode a sum of the constants above; 0 at first: the node's colour is not shown.
  void SetInheritanceMode(unsigned int inMode);
  unsigned int GetInheritanceMode() const;
  void GetColorRGBA(unsigned int outColour[4]) const;

  /// Ends the node; nodes below it that it does not own stay.
  void Destroy();

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
