#include "default_platform/system/InterfaceRegistry.h"

#include "foundation/Hash.h"
#include "platform/knowledge/ZORICkeMagnitude.h"
#include "platform/knowledge/ZORICkeUnit.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORILinkableObject.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORIProviders.h"
#include "platform/product_structure/ZORISpecObject.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/space_analysis/ZORISiSubInterference.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"

namespace ZORDefault {

GUID IdentifierOfName(std::string_view inName) {
  const ZORFoundation::Hash128Value hash = ZORFoundation::Hash128Of(inName);
  GUID identifier{};
  identifier.Data1 = static_cast<std::uint32_t>(hash.high >> 32);
  identifier.Data2 = static_cast<std::uint16_t>(hash.high >> 16);
  identifier.Data3 = static_cast<std::uint16_t>(hash.high);
  for (int i = 0; i < 8; ++i)
    identifier.Data4[i] = static_cast<unsigned char>(hash.low >> (56 - 8 * i));
  return identifier;
}

const IID& RegisterInterface(const char* inName, const char* inFramework) {
  return fct_RetrieveMetaObject(inName, kZORTypeInterface, ZORBaseUnknown::MetaObject(), "ZORNull",
                                inFramework, sizeof(ZORBaseUnknown))
      ->GetClassId();
}

}  // namespace ZORDefault

// All interfaces of this platform. They are known by name as soon as the library is loaded.
#define ZOR_REGISTER_INTERFACE(Interface, inFramework)                                      \
  const IID& Interface::ClassId() {                                                         \
    static const IID& identifier = ZORDefault::RegisterInterface(#Interface, #inFramework); \
    return identifier;                                                                      \
  }                                                                                         \
  [[maybe_unused]] static const IID& registered##Interface = Interface::ClassId();

ZOR_REGISTER_INTERFACE(ZORDocument, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORIAlias, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORILinkableObject, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORIProduct, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORIProductInSession, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORIProviders, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORISpecObject, ProductStructure)
ZOR_REGISTER_INTERFACE(ZORISiInterference, SpaceAnalysis)
ZOR_REGISTER_INTERFACE(ZORISiSubInterference, SpaceAnalysis)
ZOR_REGISTER_INTERFACE(ZORI3DGeoVisu, Visualisation)
ZOR_REGISTER_INTERFACE(ZORIVisProperties, Visualisation)
ZOR_REGISTER_INTERFACE(ZORICkeMagnitude, Knowledge)
ZOR_REGISTER_INTERFACE(ZORICkeUnit, Knowledge)
