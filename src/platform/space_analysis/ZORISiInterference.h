// An interference between two products.
#ifndef ZOR_PLATFORM_SPACE_ANALYSIS_ZORISIINTERFERENCE_H
#define ZOR_PLATFORM_SPACE_ANALYSIS_ZORISIINTERFERENCE_H

#include "platform/product_structure/ZORISpecObject.h"
#include "platform/system/ZORInterfaceHandle.h"

class ZOR3DViewpoint;

/// One interference. Its elements are the places where the products meet or come near; each has a
/// flag that says whether it is shown. A component with geometry also offers ZORI3DGeoVisu, which
/// makes a new representation of the flagged elements at each call: the caller destroys it.
class ZOR_PLATFORM_EXPORT ZORISiInterference : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// @return a new array of GetElementCount() + 1 flags, the last one that of the interference as
  ///         a whole, 1 shown and 0 not; the caller deletes it (delete[]). May be null.
  virtual int* GetFlags() = 0;
  /// @return the number of elements, 0 or more.
  virtual int GetElementCount() = 0;
  /// Copies GetElementCount() + 1 flags; null is passed over.
  virtual void SetFlags(const int* inFlags) = 0;
  /// Sets a viewpoint to the stored one.
  /// @return 1 when there is one. Otherwise another number; the viewpoint may then have been turned
  ///         to a direction from which the interference is seen well, and is still to be framed.
  virtual int FillViewpoint(ZOR3DViewpoint* ioViewpoint) = 0;
  /// The coordinates of the elements, x, y and z of each, in millimetres.
  /// @return a new array that the caller deletes (delete[]); null when there is none.
  virtual double* GetGeometricResult() = 0;
  /// Appends the sub-interferences, objects that offer ZORISiSubInterference.
  virtual void GetSubInterferences(ZORListValZORISpecObject_var& ioList) = 0;
  virtual int GetSubInterferenceCount() = 0;
};

typedef ZORInterfaceHandle<ZORISiInterference> ZORISiInterference_var;

#endif
