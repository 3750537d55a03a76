#include "platform/system/ZORBaseUnknown.h"

#include <map>
#include <mutex>
#include <string>

#include "default_platform/system/InterfaceRegistry.h"
#include "default_platform/system/ObjectCounters.h"
#include "platform/system/ZORErrors.h"

ZORBaseUnknown::ZORBaseUnknown() : referenceCount_(1), implementation_(nullptr) {}

ZORBaseUnknown::ZORBaseUnknown(const ZORBaseUnknown&) : ZORBaseUnknown() {}

ZORBaseUnknown& ZORBaseUnknown::operator=(const ZORBaseUnknown&) { return *this; }

ZORBaseUnknown::~ZORBaseUnknown() = default;

HRESULT ZORBaseUnknown::QueryInterface(const IID& inInterface, void** outInterface) {
  if (!outInterface) return E_INVALIDARG;
  *outInterface = nullptr;
  if (inInterface != ClassId()) return E_NOINTERFACE;
  AddRef();
  *outInterface = this;
  return S_OK;
}

// Identifiers are made from names, so an interface offered by one is offered by the other too.
HRESULT ZORBaseUnknown::QueryInterface(const char* inInterfaceName, void** outInterface) {
  if (inInterfaceName)
    return QueryInterface(ZORDefault::IdentifierOfName(inInterfaceName), outInterface);
  if (outInterface) *outInterface = nullptr;
  return outInterface ? E_NOINTERFACE : E_INVALIDARG;
}

unsigned int ZORBaseUnknown::AddRef() { return ++referenceCount_; }

unsigned int ZORBaseUnknown::Release() {
  const unsigned int left = --referenceCount_;
  if (left == 0) delete this;
  return left;
}

HRESULT ZORBaseUnknown::GetTypeInfoCount(unsigned int*) { return E_NOTIMPL; }
HRESULT ZORBaseUnknown::GetTypeInfo(unsigned int, unsigned int, void**) { return E_NOTIMPL; }
HRESULT ZORBaseUnknown::GetIDsOfNames(const IID&, char16_t**, unsigned int, unsigned int, int*) {
  return E_NOTIMPL;
}
HRESULT ZORBaseUnknown::Invoke(int, const IID&, unsigned int, unsigned short, void*, void*, void*,
                               unsigned int*) {
  return E_NOTIMPL;
}

ZORMetaClass* ZORBaseUnknown::GetMetaObject() const { return MetaObject(); }

const char* ZORBaseUnknown::IsA() const { return GetMetaObject()->IsA(); }

int ZORBaseUnknown::IsAKindOf(const char* inClassName) const {
  return GetMetaObject()->IsAKindOf(inClassName);
}

ZORBaseUnknown* ZORBaseUnknown::GetImpl() const {
  return implementation_ ? implementation_ : const_cast<ZORBaseUnknown*>(this);
}

void ZORBaseUnknown::SetImpl(ZORBaseUnknown* inImplementation) {
  implementation_ = inImplementation;
}

int ZORBaseUnknown::IsNull() const { return 0; }

int ZORBaseUnknown::IsEqual(const ZORBaseUnknown* inOther) const {
  return inOther && GetImpl() == inOther->GetImpl() ? 1 : 0;
}

HRESULT ZORBaseUnknown::ChangeComponentState(int, int) { return S_OK; }

ZORMetaClass* ZORBaseUnknown::MetaObject() {
  static ZORMetaClass* const meta =
      fct_RetrieveMetaObject("ZORBaseUnknown", kZORTypeImplementation, nullptr, "ZORNull", "System",
                             sizeof(ZORBaseUnknown));
  return meta;
}

const char* ZORBaseUnknown::ClassName() { return MetaObject()->IsA(); }
const IID& ZORBaseUnknown::ClassId() { return MetaObject()->GetClassId(); }

namespace ZORDefault {

ObjectCounter& CounterOf(const char* inClassName) {
  // Never destroyed: objects are released until the very end of the process.
  static auto* const counters = new std::map<std::string, ObjectCounter, std::less<>>();
  static std::mutex mutex;
  const std::lock_guard lock(mutex);
  return (*counters)[inClassName];
}

ObjectCounts CountsOf(const char* inClassName) {
  const ObjectCounter& counter = CounterOf(inClassName);
  return {counter.built, counter.released};
}

}  // namespace ZORDefault
