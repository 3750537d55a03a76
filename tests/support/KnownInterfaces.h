// The interfaces of the platform's objects.
#ifndef ZOR_TESTS_SUPPORT_KNOWN_INTERFACES_H
#define ZOR_TESTS_SUPPORT_KNOWN_INTERFACES_H

#include <gtest/gtest.h>

#include <string>
#include <vector>

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

namespace support {
struct KnownInterface {
  const char* name;
  const IID& identifier;
};
inline const std::vector<KnownInterface>& KnownInterfaces() {
  static const std::vector<KnownInterface> known = {
      {"ZORBaseUnknown", ZORBaseUnknown::ClassId()},
      {"ZORDocument", ZORDocument::ClassId()},
      {"ZORI3DGeoVisu", ZORI3DGeoVisu::ClassId()},
      {"ZORIAlias", ZORIAlias::ClassId()},
      {"ZORICkeMagnitude", ZORICkeMagnitude::ClassId()},
      {"ZORICkeUnit", ZORICkeUnit::ClassId()},
      {"ZORILinkableObject", ZORILinkableObject::ClassId()},
      {"ZORIProduct", ZORIProduct::ClassId()},
      {"ZORIProductInSession", ZORIProductInSession::ClassId()},
      {"ZORIProviders", ZORIProviders::ClassId()},
      {"ZORISiInterference", ZORISiInterference::ClassId()},
      {"ZORISiSubInterference", ZORISiSubInterference::ClassId()},
      {"ZORISpecObject", ZORISpecObject::ClassId()},
      {"ZORIVisProperties", ZORIVisProperties::ClassId()},
  };
  return known;
}

/// The names of the interfaces that an object has by their identifiers. Each is also asked for by
/// its name, which must give the same answer.
inline std::vector<std::string> InterfacesOf(ZORBaseUnknown& ioObject) {
  std::vector<std::string> names;
  for (const KnownInterface& known : KnownInterfaces()) {
    void* byIdentifier = nullptr;
    void* byName = nullptr;
    const HRESULT result = ioObject.QueryInterface(known.identifier, &byIdentifier);
    EXPECT_EQ(ioObject.QueryInterface(known.name, &byName), result) << known.name;
    EXPECT_EQ(byName, byIdentifier) << known.name;
    if (byIdentifier) static_cast<ZORBaseUnknown*>(byIdentifier)->Release();
    if (byName) static_cast<ZORBaseUnknown*>(byName)->Release();
    if (SUCCEEDED(result)) names.push_back(known.name);
  }
  return names;
}
}  // namespace support

#endif
