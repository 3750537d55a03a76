// What the component model knows about a class.
#ifndef ZOR_PLATFORM_SYSTEM_ZORMETACLASS_H
#define ZOR_PLATFORM_SYSTEM_ZORMETACLASS_H

#include <string>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORGuid.h"

/// What kind of class a meta-class describes. Class type 1 is a class that implements.
enum ZORTypeOfClass { kZORTypeInterface = 0, kZORTypeImplementation = 1, kZORTypeExtension = 2 };

/// The meta-class of one class: its name, kind, base, identifier. The registry's; never deleted by
/// callers.
class ZOR_PLATFORM_EXPORT ZORMetaClass {
 public:
  /// An identifier made from the class's name: the same on every run and machine.
  const CLSID& GetClassId() const;
  /// @return 1 when the class is, or derives from, the named class, else 0 (also for null).
  int IsAKindOf(const char* inClassName) const;

#if ZOR_PLATFORM_ADDITIONS
  const char* IsA() const;              ///< the class's name
  const ZORMetaClass* GetBase() const;  ///< null for the root of all classes
  ZORTypeOfClass GetTypeOfClass() const;
  const char* GetExtendedClass() const;  ///< "ZORNull" when the class extends none
  const char* GetFramework() const;      ///< the framework that owns the class
  unsigned int GetInstanceSize() const;  ///< bytes of one object
#endif

 private:
  friend class ZORMetaClassRegistry;
  ZORMetaClass() = default;
  std::string name_;
  const ZORMetaClass* base_ = nullptr;
  ZORTypeOfClass type_ = kZORTypeImplementation;
  std::string extendedClass_;
  std::string framework_;
  unsigned int instanceSize_ = 0;
  CLSID classId_{};
};

/// Gives the meta-class of a class, made at the first call with its name; later calls give the same
/// one.
/// @param inBase meta-class of the base class, or null for a root.
/// @return null for a class without name.
ZOR_PLATFORM_EXPORT ZORMetaClass* fct_RetrieveMetaObject(
    const char* inClassName, ZORTypeOfClass inType, const ZORMetaClass* inBase,
    const char* inExtendedClass, const char* inFramework, unsigned int inInstanceSize);

#endif
