// Products and interferences of a test.
#ifndef ZOR_TESTS_PICTURES_FAKE_OBJECTS_H
#define ZOR_TESTS_PICTURES_FAKE_OBJECTS_H

#include <algorithm>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "general_services/FakeComponent.h"
#include "pictures/RecordedPlatform.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/space_analysis/ZORISiSubInterference.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"

/// A product whose representation the builder finds by its name. It offers ZORIProduct,
/// ZORI3DGeoVisu and ZORIVisProperties, without a colour at first.
class PictureProduct : public FakeComponent {
 public:
  explicit PictureProduct(const std::string& inName, PictureProduct* inFather = nullptr)
      : rep(new NamedRep(inName)), name_(inName), father_(inFather) {
    Offer(ZORBaseUnknown::ClassId(), &product_);
    Offer(ZORIProduct::ClassId(), &product_);
    Offer(ZORI3DGeoVisu::ClassId(), &geoVisu_);
    Offer(ZORIVisProperties::ClassId(), &visProperties_);
  }
  ~PictureProduct() { rep->Destroy(); }
  ZORIProduct_var Handle() { return ZORIProduct_var(&product_); }
  void SetColour(unsigned int inRed, unsigned int inGreen, unsigned int inBlue, bool inIsImposed) {
    values.SetColor(inRed, inGreen, inBlue);
    values.SetInheritance(ZORVisPropertiesValues::kColour, inIsImposed ? 1 : 0);
  }
  /// The colour and inheritance mode of the representation, such as "1,2,3,255 0x1004".
  std::string ShownColour() const {
    unsigned int colour[4];
    rep->GetColorRGBA(colour);
    char text[64];
    std::snprintf(text, sizeof text, "%u,%u,%u,%u 0x%x", colour[0], colour[1], colour[2], colour[3],
                  rep->GetInheritanceMode());
    return text;
  }

  NamedRep* rep;
  ZORVisPropertiesValues values;
  HRESULT valuesResult = S_OK;

 private:
  class ProductFacet : public FakeFacet<ZORIProduct> {
   public:
    explicit ProductFacet(PictureProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    ZORListValZORBaseUnknown_var* GetChildren(const char*) override { return nullptr; }
    ZORIProduct_var GetFatherProduct() override {
      return self_.father_ ? self_.father_->Handle() : ZORIProduct_var();
    }

   private:
    PictureProduct& self_;
  };
  class GeoVisuFacet : public FakeFacet<ZORI3DGeoVisu> {
   public:
    using FakeFacet::FakeFacet;
    ZORRep* GetRep() override { return nullptr; }  // found by path, not here
  };
  class VisPropertiesFacet : public FakeFacet<ZORIVisProperties> {
   public:
    explicit VisPropertiesFacet(PictureProduct& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    HRESULT GetPropertiesAtt(ZORVisPropertiesValues& outValues, int inProperties, int inGeometry,
                             int inReserved, int inAlsoReserved) override {
      recorded.Note("properties of " + self_.name_ + " " + std::to_string(inProperties) + "," +
                    std::to_string(inGeometry) + "," + std::to_string(inReserved) + "," +
                    std::to_string(inAlsoReserved));
      outValues = self_.values;
      return self_.valuesResult;
    }
    HRESULT SetPropertiesAtt(const ZORVisPropertiesValues&) override { return E_FAIL; }

   private:
    PictureProduct& self_;
  };

  std::string name_;
  PictureProduct* father_;
  ProductFacet product_{*this};
  GeoVisuFacet geoVisu_{*this};
  VisPropertiesFacet visProperties_{*this};
};

/// A sub-interference that stands at (number, 0, 0), when it has a viewpoint.
class FakeSubInterference : public FakeComponent {
 public:
  explicit FakeSubInterference(int inAnswer) : answer(inAnswer) {
    Offer(ZORISpecObject::ClassId(), &specObject_);
    Offer(ZORISiSubInterference::ClassId(), &subInterference_);
  }
  ZORISpecObject* SpecObject() { return &specObject_; }
  int answer;
  ZORMathVector eye;

