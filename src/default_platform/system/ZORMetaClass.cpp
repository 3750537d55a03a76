#include "platform/system/ZORMetaClass.h"

#include <map>
#include <mutex>
#include <string_view>

#include "default_platform/system/InterfaceRegistry.h"

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
