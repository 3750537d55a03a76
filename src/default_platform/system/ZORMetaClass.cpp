#include "platform/system/ZORMetaClass.h"

#include <map>
#include <mutex>
#include <string_view>

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

/// All meta-classes of the process, by class name. Never destroyed: classes keep pointers to theirs
/// until the very end.
class ZORMetaClassRegistry {
 public:
  static ZORMetaClassRegistry& Instance() {
    static auto* const registry = new ZORMetaClassRegistry();
    return *registry;
  }

  ZORMetaClass* Retrieve(const char* inClassName, ZORTypeOfClass inType, const ZORMetaClass* inBase,
                         const char* inExtendedClass, const char* inFramework,
                         unsigned int inInstanceSize) {
    const std::lock_guard lock(mutex_);
    const auto known = classes_.find(std::string_view(inClassName));
    if (known != classes_.end()) return known->second;
    auto* const made = new ZORMetaClass();
    made->name_ = inClassName;
    made->type_ = inType;
    made->base_ = inBase;
    made->extendedClass_ = inExtendedClass ? inExtendedClass : "ZORNull";
    made->framework_ = inFramework ? inFramework : "";
    made->instanceSize_ = inInstanceSize;
    made->classId_ = ZORDefault::IdentifierOfName(inClassName);
    return classes_[made->name_] = made;
  }

  /// @return null for an unknown name.
  ZORMetaClass* Find(std::string_view inName) {
    const std::lock_guard lock(mutex_);
    const auto known = classes_.find(inName);
    return known == classes_.end() ? nullptr : known->second;
  }

 private:
  std::mutex mutex_;
  std::map<std::string, ZORMetaClass*, std::less<>> classes_;
};

const char* ZORMetaClass::IsA() const { return name_.c_str(); }
const ZORMetaClass* ZORMetaClass::GetBase() const { return base_; }
ZORTypeOfClass ZORMetaClass::GetTypeOfClass() const { return type_; }
const char* ZORMetaClass::GetExtendedClass() const { return extendedClass_.c_str(); }
const char* ZORMetaClass::GetFramework() const { return framework_.c_str(); }
unsigned int ZORMetaClass::GetInstanceSize() const { return instanceSize_; }
const CLSID& ZORMetaClass::GetClassId() const { return classId_; }

int ZORMetaClass::IsAKindOf(const char* inClassName) const {
  if (!inClassName) return 0;
  for (const ZORMetaClass* meta = this; meta; meta = meta->base_)
    if (meta->name_ == inClassName) return 1;
  return 0;
}

const IID* ZORDefault::FindInterface(const char* inName) {
  const ZORMetaClass* const meta = inName ? ZORMetaClassRegistry::Instance().Find(inName) : nullptr;
  const bool isInterface =
      meta == ZORBaseUnknown::MetaObject() || (meta && meta->GetTypeOfClass() == kZORTypeInterface);
  return isInterface ? &meta->GetClassId() : nullptr;
}

ZORMetaClass* fct_RetrieveMetaObject(const char* inClassName, ZORTypeOfClass inType,
                                     const ZORMetaClass* inBase, const char* inExtendedClass,
                                     const char* inFramework, unsigned int inInstanceSize) {
  if (!inClassName || !*inClassName) return nullptr;
  return ZORMetaClassRegistry::Instance().Retrieve(inClassName, inType, inBase, inExtendedClass,
                                                   inFramework, inInstanceSize);
}

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
