#include "PrintPictures.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <vector>

#include "BuildPath.h"
#include "RepCapture.h"
#include "pictures/ProductList.h"
#include "platform/space_analysis/ZORISiSubInterference.h"
#include "platform/system/ZORGetEnv.h"
#include "platform/system/ZORSysSettingRepository.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "platform/visualisation/ZORIVisProperties.h"
#include "platform/visualisation/ZORLyraRepPathBuilder.h"

namespace {

constexpr int kLoadedOnly = 0;
constexpr unsigned int kImposedColour = 0x1004;
constexpr unsigned int kOpaque = 255;
constexpr int kAllProperties = 11;
constexpr int kWholeGeometry = 5;
constexpr int kColourProperty = 0;

/// A viewpoint for as long as it is needed.
class OwnViewpoint {
 public:
  OwnViewpoint() = default;
  ~OwnViewpoint() { viewpoint_->Release(); }
  OwnViewpoint(const OwnViewpoint&) = delete;
  OwnViewpoint& operator=(const OwnViewpoint&) = delete;
  ZOR3DViewpoint* Get() const { return viewpoint_; }
  ZOR3DViewpoint* operator->() const { return viewpoint_; }

 private:
  ZOR3DViewpoint* const viewpoint_ = new ZOR3DViewpoint;
};

/// The representation of an interference with all its elements shown.
ZORRep* TakeInterferenceRep(const ZORISiInterference_var& inInterference) {
  int* const savedFlags = inInterference->GetFlags();
  const int count = std::max(inInterference->GetElementCount(), 0);
  const std::vector<int> allShown(static_cast<std::size_t>(count) + 1, 1);
  inInterference->SetFlags(allShown.data());
  const ZORI3DGeoVisu_var visualised = inInterference;
  if (visualised.IsNull()) return nullptr;  // the saved flags are neither given back nor freed
  ZORRep* const rep = visualised->GetRep();
  inInterference->SetFlags(savedFlags);
  delete[] savedFlags;
  return rep;
}

bool FramesInterferenceAlone() {
  int zoom = 0;
  if (auto* const settings = ZORSettingRepository::GetRepository("ClashPublish", 0, 1, nullptr))
    settings->ReadSetting("PictureZoom", &zoom, 1);
  return zoom == 0;
}

bool AreSubInterferencesWanted() {
  auto* const settings = ZORSysSettingRepository::GetRepository("Clash", 0);
  const char* const wanted = ZORGetEnv("TRX_VELD_SUBINTERF");
  if (!settings || !wanted || std::strcmp(wanted, "TRUE") != 0) return false;
  int mode = 0;
  settings->ReadAttr("ModeOfSubInterf", &mode, 1);
  return mode == 1;
}

/// ".png" at the end whatever the format is.
ZORUnicodeString SubInterferencePath(const ZORUnicodeString& inImagePath, int inNumber) {
  ZORUnicodeString number;
  number.BuildFromNum(inNumber, "%d");
  const ZORUnicodeString tail = ZORUnicodeString("_SubItf_") + number;
  ZORUnicodeString path = inImagePath;
  while (path.ReplaceSubString(".png", tail) >= 0) continue;
  return path.Append(".png");
}

}  // namespace

/// A bag with a product's representation, which belongs to the product.
class PrintPictures::ShownProduct {
 public:
  ShownProduct(ZORLyraRepPathBuilder& ioBuilder, const ZORIProduct_var& inProduct,
               const ZORUnicodeString& inPath)
      : ShownProduct() {
    bag_ = new ZOR3DBagRep;
    if (FAILED(ioBuilder.GetRepPathFromSpecObjV4(inProduct, inPath, path_)) || !path_) return;
    path_->Rewind();
    rep_ = path_->NextChildRep();
    ImposeColour(inProduct);
    if (rep_) bag_->AddChild(rep_);
  }
  ~ShownProduct() {
    if (!bag_) return;
    if (rep_) bag_->RemoveChild(rep_);
    bag_->Destroy();
  }
  ShownProduct(const ShownProduct&) = delete;
  ShownProduct& operator=(const ShownProduct&) = delete;

  ZOR3DBagRep* GetBag() const { return bag_; }
  ZORRepPath* GetPath() const { return path_; }

 private:
  /// What is built from here on is taken apart when an error is raised on the way.
  ShownProduct() = default;

  void ImposeColour(const ZORIProduct_var& inProduct) {
    int found = 0;
    unsigned int red = 0, green = 0, blue = 0;
    const HRESULT result = RetrieveColor(inProduct, found, red, green, blue);
    if (FAILED(result) || found != 1 || !rep_) return;
    rep_->SetColorRGBA(red, green, blue, kOpaque);
    rep_->SetInheritanceMode(kImposedColour);
  }

