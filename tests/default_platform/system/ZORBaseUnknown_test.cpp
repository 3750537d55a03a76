#include "platform/system/ZORBaseUnknown.h"

#include <gtest/gtest.h>

#include <cstring>

#include "default_platform/system/ObjectCounters.h"
#include "platform/system/ZORInterfaceHandle.h"

namespace {

constexpr IID kPaintId = {1, 2, 3, {4, 5, 6, 7, 8, 9, 10, 11}};

// A component with an interface of its own.
class Paint : public ZORBaseUnknown, private ZORDefault::CountedObject<Paint> {
 public:
  static const char* CountedName() { return "Paint"; }
  static const IID& ClassId() { return kPaintId; }
  using ZORBaseUnknown::QueryInterface;
  HRESULT QueryInterface(const IID& inInterface, void** outInterface) override {
    if (inInterface != kPaintId) return ZORBaseUnknown::QueryInterface(inInterface, outInterface);
    AddRef();
    *outInterface = this;
    return S_OK;
  }
  ZORMetaClass* GetMetaObject() const override {
    return fct_RetrieveMetaObject("Paint", kZORTypeImplementation, ZORBaseUnknown::MetaObject(),
                                  "ZORNull", "Tests", sizeof(Paint));
  }
};

unsigned int ReferencesOf(ZORBaseUnknown* inComponent) {
  inComponent->AddRef();
  return inComponent->Release();
}

int AlivePaints() {
  const ZORDefault::ObjectCounts counts = ZORDefault::CountsOf("Paint");
  return static_cast<int>(counts.built - counts.released);
}

}  // namespace

TEST(ZORBaseUnknown, ReferencesStartAtOneAndTheLastDeletes) {
  ZORBaseUnknown* const component = new Paint();
  EXPECT_EQ(AlivePaints(), 1);
  EXPECT_EQ(component->AddRef(), 2u);
  EXPECT_EQ(component->Release(), 1u);
  EXPECT_EQ(component->Release(), 0u);
  EXPECT_EQ(AlivePaints(), 0);
}

TEST(ZORBaseUnknown, CopyCountsItsOwnReferences) {
  Paint first;
  first.AddRef();
  Paint second(first);
  EXPECT_EQ(ReferencesOf(&second), 1u);
  second = first;
  EXPECT_EQ(ReferencesOf(&second), 1u);
  EXPECT_EQ(ReferencesOf(&first), 2u);
  EXPECT_EQ(AlivePaints(), 2);
}

TEST(ZORBaseUnknown, QueryInterfaceFindsTheBaseByIdentifierAndName) {
  ZORBaseUnknown component;
  void* found = nullptr;
  EXPECT_EQ(component.QueryInterface(ZORBaseUnknown::ClassId(), &found), S_OK);
  EXPECT_EQ(found, &component);
  found = nullptr;
  EXPECT_EQ(component.QueryInterface("ZORBaseUnknown", &found), S_OK);
  EXPECT_EQ(found, &component);
  EXPECT_EQ(ReferencesOf(&component), 3u);
}

TEST(ZORBaseUnknown, QueryInterfaceOfAnotherFailsWithNull) {
  ZORBaseUnknown component;
  void* found = &component;
  EXPECT_EQ(component.QueryInterface(kPaintId, &found), E_NOINTERFACE);
  EXPECT_EQ(found, nullptr);
  found = &component;
  EXPECT_EQ(component.QueryInterface("Paint", &found), E_NOINTERFACE);
  EXPECT_EQ(found, nullptr);
  EXPECT_EQ(component.QueryInterface(static_cast<const char*>(nullptr), &found), E_NOINTERFACE);
  EXPECT_EQ(ReferencesOf(&component), 1u);
}

TEST(ZORBaseUnknown, QueryInterfaceRefusesANullOutput) {
  ZORBaseUnknown component;
  EXPECT_EQ(component.QueryInterface(ZORBaseUnknown::ClassId(), nullptr), E_INVALIDARG);
  EXPECT_EQ(component.QueryInterface("ZORBaseUnknown", nullptr), E_INVALIDARG);
}

TEST(ZORBaseUnknown, AutomationIsNotImplemented) {
  ZORBaseUnknown component;
  EXPECT_EQ(component.GetTypeInfoCount(nullptr), E_NOTIMPL);
  EXPECT_EQ(component.GetTypeInfo(0, 0, nullptr), E_NOTIMPL);
  EXPECT_EQ(component.GetIDsOfNames(kPaintId, nullptr, 0, 0, nullptr), E_NOTIMPL);
  EXPECT_EQ(component.Invoke(0, kPaintId, 0, 0, nullptr, nullptr, nullptr, nullptr), E_NOTIMPL);
}

TEST(ZORBaseUnknown, ClassIsReported) {
  ZORBaseUnknown component;
  EXPECT_STREQ(component.IsA(), "ZORBaseUnknown");
  EXPECT_STREQ(ZORBaseUnknown::ClassName(), "ZORBaseUnknown");
  EXPECT_EQ(component.GetMetaObject(), ZORBaseUnknown::MetaObject());
  EXPECT_EQ(component.IsAKindOf("ZORBaseUnknown"), 1);
  EXPECT_EQ(component.IsAKindOf("Paint"), 0);
  EXPECT_EQ(component.IsAKindOf(nullptr), 0);
}

TEST(ZORBaseUnknown, DerivedClassIsAlsoItsBase) {
  Paint paint;
  EXPECT_STREQ(paint.IsA(), "Paint");
  EXPECT_EQ(paint.IsAKindOf("Paint"), 1);
  EXPECT_EQ(paint.IsAKindOf("ZORBaseUnknown"), 1);
}

