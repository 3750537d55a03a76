// Without UDUNITS-2 there are no magnitudes, as when its dictionary cannot be read.
#include "platform/knowledge/ZORParmDictionary.h"

ZORICkeMagnitude_var ZORParmDictionary::FindMagnitude(const ZORUnicodeString& /*inName*/) {
  return ZORICkeMagnitude_var();
}
