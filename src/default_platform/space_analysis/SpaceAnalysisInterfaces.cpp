// The identifiers of the interfaces of space analysis.
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/space_analysis/ZORISiSubInterference.h"

namespace {

const IID& RegisteredInterface(const char* inName) {
  return fct_RetrieveMetaObject(inName, kZORTypeInterface, ZORBaseUnknown::MetaObject(), "ZORNull",
                                "SpaceAnalysis", sizeof(ZORBaseUnknown))
      ->GetClassId();
}

}  // namespace

const IID& ZORISiInterference::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORISiInterference");
  return identifier;
}

const IID& ZORISiSubInterference::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORISiSubInterference");
  return identifier;
}
