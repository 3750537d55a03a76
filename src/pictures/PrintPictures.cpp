#include "PrintPictures.h"

#include <algorithm>
#include <cstring>
#include <memory>
#include <vector>

#include "BuildPath.h"
#include "RepCapture.h"
#include "Teardown.h"
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
constexpr int kThumbnailWidth = 72, kThumbnailHeight = 50;  // whatever the main picture's size

/// The representation of an interference with all its elements shown.
ZORRep* TakeInterferenceRep(const ZORISiInterference_var& inInterference) {
  std::unique_ptr<int[]> savedFlags(inInterference->GetFlags());
  {
    const int count = std::max(inInterference->GetElementCount(), 0);
    const std::vector<int> allShown(static_cast<std::size_t>(count) + 1, 1);
    inInterference->SetFlags(allShown.data());
  }
  const ZORI3DGeoVisu_var visualised = inInterference;
  if (visualised.IsNull()) {
    savedFlags.release();  // by contract neither restored nor freed
    return nullptr;
  }
  ZORRep* const rep = visualised->GetRep();
  inInterference->SetFlags(savedFlags.get());
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
  path.Append(".png");
  return path;
}

/// Finds the colour that is imposed on a product, as PrintPictures::RetrieveColor does.
using ColourQuery = HRESULT (*)(ZORIProduct_var inProduct, int& outFound, unsigned int& outRed,
                                unsigned int& outGreen, unsigned int& outBlue);

/// A bag with a product's representation, which belongs to the product.
class ShownProduct {
 public:
  void Build(ZORLyraRepPathBuilder& ioBuilder, const ZORIProduct_var& inProduct,
             const ZORUnicodeString& inPath, ColourQuery inRetrieveColor) {
    bag_ = new ZOR3DBagRep;
    if (FAILED(ioBuilder.GetRepPathFromSpecObjV4(inProduct, inPath, path_)) || !path_) return;
    path_->Rewind();
    rep_ = path_->NextChildRep();
    ImposeColour(inProduct, inRetrieveColor);
    if (!rep_) return;
    bag_->AddChild(rep_);
    isRepInBag_ = true;
  }
  void AddTo(ZOR3DBagRep* inTop) {
    if (!bag_) return;
    inTop->AddChild(bag_);
    top_ = inTop;
  }
  /// Adds the steps that detach bag and representation and destroy the bag. Called before Build:
  /// steps for what has not been built do nothing.
  void AddSteps(Teardown& ioTeardown) {
    ioTeardown.Add([this] {
      if (top_) top_->RemoveChild(bag_);
    });
    ioTeardown.Add([this] {
      if (isRepInBag_) bag_->RemoveChild(rep_);
    });
    ioTeardown.Add([this] {
      if (bag_) bag_->Destroy();
    });
  }

  ZOR3DBagRep* GetBag() const { return bag_; }
  ZORRepPath* GetPath() const { return path_; }

 private:
  void ImposeColour(const ZORIProduct_var& inProduct, ColourQuery inRetrieveColor) {
    int found = 0;
    unsigned int red = 0, green = 0, blue = 0;
    const HRESULT result = inRetrieveColor(inProduct, found, red, green, blue);
    if (FAILED(result) || found != 1 || !rep_) return;
    rep_->SetColorRGBA(red, green, blue, kOpaque);
    rep_->SetInheritanceMode(kImposedColour);
  }

  ZOR3DBagRep* top_ = nullptr;  // null until the bag is in it
  ZOR3DBagRep* bag_ = nullptr;
  ZORRepPath* path_ = nullptr;
  ZORRep* rep_ = nullptr;
  bool isRepInBag_ = false;
};

/// The two products and the interference under one bag.
class Scene {
 public:
  Scene() {
    teardown_.Add([this] {
      if (isInterferenceInTop_) top_->RemoveChild(interference_);
    });
    teardown_.Add([this] {
      if (interference_) interference_->Destroy();
    });
    first_.AddSteps(teardown_);
    second_.AddSteps(teardown_);
    teardown_.Add([this] { top_->Destroy(); });
  }

  void Build(const ZORIProduct_var& inFirst, const ZORUnicodeString& inFirstPath,
             const ZORIProduct_var& inSecond, const ZORUnicodeString& inSecondPath,
             const ZORISiInterference_var& inInterference, ColourQuery inRetrieveColor) {
    Show(first_, inFirst, inFirstPath, inRetrieveColor);
    Show(second_, inSecond, inSecondPath, inRetrieveColor);
    if (!inInterference.IsNull()) interference_ = TakeInterferenceRep(inInterference);
    first_.AddTo(top_);
    second_.AddTo(top_);
    if (!interference_) return;
    top_->AddChild(interference_);
    isInterferenceInTop_ = true;
  }
  /// Destroys everything but the products' representations. To be called at the end; see Teardown.
  void TakeApart() { teardown_.Run(); }

  ZOR3DBagRep* GetTop() const { return top_; }
  ZOR3DRep* GetInterference() const { return static_cast<ZOR3DRep*>(interference_); }

 private:
  void Show(ShownProduct& outShown, const ZORIProduct_var& inProduct,
            const ZORUnicodeString& inPath, ColourQuery inRetrieveColor) {
    if (!inProduct.IsNull() && !ZORI3DGeoVisu_var(inProduct).IsNull())
      outShown.Build(builder_, inProduct, inPath, inRetrieveColor);
  }

