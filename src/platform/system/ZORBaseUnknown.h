// The base of all components.
#ifndef ZOR_PLATFORM_SYSTEM_ZORBASEUNKNOWN_H
#define ZOR_PLATFORM_SYSTEM_ZORBASEUNKNOWN_H

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORGuid.h"
#include "platform/system/ZORMetaClass.h"
#include "platform/system/ZORResult.h"

/// The base of all components: a reference count that starts at 1, interfaces found by identifier
/// or name, a meta-class. An object on the heap deletes itself when its last reference is released.
/// The order of the virtual operations is fixed: components built against it rely on their slots.
class ZOR_PLATFORM_EXPORT ZORBaseUnknown {
 public:
  ZORBaseUnknown();
  /// A copy is a new object with a reference count of its own, 1.
  ZORBaseUnknown(const ZORBaseUnknown& inOther);
  /// The reference count stays this object's own.
  ZORBaseUnknown& operator=(const ZORBaseUnknown& inOther);

  /// @param outInterface set to the object as that interface, a reference added; null on failure.
  /// @return S_OK, E_NOINTERFACE, or E_INVALIDARG for a null output.
  virtual HRESULT QueryInterface(const IID& inInterface, void** outInterface);
  virtual unsigned int AddRef();   ///< @return the new count
  virtual unsigned int Release();  ///< @return the new count; at 0 the object has been deleted
  // Automation is not offered: the next four answer E_NOTIMPL.
  virtual HRESULT GetTypeInfoCount(unsigned int* outCount);
  virtual HRESULT GetTypeInfo(unsigned int inIndex, unsigned int inLocale, void** outInfo);
  virtual HRESULT GetIDsOfNames(const IID& inReserved, char16_t** inNames, unsigned int inCount,
                                unsigned int inLocale, int* outIds);
  virtual HRESULT Invoke(int inId, const IID& inReserved, unsigned int inLocale,
                         unsigned short inFlags, void* ioParameters, void* outResult,
                         void* outException, unsigned int* outArgument);
  /// As above, by the name of the interface.
  virtual HRESULT QueryInterface(const char* inInterfaceName, void** outInterface);
  virtual ~ZORBaseUnknown();
  virtual ZORMetaClass* GetMetaObject() const;
  virtual const char* IsA() const;  ///< the class's name
  /// @return 1 when the object's class is, or derives from, the named class, else 0.
  virtual int IsAKindOf(const char* inClassName) const;
  /// The object that implements this interface: itself unless SetImpl said otherwise. Borrowed.
  virtual ZORBaseUnknown* GetImpl() const;
  virtual void SetImpl(ZORBaseUnknown* inImplementation);
  virtual int IsNull() const;  ///< 0: an object is there
  /// @return 1 when both are interfaces of one object, else 0.
  virtual int IsEqual(const ZORBaseUnknown* inOther) const;
  /// Called when the component is loaded, activated or put away; this base does nothing.
  /// @return S_OK
  virtual HRESULT ChangeComponentState(int inFrom, int inTo);

  static ZORMetaClass* MetaObject();
  static const IID& ClassId();

#if ZOR_PLATFORM_ADDITIONS
  static const char* ClassName();  ///< "ZORBaseUnknown"
#endif

 private:
  unsigned int referenceCount_;
  ZORBaseUnknown* implementation_;  // null: the object itself
};

#endif