TEST(ZORBaseUnknown, ImplementsItselfUnlessSetOtherwise) {
  ZORBaseUnknown first, second;
  EXPECT_EQ(first.GetImpl(), &first);
  EXPECT_EQ(first.IsEqual(&first), 1);
  EXPECT_EQ(first.IsEqual(&second), 0);
  EXPECT_EQ(first.IsEqual(nullptr), 0);
  second.SetImpl(&first);
  EXPECT_EQ(second.GetImpl(), &first);
  EXPECT_EQ(second.IsEqual(&first), 1);
  second.SetImpl(nullptr);
  EXPECT_EQ(second.GetImpl(), &second);
}

TEST(ZORBaseUnknown, IsNotNullAndAcceptsStateChanges) {
  ZORBaseUnknown component;
  EXPECT_EQ(component.IsNull(), 0);
  EXPECT_EQ(component.ChangeComponentState(0, 1), S_OK);
}

namespace {

// The n-th virtual operation of an object, as components built against the base call it.
using AnyOperation = void (*)();
AnyOperation Slot(const void* inObject, int inSlot) {
  const AnyOperation* table;
  std::memcpy(&table, inObject, sizeof(table));
  return table[inSlot];
}

// Overrides operations one at a time, to see which slot changes.
struct CountsReferences : ZORBaseUnknown {
  unsigned int AddRef() override { return 1; }
};
struct CallsByName : ZORBaseUnknown {
  using ZORBaseUnknown::QueryInterface;
  HRESULT QueryInterface(const char*, void**) override { return E_FAIL; }
};
struct ReportsItsMeta : ZORBaseUnknown {
  ZORMetaClass* GetMetaObject() const override { return nullptr; }
};
struct ChangesState : ZORBaseUnknown {
  HRESULT ChangeComponentState(int, int) override { return E_FAIL; }
};

// The only slot, destructors apart, that differs from the base's.
template <class Component>
int OverriddenSlot() {
  ZORBaseUnknown base;
  Component component;
  int overridden = -1;
  for (int slot = 0; slot < 18; ++slot) {
    const bool isDestructor = slot == 8 || slot == 9;  // this system's tables have two of them
    if (isDestructor || Slot(&base, slot) == Slot(&component, slot)) continue;
    EXPECT_EQ(overridden, -1) << "more than one slot differs";
    overridden = slot;
  }
  return overridden;
}

}  // namespace

TEST(ZORBaseUnknown, SlotsAreInTheirFixedOrder) {
  EXPECT_EQ(OverriddenSlot<CountsReferences>(), 1);
  EXPECT_EQ(OverriddenSlot<CallsByName>(), 7);
  EXPECT_EQ(OverriddenSlot<ReportsItsMeta>(), 10);
  EXPECT_EQ(OverriddenSlot<ChangesState>(), 17);
}

TEST(ZORInterfaceHandle, HoldsAndReleases) {
  auto* const paint = new Paint();
  {
    const ZORInterfaceHandle<Paint> handle(paint);
    const ZORInterfaceHandle<Paint> copy(handle);
    EXPECT_EQ(ReferencesOf(paint), 3u);
    EXPECT_TRUE(handle == copy);
    EXPECT_EQ(copy.GetInterface(), paint);
  }
  EXPECT_EQ(paint->Release(), 0u);
  EXPECT_EQ(AlivePaints(), 0);
}

TEST(ZORInterfaceHandle, CastAsksTheComponent) {
  ZORBaseUnknown_var base(new Paint());
  base->Release();
  const ZORInterfaceHandle<Paint> paint(base);
  EXPECT_FALSE(paint.IsNull());
  EXPECT_EQ(ReferencesOf(base.GetInterface()), 2u);
  ZORBaseUnknown_var other(new ZORBaseUnknown());
  other->Release();
  EXPECT_TRUE(ZORInterfaceHandle<Paint>(other).IsNull());
}

TEST(ZORInterfaceHandle, EmptyHandleRaisesOnCalls) {
  const ZORBaseUnknown_var handle;
  EXPECT_TRUE(handle.IsNull());
  EXPECT_TRUE(!handle);
  EXPECT_TRUE(handle == ZORBaseUnknown_var());
  EXPECT_THROW(handle->AddRef(), ZORNullVarError);
  EXPECT_TRUE(ZORInterfaceHandle<Paint>(handle).IsNull());
}

TEST(ZORErrors, NullVarErrorNamesItsCause) {
  try {
    ThrowErrorNullVar();
    FAIL() << "nothing was raised";
  } catch (const ZORNullVarError& error) {
    EXPECT_NE(std::string(error.what()).find("ThrowErrorNullVar"), std::string::npos);
  }
}

TEST(ZORErrors, FatalErrorKeepsItsMessage) {
  EXPECT_STREQ(ZORFatalError("AssertionFailed:x").what(), "AssertionFailed:x");
}

TEST(ObjectCounters, CountCopiesAndReleases) {
  const ZORDefault::ObjectCounts before = ZORDefault::CountsOf("Paint");
  {
    Paint first;
    Paint second(first);
  }
  const ZORDefault::ObjectCounts after = ZORDefault::CountsOf("Paint");
  EXPECT_EQ(after.built - before.built, 2);
  EXPECT_EQ(after.released - before.released, 2);
}

TEST(ObjectCounters, UnknownClassHasZeros) {
  EXPECT_EQ(ZORDefault::CountsOf("NoSuchClass").built, 0);
  EXPECT_EQ(ZORDefault::CountsOf("NoSuchClass").released, 0);
}
