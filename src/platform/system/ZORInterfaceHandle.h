// Handles of interfaces.
#ifndef ZOR_PLATFORM_SYSTEM_ZORINTERFACEHANDLE_H
#define ZOR_PLATFORM_SYSTEM_ZORINTERFACEHANDLE_H

#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORBaseUnknown.h"
#include "platform/system/ZORErrors.h"

/// A counted reference to a component through one of its interfaces; copied freely; may refer to
/// nothing. A call through an empty handle raises ZORNullVarError. This is the one place where
/// references are counted for users: a handle adds one when it takes an interface and releases it
/// when it lets go. The interface has a static ClassId().
template <class Interface>
class ZORInterfaceHandle {
 public:
  ZORInterfaceHandle() = default;
  /// Takes the interface and adds a reference; the caller keeps its own.
  ZORInterfaceHandle(Interface* inInterface) : interface_(inInterface) { Hold(); }
  ZORInterfaceHandle(const ZORInterfaceHandle& inOther) : interface_(inOther.interface_) { Hold(); }
  ZORInterfaceHandle(ZORInterfaceHandle&& ioOther) noexcept : interface_(ioOther.interface_) {
    ioOther.interface_ = nullptr;
  }
  /// A cast: asks the other handle's component for this interface; empty when it has none.
  template <class Other>
  ZORInterfaceHandle(const ZORInterfaceHandle<Other>& inOther) {
    if (inOther.IsNull()) return;
    void* found = nullptr;
    if (SUCCEEDED(inOther->QueryInterface(Interface::ClassId(), &found)))
      interface_ = static_cast<Interface*>(found);
  }
  ZORInterfaceHandle& operator=(ZORInterfaceHandle inOther) noexcept {
    Interface* mine = interface_;
    interface_ = inOther.interface_;
    inOther.interface_ = mine;
    return *this;
  }
  ~ZORInterfaceHandle() {
    if (interface_) interface_->Release();
  }

  bool IsNull() const { return interface_ == nullptr; }
  /// @return the interface; raises ZORNullVarError when there is none.
  Interface* operator->() const {
    if (!interface_) ThrowErrorNullVar();
    return interface_;
  }

#if ZOR_PLATFORM_ADDITIONS
  bool operator!() const { return IsNull(); }
  /// The interface or null, without a reference added.
  Interface* GetInterface() const { return interface_; }
  friend bool operator==(const ZORInterfaceHandle& inA, const ZORInterfaceHandle& inB) {
    if (!inA.interface_ || !inB.interface_) return inA.interface_ == inB.interface_;
    return inA.interface_->IsEqual(inB.interface_) != 0;
  }
  friend bool operator!=(const ZORInterfaceHandle& inA, const ZORInterfaceHandle& inB) {
    return !(inA == inB);
  }
#endif

 private:
  void Hold() {
    if (interface_) interface_->AddRef();
  }
  Interface* interface_ = nullptr;
};

typedef ZORInterfaceHandle<ZORBaseUnknown> ZORBaseUnknown_var;

#endif
