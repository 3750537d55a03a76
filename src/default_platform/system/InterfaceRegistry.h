// The component model: interfaces with their names and identifiers, and components that offer
// several.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_INTERFACEREGISTRY_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_INTERFACEREGISTRY_H

#include <string_view>

#include "platform/system/ZORBaseUnknown.h"

namespace ZORDefault {

/// The identifier of the class or interface of a name: the same on every run and machine, since it
/// is the name's 128-bit hash, most significant byte first.
ZOR_PLATFORM_EXPORT GUID IdentifierOfName(std::string_view inName);

/// Registers an interface under a name. @return its identifier.
ZOR_PLATFORM_EXPORT const IID& RegisterInterface(const char* inName, const char* inFramework);

/// The identifier of a registered interface; null for an unknown name.
ZOR_PLATFORM_EXPORT const IID* FindInterface(const char* inName);

/// An object that offers its interfaces as facets.
class FacetedComponent {
 public:
  /// The facet that is an interface, without a reference added; null when there is none.
  virtual ZORBaseUnknown* FindFacet(const IID& inInterface) = 0;
  virtual ZORMetaClass* GetClass() const = 0;
  virtual unsigned int AddReference() = 0;
  virtual unsigned int ReleaseReference() = 0;

 protected:
  ~FacetedComponent() = default;
};

/// One that is made without a reference and ends with its last.
class CountedComponent : public FacetedComponent {
 public:
  unsigned int AddReference() final { return ++referenceCount_; }
  unsigned int ReleaseReference() final {
    const unsigned int left = --referenceCount_;
    if (left == 0) delete this;
    return left;
  }

 protected:
  virtual ~CountedComponent() = default;

 private:
  unsigned int referenceCount_ = 0;
};

/// One interface of a component. It is a part of the component's object: its references are the
/// component's, and every facet leads to every other, by identifier and by name. Facets have their
/// interface as only base, so that a pointer to one is the pointer to the interface.
/// @tparam Owner the component's own class.
template <class Interface, class Owner = FacetedComponent>
class Facet : public Interface {
 public:
  explicit Facet(Owner& inOwner) : self_(inOwner) {}

  using Interface::QueryInterface;  // by name
  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    if (!outInterface) return E_INVALIDARG;
    *outInterface = self_.FindFacet(inInterface);
    if (!*outInterface) return E_NOINTERFACE;
    self_.AddReference();
    return S_OK;
  }
  unsigned int AddRef() override { return self_.AddReference(); }
  unsigned int Release() override { return self_.ReleaseReference(); }
  ZORMetaClass* GetMetaObject() const override { return self_.GetClass(); }
  /// The facet that is the component's identity.
  ZORBaseUnknown* GetImpl() const override { return self_.FindFacet(ZORBaseUnknown::ClassId()); }

 protected:
  Owner& self_;
};

}  // namespace ZORDefault

#endif
