// Products of a small tree that a test builds by hand.
#ifndef ZOR_TESTS_GENERAL_SERVICES_FAKE_PRODUCT_H
#define ZOR_TESTS_GENERAL_SERVICES_FAKE_PRODUCT_H

#include <memory>
#include <string>
#include <vector>

#include "general_services/FakeComponent.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/product_structure/ZORISpecObject.h"

/// A product that offers ZORIProduct, ZORIAlias and ZORISpecObject, and, once it is given answers,
/// ZORIProductInSession.
class FakeProduct : public FakeComponent {
 public:
  explicit FakeProduct(const char* inAlias) : alias_(inAlias) {
    Offer(ZORBaseUnknown::ClassId(), &product_);
    Offer(ZORIProduct::ClassId(), &product_);
    Offer(ZORIAlias::ClassId(), &aliasFacet_);
    Offer(ZORISpecObject::ClassId(), &specObject_);
  }
  void Add(FakeProduct& ioChild) {
    children.push_back(&ioChild.product_);
    ioChild.father = &specObject_;
  }
  void OfferSession() { Offer(ZORIProductInSession::ClassId(), &session_); }

  ZORIProduct* Product() { return &product_; }
  ZORISpecObject* SpecObject() { return &specObject_; }
  ZORIProductInSession* Session() { return &session_; }

  std::vector<ZORBaseUnknown*> children;  ///< may hold null, and what is no product
  bool hasList = true;                    ///< false: asking for children gives null
  ZORISpecObject* father = nullptr;       ///< null: the root

  // What the session answers, and what it was asked with.
  HRESULT nameResult = S_OK, representationResult = S_OK;
  const char* name = "";
  ZORBaseUnknown* representation = nullptr;
  std::string sessionCalls;

 private:
  class ProductFacet : public FakeFacet<ZORIProduct> {
   public:
    explicit ProductFacet(FakeProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    ZORListValZORBaseUnknown_var* GetChildren(const char* inInterfaceName) override {
      if (!self_.hasList || std::string(inInterfaceName) != "ZORIProduct") return nullptr;
      auto list = std::make_unique<ZORListValZORBaseUnknown_var>();
      for (ZORBaseUnknown* child : self_.children) list->Append(ZORBaseUnknown_var(child));
      return list.release();
    }
    ZORIProduct_var GetFatherProduct() override { return {}; }

   private:
    FakeProduct& self_;
  };
  class AliasFacet : public FakeFacet<ZORIAlias> {
   public:
    explicit AliasFacet(FakeProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    ZORUnicodeString GetAlias() override { return self_.alias_; }

   private:
    FakeProduct& self_;
  };
  class SpecObjectFacet : public FakeFacet<ZORISpecObject> {
   public:
    explicit SpecObjectFacet(FakeProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    ZORISpecObject* GetFather() override {
      if (!self_.father) return nullptr;
      self_.father->AddRef();
      return self_.father;
    }

   private:
    FakeProduct& self_;
  };
  class SessionFacet : public FakeFacet<ZORIProductInSession> {
   public:
    explicit SessionFacet(FakeProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    HRESULT GetRepresentationName(int& outState, int inShown, ZORUnicodeString& outName) override {
      self_.sessionCalls +=
          "name(" + std::to_string(outState) + "," + std::to_string(inShown) + ")";
      outState = 1;
      outName = self_.name;
      return self_.nameResult;
    }
    HRESULT GetRepresentation(int& outState, int inShown, ZORBaseUnknown_var& outRep) override {
      self_.sessionCalls += "rep(" + std::to_string(outState) + "," + std::to_string(inShown) + ")";
      outState = 1;
      outRep = ZORBaseUnknown_var(self_.representation);
      return self_.representationResult;
    }

   private:
    FakeProduct& self_;
  };

  ZORUnicodeString alias_;
  ProductFacet product_{*this};
  AliasFacet aliasFacet_{*this};
  SpecObjectFacet specObject_{*this};
  SessionFacet session_{*this};
};

#endif
