// An interference of a clash result, as a component.
#ifndef ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCE_H
#define ZOR_DEFAULT_PLATFORM_SPACE_ANALYSIS_INTERFERENCE_H

#include <array>
#include <optional>
#include <vector>

#include "default_platform/InterferenceScene.h"
#include "default_platform/space_analysis/InterferenceRep.h"
#include "default_platform/space_analysis/ViewChoice.h"
#include "default_platform/system/InterfaceRegistry.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/space_analysis/ZORISiInterference.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace ZORDefault {

/// Its elements and sub-interferences are the points that differ. Ends with its last reference,
/// sub-interferences' included.
class Interference final : public CountedComponent, private CountedObject<Interference> {
 public:
  static const char* CountedName() { return "Interference"; }

  /// @param inProducts empty where one is missing.
  Interference(const InterferenceGeometry& inGeometry,
               const std::array<ZORIProduct_var, 2>& inProducts, const SceneColour& inMarkerColour);
  Interference(const Interference&) = delete;
  Interference& operator=(const Interference&) = delete;

  ZORBaseUnknown* FindFacet(const IID& inInterface) override;
  ZORMetaClass* GetClass() const override;

  ZORISiInterference* GetInterface() { return &interference_; }
  ZORISpecObject* GetSpecObject() { return &specObject_; }
  /// A new one, for the caller to destroy; null when no flagged element is to be shown.
  ZORRep* MakeRep();
  /// A close view of one point.
  void FillPointViewpoint(std::size_t inPoint, ZOR3DViewpoint& ioViewpoint);

 private:
  struct InterferenceFacet final : Facet<ZORISiInterference, Interference> {
    using Facet::Facet;
    int* GetFlags() override;
    int GetElementCount() override { return static_cast<int>(self_.geometry_.points.size()); }
    void SetFlags(const int* inFlags) override;
    int FillViewpoint(ZOR3DViewpoint* ioViewpoint) override;
    double* GetGeometricResult() override;
    void GetSubInterferences(ZORListValZORISpecObject_var& ioList) override;
    int GetSubInterferenceCount() override { return GetElementCount(); }
  };
  struct GeoVisuFacet final : Facet<ZORI3DGeoVisu, Interference> {
    using Facet::Facet;
    ZORRep* GetRep() override { return self_.MakeRep(); }
  };
  struct SpecObjectFacet final : Facet<ZORISpecObject, Interference> {
    using Facet::Facet;
    ZORISpecObject* GetFather() override { return nullptr; }
  };

  /// Of the stored viewpoint when there is one, else chosen; worked out when it is first needed.
  const ChosenView& GetView();
  ChosenView StoredView() const;

  InterferenceGeometry geometry_;
  std::array<ZORIProduct_var, 2> products_;
  SceneColour markerColour_;
  std::vector<int> flags_;
  std::optional<ChosenView> view_;
  InterferenceFacet interference_;
  GeoVisuFacet geoVisu_;
  SpecObjectFacet specObject_;
};

}  // namespace ZORDefault

#endif
