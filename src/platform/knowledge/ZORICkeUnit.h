// A unit of measure.
#ifndef ZOR_PLATFORM_KNOWLEDGE_ZORICKEUNIT_H
#define ZOR_PLATFORM_KNOWLEDGE_ZORICKEUNIT_H

#include "ZORPlatformExport.h"
#include "platform/knowledge/ZORCke.h"
#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORUnicodeString.h"

/// The unit in which a magnitude's values are stored.
class ZOR_PLATFORM_EXPORT ZORICkeUnit : public ZORBaseUnknown {
 public:
  static const IID& ClassId();
  /// Reads a number followed by a unit, such as "0.5m", "25 mm" or "1 inch", as a value in this
  /// unit.
  /// @return ZORCke::False, outValue unchanged, when the text has no number, no unit, or a unit of
  ///         another magnitude.
  virtual ZORCke::Boolean Decode(const ZORUnicodeString& inText, double& outValue) const = 0;
};

typedef ZORInterfaceHandle<ZORICkeUnit> ZORICkeUnit_var;

#endif