  ZORLyraRepPathBuilder builder_{kLoadedOnly};
  ZOR3DBagRep* top_ = new ZOR3DBagRep;
  ShownProduct first_, second_;
  ZORRep* interference_ = nullptr;
  bool isInterferenceInTop_ = false;
  Teardown teardown_;
};

/// A viewpoint of one picture.
class OwnViewpoint {
 public:
  OwnViewpoint() {
    teardown_.Add([this] { viewpoint_->Release(); });
  }
  /// To be called at the end; see Teardown.
  void Release() { teardown_.Run(); }

  ZOR3DViewpoint* Get() const { return viewpoint_; }
  ZOR3DViewpoint* operator->() const { return viewpoint_; }

 private:
  ZOR3DViewpoint* const viewpoint_ = new ZOR3DViewpoint;
  Teardown teardown_;
};

}  // namespace

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
  Scene scene;
  scene.Build(inFirst, inFirstPath, inSecond, inSecondPath, inInterference, &RetrieveColor);
  OwnViewpoint viewpoint;
  const auto takeThroughViewpoint = [&] {
    TakeRepImage(scene.GetTop(), inImagePath, viewpoint.Get(), inFormat, inWidth, inHeight,
                 inViewMode, inKeepBackground);
  };
  const auto draw = [&] {
    const bool isInterference = !inInterference.IsNull();
    if (isInterference && inInterference->FillViewpoint(viewpoint.Get()) == 1)
      return takeThroughViewpoint();
    const std::unique_ptr<double[]> geometry(isInterference ? inInterference->GetGeometricResult()
                                                            : nullptr);
    if (!geometry || !scene.GetInterference())
      return TakeRepImage(scene.GetTop(), inImagePath, inFormat, inWidth, inHeight, inViewMode,
                          inKeepBackground);
    const ZOR3DRep* const framed =
        FramesInterferenceAlone() ? scene.GetInterference() : scene.GetTop();
    viewpoint->Reframe(static_cast<float>(inWidth), static_cast<float>(inHeight), 1.0F, 1.0F,
                       framed->GetShowBoundingElement());
    takeThroughViewpoint();
    if (AreSubInterferencesWanted())
      PrintSubInterferenceImage(scene.GetTop(), inInterference, inImagePath, inFormat, inViewMode,
                                inKeepBackground, kThumbnailWidth, kThumbnailHeight);
  };
  draw();
  viewpoint.Release();
  scene.TakeApart();
}

void PrintPictures::PrintListVisuToFilePreview(ZORIProduct_var inProduct, ZORUnicodeString inPath,
                                               ZORUnicodeString inImagePath,
                                               ZORUnicodeString inFormat, int inWidth, int inHeight,
                                               int inViewMode, int inKeepBackground) {
  if (inProduct.IsNull()) return;
  ZORLyraRepPathBuilder builder(kLoadedOnly);
  std::unique_ptr<ZORRepPath> path;  // deleted before its builder
  ShownProduct product;
  Teardown teardown;
  product.AddSteps(teardown);
  product.Build(builder, inProduct, inPath, &RetrieveColor);
  path.reset(product.GetPath());
  TakeRepImage(product.GetBag(), inImagePath, inFormat, inWidth, inHeight, inViewMode,
               inKeepBackground);
  teardown.Run();
}

void PrintPictures::TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                                 ZORUnicodeString inFormat, int inWidth, int inHeight,
                                 int inViewMode, int inKeepBackground) {
  const auto frameAll = [&](ZORPrint3DRepImage& ioImage) {
    ioImage.GetViewpoint()->Reframe(static_cast<float>(inWidth), static_cast<float>(inHeight), 1.0F,
                                    1.0F);
  };
  CaptureRep(
      inScene,
      {inImagePath, inFormat, inWidth, inHeight, inViewMode == 1, inKeepBackground != 0, true},
      frameAll);
}

void PrintPictures::TakeRepImage(ZORRep* inScene, ZORUnicodeString inImagePath,
                                 ZOR3DViewpoint* inViewpoint, ZORUnicodeString inFormat,
                                 int inWidth, int inHeight, int inViewMode, int inKeepBackground) {
  CaptureRep(
      inScene,
      {inImagePath, inFormat, inWidth, inHeight, inViewMode == 1, inKeepBackground != 0, false},
      [&](ZORPrint3DRepImage& ioImage) { *ioImage.GetViewpoint() = *inViewpoint; });
}

// From the root down: the highest ancestor that imposes a colour wins.
HRESULT PrintPictures::RetrieveColor(ZORIProduct_var inProduct, int& outFound, unsigned int& outRed,
                                     unsigned int& outGreen, unsigned int& outBlue) {
  outFound = 0;
  if (inProduct.IsNull()) return E_INVALIDARG;
  ProductList ancestors;  // the product itself first, the root last
  for (ZORIProduct_var product = inProduct; !product.IsNull();
       product = product->GetFatherProduct())
    ancestors.Append(product);

  HRESULT result = S_OK;
  for (int i = ancestors.Size(); i >= 1; --i) {
    if (ancestors[i].IsNull()) continue;
    const ZORIVisProperties_var properties = ancestors[i];
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
    OwnViewpoint viewpoint;
    if (!part.IsNull() && part->FillViewpoint(viewpoint.Get()) != 0)
      TakeRepImage(inScene, SubInterferencePath(inImagePath, i), viewpoint.Get(), inFormat, inWidth,
                   inHeight, inViewMode, inKeepBackground);
    viewpoint.Release();
  }
}
