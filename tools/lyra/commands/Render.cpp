// lyra render MODEL -o PICTURE
#include <filesystem>
#include <memory>

#include "ZORLyraGeneralServices.h"
#include "foundation/NativePath.h"
#include "lyra/CommandErrors.h"
#include "lyra/Verbs.h"
#include "lyra/commands/Model.h"
#include "lyra/commands/Picture.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"
#include "toolkit/records/DocumentText.h"

namespace fs = std::filesystem;

namespace lyra {
using namespace ZORToolkit;
namespace {

struct RenderOptions {
  std::string file, picture, size, view = "iso";
  std::vector<std::string> products;
  bool keepBackground = false;
  ModelReading reading;
};

/// The products of an alias, from the root on.
std::vector<ZORIProduct_var> FindByAlias(const ZORIProduct_var& inRoot,
                                         const ZORUnicodeString& inAlias) {
  std::vector<ZORIProduct_var> found;
  WalkProducts(inRoot, kAllLevels, [&](const ProductLevels& inLevels) {
    const ZORIAlias_var named = inLevels.back().product;
    if (named->GetAlias() == inAlias) found.push_back(inLevels.back().product);
  });
  return found;
}

/// The product of a path, else the one product of that alias.
ZORIProduct_var ChosenProduct(const RenderOptions& inOptions, const ZORIProduct_var& inRoot,
                              const std::string& inName) {
  const ZORUnicodeString name = FromUtf8(inName);
  if (ZORIProduct_var product = ZORDefault::FindProduct(inRoot, name); !product.IsNull())
    return product;
  const std::vector<ZORIProduct_var> namesakes = FindByAlias(inRoot, name);
  if (namesakes.size() == 1) return namesakes.front();
  if (namesakes.empty())
    throw InputError(inOptions.file + ": there is no product \"" + inName + "\"");
  throw InputError(inOptions.file + ": " + std::to_string(namesakes.size()) +
                   " products are called \"" + inName + "\", such as \"" +
                   Utf8(ZORLyraGeneralServices::GetPathRoot(namesakes.front())) + "\"");
}

/// @return null when there is nothing to show.
ZOR3DRep* RepOf(const ZORIProduct_var& inProduct) {
  const ZORI3DGeoVisu_var visible = inProduct;
  return visible.IsNull() ? nullptr : static_cast<ZOR3DRep*>(visible->GetRep());
}

/// What a picture shows; the representations in it belong to their products.
class Scene {
 public:
  Scene() = default;
  Scene(const Scene&) = delete;
  Scene& operator=(const Scene&) = delete;
  ~Scene() { bag_->Destroy(); }

  /// A representation that is there already is not added again.
  void Add(ZOR3DRep* inRep) {
    for (const ZOR3DRep* child : bag_->GetChildren())
      if (child == inRep) return;
    bag_->AddChild(inRep);
  }
  ZOR3DRep* Rep() const { return bag_; }

 private:
  ZOR3DBagRep* bag_ = new ZOR3DBagRep;
};

void Fill(Scene& ioScene, const RenderOptions& inOptions, const ZORIProduct_var& inRoot) {
  if (inOptions.products.empty()) {
    ZOR3DRep* const all = RepOf(inRoot);
    if (!all) throw InputError(inOptions.file + ": there is nothing to show");
    ioScene.Add(all);
  }
  for (const std::string& name : inOptions.products) {
    ZOR3DRep* const rep = RepOf(ChosenProduct(inOptions, inRoot, name));
    if (!rep)
      throw InputError(inOptions.file + ": the product \"" + name + "\" has nothing to show");
    ioScene.Add(rep);
  }
}

int Render(const RenderOptions& inOptions, Output& ioOutput) {
  PictureOptions picture;
  picture.format = FormatOfPicture(inOptions.picture);
  picture.view = ViewOf(inOptions.view);
  picture.keepsBackground = inOptions.keepBackground;
  if (!inOptions.size.empty()) picture.size = SizeOf(inOptions.size);
  inOptions.reading.Check();
  { const OutputFile probe(inOptions.picture); }  // fails at once where nothing can be written
  const ZORIProduct_var root = OpenModelFile(inOptions.file, inOptions.reading).root;
  Scene scene;
  Fill(scene, inOptions, root);
  OutputFile file(inOptions.picture);
  TakePicture(*scene.Rep(), picture, file.Path());
  if (fs::is_empty(ZORFoundation::NativePath(file.Path())))
    throw InputError(inOptions.picture + ": the picture cannot be drawn or written");
  file.Finish(ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareRender(Arguments& ioArguments) {
  const auto options = std::make_shared<RenderOptions>();
  ioArguments.Positional("MODEL", options->file, "A STEP, IGES, glTF, OBJ or STL file");
  ioArguments.RequiredText("-o,--output", "PICTURE", options->picture,
                           "The picture to write; its name ends in .jpg, .jpeg or .png");
  ioArguments.Texts(
      "--product", "PATH", options->products,
      "Only this product, by its path (see lyra tree --leaves) or by an alias that no "
      "other has; may be given several times");
  ioArguments.Text("--size", "WxH", options->size, "Width and height in pixels (default: 756x506)");
  ioArguments.Text("--view", "VIEW", options->view,
                   "iso (default), front, back, left, right, top or bottom");
  ioArguments.Words("--view", kViewWords);
  ioArguments.Flag("--keep-background", options->keepBackground,
                   "A soft gradient behind the products instead of white");
  options->reading.Declare(ioArguments);
  return [options](Output& ioOutput) { return Render(*options, ioOutput); };
}

}  // namespace lyra
