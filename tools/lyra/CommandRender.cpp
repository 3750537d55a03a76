// lyra render MODEL -o PICTURE
#include <filesystem>
#include <memory>

#include "ZORLyraGeneralServices.h"
#include "lyra/CommandErrors.h"
#include "lyra/DocumentText.h"
#include "lyra/ModelFile.h"
#include "lyra/Picture.h"
#include "lyra/ProductWalk.h"
#include "lyra/ReplacedFile.h"
#include "lyra/Verbs.h"
#include "platform/product_structure/ZORIAlias.h"
#include "platform/visualisation/ZOR3DBagRep.h"
#include "platform/visualisation/ZORI3DGeoVisu.h"

namespace lyra {
namespace {

struct RenderOptions {
  std::string file, picture, size, view = "iso";
  std::vector<std::string> products;
  bool keepBackground = false;
};

/// Products that a name may stand for.
struct Namesakes {
  ZORIProduct_var byPath;
  ZORIProduct_var byAlias;  // the first of them
  int aliasCount = 0;
};

Namesakes FindNamesakes(const ZORIProduct_var& inRoot, const ZORUnicodeString& inName) {
  Namesakes found;
  WalkProducts(inRoot, kAllLevels, [&](const ProductLevels& inLevels) {
    const ZORIProduct_var& product = inLevels.back().product;
    if (found.byPath.IsNull() && ZORLyraGeneralServices::GetPathRoot(product) == inName)
      found.byPath = product;
    if (ZORIAlias_var(product)->GetAlias() != inName) return;
    if (found.aliasCount++ == 0) found.byAlias = product;
  });
  return found;
}

/// The product of a path, else the one product of that alias.
ZORIProduct_var FindProduct(const RenderOptions& inOptions, const ZORIProduct_var& inRoot,
                            const std::string& inName) {
  const Namesakes found = FindNamesakes(inRoot, FromUtf8(inName));
  if (!found.byPath.IsNull()) return found.byPath;
  if (found.aliasCount == 1) return found.byAlias;
  if (found.aliasCount == 0)
    throw InputError(inOptions.file + ": there is no product \"" + inName + "\"");
  throw InputError(inOptions.file + ": " + std::to_string(found.aliasCount) +
                   " products are called \"" + inName + "\", such as \"" +
                   Utf8(ZORLyraGeneralServices::GetPathRoot(found.byAlias)) + "\"");
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
    ZOR3DRep* const rep = RepOf(FindProduct(inOptions, inRoot, name));
    if (!rep)
      throw InputError(inOptions.file + ": the product \"" + name + "\" has nothing to show");
    ioScene.Add(rep);
  }
}

int Render(const RenderOptions& inOptions, Output& ioOutput) {
  PictureWishes wishes;
  wishes.format = FormatOfPicture(inOptions.picture);
  wishes.view = ViewOf(inOptions.view);
  wishes.keepsBackground = inOptions.keepBackground;
  if (!inOptions.size.empty()) wishes.size = SizeOf(inOptions.size);
  { const ReplacedFile probe(inOptions.picture); }  // fails at once where nothing can be written
  const ZORIProduct_var root = OpenModelFile(inOptions.file).root;
  Scene scene;
  Fill(scene, inOptions, root);
  ReplacedFile file(inOptions.picture);
  TakePicture(*scene.Rep(), wishes, file.TemporaryPath());
  std::error_code error;
  const bool isEmpty = std::filesystem::file_size(file.TemporaryPath(), error) == 0 || error;
  if (isEmpty) throw InputError(inOptions.picture + ": the picture cannot be drawn or written");
  file.Finish(ioOutput);
  return 0;
}

}  // namespace

VerbAction DeclareRender(Arguments& ioArguments) {
  const auto options = std::make_shared<RenderOptions>();
  ioArguments.Positional("MODEL", options->file, "A STEP, IGES, glTF, OBJ or STL file");
  ioArguments.RequiredText("-o,--output", "PICTURE", options->picture,
                           "The picture to write; its name ends in .jpg, .jpeg or .png");
  ioArguments.Texts("--product", "PATH", options->products,
                    "Only this product, by its path as lyra tree --leaves prints it or by an alias "
                    "that no other has; may be given several times");
  ioArguments.Text("--size", "WxH", options->size, "Width and height in pixels (default: 756x506)");
  ioArguments.Text("--view", "VIEW", options->view,
                   "iso (default), front, back, left, right, top or bottom");
  ioArguments.Flag("--keep-background", options->keepBackground,
                   "A soft gradient behind the products instead of white");
  return [options](Output& ioOutput) { return Render(*options, ioOutput); };
}

}  // namespace lyra