  ZOR3DBagRep* bag_ = nullptr;
  ZORRepPath* path_ = nullptr;
  ZORRep* rep_ = nullptr;
};

/// The two products and the interference under one bag.
class PrintPictures::Scene {
 public:
  Scene(const ZORIProduct_var& inFirst, const ZORUnicodeString& inFirstPath,
        const ZORIProduct_var& inSecond, const ZORUnicodeString& inSecondPath,
        const ZORISiInterference_var& inInterference)
      : Scene() {
    first_ = Show(inFirst, inFirstPath);
    second_ = Show(inSecond, inSecondPath);
    if (!inInterference.IsNull()) interference_ = TakeInterferenceRep(inInterference);
    if (first_) top_->AddChild(first_->GetBag());
    if (second_) top_->AddChild(second_->GetBag());
    if (interference_) top_->AddChild(interference_);
  }
  ~Scene() {
    if (interference_) {
      top_->RemoveChild(interference_);
      interference_->Destroy();
    }
    TakeOut(first_);
    TakeOut(second_);
    top_->Destroy();
  }
  Scene(const Scene&) = delete;
  Scene& operator=(const Scene&) = delete;

  ZOR3DBagRep* GetTop() const { return top_; }
  ZOR3DRep* GetInterference() const { return static_cast<ZOR3DRep*>(interference_); }

 private:
  Scene() = default;

  std::unique_ptr<ShownProduct> Show(const ZORIProduct_var& inProduct,
                                     const ZORUnicodeString& inPath) {
    if (ZORI3DGeoVisu_var(inProduct).IsNull()) return nullptr;
    return std::make_unique<ShownProduct>(builder_, inProduct, inPath);
  }
  void TakeOut(std::unique_ptr<ShownProduct>& ioProduct) {
    if (!ioProduct) return;
    top_->RemoveChild(ioProduct->GetBag());
    ioProduct.reset();
  }

  ZORLyraRepPathBuilder builder_{kLoadedOnly};
  ZOR3DBagRep* top_ = new ZOR3DBagRep;
  std::unique_ptr<ShownProduct> first_, second_;
  ZORRep* interference_ = nullptr;
};

void PrintPictures::GeneratePictures(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                                     ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                                     ZORISiInterference_var inInterference,
                                     ZORUnicodeString inDirectory, ZORUnicodeString inFileName,
                                     ZORUnicodeString inFormat, int inWidth, int inHeight,
                                     int inViewMode, int inKeepBackground) {
  PrintListVisuToFile(inFirst, inFirstPath, inSecond, inSecondPath, inInterference,
                      inDirectory + BuildPath::AppendSlash() + inFileName, inFormat, inWidth,
                      inHeight, inViewMode, inKeepBackground);
}

void PrintPictures::GeneratePicturesPreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                            ZORUnicodeString inDirectory,
                                            ZORUnicodeString inFileName, ZORUnicodeString inFormat,
                                            int inWidth, int inHeight, int inViewMode,
                                            int inKeepBackground) {
  PrintListVisuToFilePreview(inProduct, inPath, inDirectory + BuildPath::AppendSlash() + inFileName,
                             inFormat, inWidth, inHeight, inViewMode, inKeepBackground);
}

void PrintPictures::PrintListVisuToFile(ZORIProduct_var inFirst, ZORUnicodeString inFirstPath,
                                        ZORIProduct_var inSecond, ZORUnicodeString inSecondPath,
                                        ZORISiInterference_var inInterference,
                                        ZORUnicodeString inImagePath, ZORUnicodeString inFormat,
                                        int inWidth, int inHeight, int inViewMode,
                                        int inKeepBackground) {
  const Scene scene(inFirst, inFirstPath, inSecond, inSecondPath, inInterference);
  const OwnViewpoint viewpoint;
  const bool isInterference = !inInterference.IsNull();
  if (isInterference && inInterference->FillViewpoint(viewpoint.Get()) == 1) {
    TakeRepImage(scene.GetTop(), inImagePath, viewpoint.Get(), inFormat, inWidth, inHeight,
                 inViewMode, inKeepBackground);
    return;
  }
  const std::unique_ptr<double[]> geometry(isInterference ? inInterference->GetGeometricResult()
                                                          : nullptr);
  if (!geometry || !scene.GetInterference()) {
    TakeRepImage(scene.GetTop(), inImagePath, inFormat, inWidth, inHeight, inViewMode,
                 inKeepBackground);
    return;
  }
  const ZOR3DRep* const framed =
      FramesInterferenceAlone() ? scene.GetInterference() : scene.GetTop();
  viewpoint->Reframe(static_cast<float>(inWidth), static_cast<float>(inHeight), 1.0F, 1.0F,
                     framed->GetShowBoundingElement());
  TakeRepImage(scene.GetTop(), inImagePath, viewpoint.Get(), inFormat, inWidth, inHeight,
               inViewMode, inKeepBackground);
  if (AreSubInterferencesWanted()) {
    constexpr int kThumbnailWidth = 72, kThumbnailHeight = 50;
    PrintSubInterferenceImage(scene.GetTop(), inInterference, inImagePath, inFormat, inViewMode,
                              inKeepBackground, kThumbnailWidth, kThumbnailHeight);
  }
}

