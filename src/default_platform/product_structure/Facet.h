// A component that offers several interfaces.
#ifndef ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_FACET_H
#define ZOR_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_FACET_H

#include "platform/system/ZORBaseUnknown.h"

namespace ZORDefault {

/// The object behind a set of facets.
class FacetedComponent {
 public:
  /// The facet that stands for an interface, without a reference added; null when there is none.
  virtual ZORBaseUnknown* FindFacet(const IID& inInterface) = 0;
  virtual ZORMetaClass* GetClass() const = 0;
  virtual unsigned int AddReference() = 0;
  virtual unsigned int ReleaseReference() = 0;

 protected:
  ~FacetedComponent() = default;
};

/// The identifier of the interface of a name; its meta-class is registered at the first call.
const IID& RegisteredInterface(const char* inName);

/// The identifier of a registered interface of the product structure; null for an unknown name.
const IID* FindInterfaceByName(const char* inName);

/// One interface of a component. It is a part of the component's object: its references are the
/// component's, and every facet leads to every other. Facets have their interface as only base, so
/// that a pointer to one is the pointer to the interface.
template <class Interface>
class Facet : public Interface {
 public:
  explicit Facet(FacetedComponent& inOwner) : owner_(&inOwner) {}

  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    if (!outInterface) return E_INVALIDARG;
    *outInterface = owner_->FindFacet(inInterface);
    if (!*outInterface) return E_NOINTERFACE;
    owner_->AddReference();
    return S_OK;
  }
  HRESULT QueryInterface(const char* inInterfaceName, void** outInterface) override {
    if (!outInterface) return E_INVALIDARG;
    *outInterface = nullptr;
    const IID* const known = FindInterfaceByName(inInterfaceName);
    return known ? QueryInterface(*known, outInterface) : E_NOINTERFACE;
  }
  unsigned int AddRef() override { return owner_->AddReference(); }
  unsigned int Release() override { return owner_->ReleaseReference(); }
  ZORMetaClass* GetMetaObject() const override { return owner_->GetClass(); }
  /// The facet that stands for the component's identity.
  ZORBaseUnknown* GetImpl() const override { return owner_->FindFacet(ZORBaseUnknown::ClassId()); }

 private:
  FacetedComponent* owner_;
};

}  // namespace ZORDefault

#endif