 private:
  class SpecObjectFacet : public FakeFacet<ZORISpecObject> {
   public:
    using FakeFacet::FakeFacet;
    ZORISpecObject* GetFather() override { return nullptr; }
  };
  class SubInterferenceFacet : public FakeFacet<ZORISiSubInterference> {
   public:
    explicit SubInterferenceFacet(FakeSubInterference& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    int FillViewpoint(ZOR3DViewpoint* ioViewpoint) override {
      ioViewpoint->origin = self_.eye;
      return self_.answer;
    }

   private:
    FakeSubInterference& self_;
  };

  SpecObjectFacet specObject_{*this};
  SubInterferenceFacet subInterference_{*this};
};

/// An interference of two elements, shown as "clash", with geometry and without a viewpoint.
class FakeInterference : public FakeComponent {
 public:
  FakeInterference() {
    Offer(ZORISiInterference::ClassId(), &interference_);
    Offer(ZORI3DGeoVisu::ClassId(), &geoVisu_);
  }
  ZORISiInterference_var Handle() { return ZORISiInterference_var(&interference_); }

  std::vector<int> flags = {0, 1, 0};
  const int* givenFlags = nullptr;         ///< the last array of SetFlags
  std::function<void()> onFlags;           ///< called by each SetFlags
  std::function<void()> onRepresentation;  ///< called when it is asked for
  int viewpointAnswer = 0;
  bool hasGeometry = true;
  bool hasRep = true;
  bool failsToAnswer = false;
  double radius = 1;
  std::vector<FakeSubInterference*> parts;
  std::optional<int> partCount;  // when it is not that of the list

 private:
  class InterferenceFacet : public FakeFacet<ZORISiInterference> {
   public:
    explicit InterferenceFacet(FakeInterference& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    int* GetFlags() override {
      recorded.Note("flags");
      int* const copy = new int[self_.flags.size()];
      std::ranges::copy(self_.flags, copy);
      return copy;
    }
    int GetElementCount() override { return static_cast<int>(self_.flags.size()) - 1; }
    void SetFlags(const int* inFlags) override {
      self_.givenFlags = inFlags;
      if (self_.onFlags) self_.onFlags();
      std::copy_n(inFlags, self_.flags.size(), self_.flags.begin());
      std::string text = "set flags";
      for (const int flag : self_.flags) text += " " + std::to_string(flag);
      recorded.Note(text);
    }
    int FillViewpoint(ZOR3DViewpoint* ioViewpoint) override {
      if (self_.failsToAnswer) ThrowErrorNullVar();
      ioViewpoint->origin = {1, 2, 3};
      return self_.viewpointAnswer;
    }
    double* GetGeometricResult() override { return self_.hasGeometry ? new double[3]{} : nullptr; }
    void GetSubInterferences(ZORListValZORISpecObject_var& ioList) override {
      for (FakeSubInterference* const part : self_.parts)
        ioList.Append(part ? ZORISpecObject_var(part->SpecObject()) : ZORISpecObject_var());
    }
    int GetSubInterferenceCount() override {
      return self_.partCount.value_or(static_cast<int>(self_.parts.size()));
    }

   private:
    FakeInterference& self_;
  };
  class GeoVisuFacet : public FakeFacet<ZORI3DGeoVisu> {
   public:
    explicit GeoVisuFacet(FakeInterference& inSelf) : FakeFacet(inSelf), self_(inSelf) {}
    ZORRep* GetRep() override {
      recorded.Note("representation");
      if (self_.onRepresentation) self_.onRepresentation();
      return self_.hasRep ? new NamedRep("clash", self_.radius) : nullptr;
    }

   private:
    FakeInterference& self_;
  };

  InterferenceFacet interference_{*this};
  GeoVisuFacet geoVisu_{*this};
};

#endif