void PrintPictures::PrintListVisuToFilePreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                               ZORUnicodeString inImagePath,
                                               ZORUnicodeString inFormat, int inWidth, int inHeight,
                                               int inViewMode, int inKeepBackground) {
  if (inProduct.IsNull()) return;
  ZORLyraRepPathBuilder builder(kLoadedOnly);
  std::unique_ptr<ZORRepPath> path;
  const ShownProduct product(builder, inProduct, inPath);
  path.reset(product.GetPath());
  TakeRepImage(product.GetBag(), inImagePath, inFormat, inWidth, inHeight, inViewMode,
               inKeepBackground);
}

void PrintPictures::TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                                 ZORUnicodeString inFormat, int inWidth, int inHeight,
                                 int inViewMode, int inKeepBackground) {
  if (!inScene) return;
  auto* const image = new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inScene), inWidth, inHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, inViewMode == 1);
  image->GetViewpoint()->Reframe(static_cast<float>(inWidth), static_cast<float>(inHeight), 1.0F,
                                 1.0F);
  Capture(*image, inFormat, inImagePath);
  image->Release();
}

// A print image that gave no picture is left unreleased.
void PrintPictures::TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                                 ZOR3DViewpoint* inViewpoint, ZORUnicodeString inFormat,
                                 int inWidth, int inHeight, int inViewMode, int inKeepBackground) {
  if (!inScene) return;
  auto* const image = new ZORPrint3DRepImage(static_cast<ZOR3DRep*>(inScene), inWidth, inHeight);
  SetUpSupport(image->GetSupport(), inKeepBackground != 0, inViewMode == 1);
  *image->GetViewpoint() = *inViewpoint;
  if (Capture(*image, inFormat, inImagePath)) image->Release();
}

// From the top down: what is imposed highest wins.
HRESULT PrintPictures::RetrieveColor(ZORIProduct_var inProduct, int& outFound, unsigned int& outRed,
                                     unsigned int& outGreen, unsigned int& outBlue) {
  outFound = 0;
  if (inProduct.IsNull()) return E_INVALIDARG;
  ProductList line;
  for (ZORIProduct_var product = inProduct; !product.IsNull();
       product = product->GetFatherProduct())
    line.Append(product);

  HRESULT result = S_OK;
  for (int i = line.Size(); i >= 1; --i) {
    if (line[i].IsNull()) continue;
    const ZORIVisProperties_var properties = line[i];
    if (properties.IsNull()) {
      result = E_FAIL;
      continue;
    }
    ZORVisPropertiesValues values;
    result = properties->GetPropertiesAtt(values, kAllProperties, kWholeGeometry, 0, 0);
    if (FAILED(result)) continue;
    unsigned int isInherited = 0;
    result = values.GetInheritance(kColourProperty, isInherited);
    if (FAILED(result) || isInherited == 0) continue;
    outFound = 1;
    return values.GetColor(outRed, outGreen, outBlue);
  }
  return result;
}

void PrintPictures::PrintSubInterferenceImage(ZORRep* inScene,
                                              ZORISiInterference_var& inInterference,
                                              ZORUnicodeString inImagePath,
                                              ZORUnicodeString inFormat, int inViewMode,
                                              int inKeepBackground, int inWidth, int inHeight) {
  ZORListValZORISpecObject_var parts;
  inInterference->GetSubInterferences(parts);
  const int count = inInterference->GetSubInterferenceCount();
  for (int i = 1; i <= count; ++i) {
    const ZORISiSubInterference_var part = parts[i];
    const OwnViewpoint viewpoint;
    if (part.IsNull() || part->FillViewpoint(viewpoint.Get()) == 0) continue;
    TakeRepImage(inScene, SubInterferencePath(inImagePath, i), viewpoint.Get(), inFormat, inWidth,
                 inHeight, inViewMode, inKeepBackground);
  }
}
