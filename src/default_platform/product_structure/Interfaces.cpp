// The identifiers of the interfaces of the product structure.
#include <cstring>

#include "default_platform/product_structure/Facet.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"

namespace ZORDefault {

const IID& RegisteredInterface(const char* inName) {
  return fct_RetrieveMetaObject(inName, kZORTypeInterface, ZORBaseUnknown::MetaObject(), "ZORNull",
                                "ProductStructure", sizeof(ZORBaseUnknown))
      ->GetClassId();
}

const IID* FindInterfaceByName(const char* inName) {
  struct Known {
    const char* name;
    const IID& identifier;
  };
  static const Known kKnown[] = {
      {"ZORBaseUnknown", ZORBaseUnknown::ClassId()},
      {"ZORDocument", ZORDocument::ClassId()},
      {"ZORIAlias", ZORIAlias::ClassId()},
      {"ZORILinkableObject", ZORILinkableObject::ClassId()},
      {"ZORIProduct", ZORIProduct::ClassId()},
      {"ZORIProductInSession", ZORIProductInSession::ClassId()},
      {"ZORIProviders", ZORIProviders::ClassId()},
      {"ZORISpecObject", ZORISpecObject::ClassId()},
      {"ZORI3DGeoVisu", ZORI3DGeoVisu::ClassId()},
      {"ZORIVisProperties", ZORIVisProperties::ClassId()},
  };
  if (!inName) return nullptr;
  for (const Known& known : kKnown)
    if (std::strcmp(known.name, inName) == 0) return &known.identifier;
  return nullptr;
}

}  // namespace ZORDefault

using ZORDefault::RegisteredInterface;

const IID& ZORDocument::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORDocument");
  return identifier;
}

const IID& ZORIAlias::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORIAlias");
  return identifier;
}

const IID& ZORILinkableObject::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORILinkableObject");
  return identifier;
}

const IID& ZORIProduct::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORIProduct");
  return identifier;
}

const IID& ZORIProductInSession::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORIProductInSession");
  return identifier;
}

const IID& ZORIProviders::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORIProviders");
  return identifier;
}

const IID& ZORISpecObject::ClassId() {
  static const IID& identifier = RegisteredInterface("ZORISpecObject");
  return identifier;
}
