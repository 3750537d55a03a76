#include "default_platform/product_structure/OpenedModels.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <memory>
#include <random>

#include "platform/product_structure/ZORIAlias.h"

namespace fs = std::filesystem;

namespace products {

Folder::Folder()
    : path_((fs::temp_directory_path() / ("zor_products_" + std::to_string(std::random_device()())))
                .string()) {
  fs::create_directories(path_);
}

Folder::~Folder() {
  std::error_code error;
  fs::remove_all(path_, error);
}

std::string Folder::Write(const std::string& inName, const std::string& inBytes) const {
  const std::string path = path_ + '/' + inName;
  std::ofstream(path, std::ios::binary) << inBytes;
  return path;
}

std::string OwnCache::GetOnlyEntry() const {
  std::vector<std::string> entries;
  std::error_code error;
  for (const auto& entry : fs::directory_iterator(GetDirectory(), error))
    entries.push_back(entry.path().string());
  return entries.size() == 1 ? entries[0] : std::string();
}

std::string ReadAll(const std::string& inPath) {
  std::ifstream file(inPath, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), {}};
}

std::string Sample(const std::string& inName) {
  return std::string(ZOR_SOURCE_DIR) + "/samples/" + inName;
}

std::optional<std::string> FindModel(const std::string& inName) {
  const char* const directory = std::getenv("ZOR_MODEL_DIR");
  for (const std::string& folder :
       {std::string(ZOR_SOURCE_DIR) + "/samples", std::string(directory ? directory : ""),
        std::string(ZOR_SOURCE_DIR) + "/../shared/data/assemblies"}) {
    if (!folder.empty() && fs::exists(folder + '/' + inName)) return folder + '/' + inName;
  }
  return std::nullopt;
}

ZORDefault::OpenedModel OpenAnew(const std::string& inPath) {
  ZORDefault::ModelOptions options;
  options.useCache = false;
  return ZORDefault::OpenModel(inPath, options);
}

ZORDefault::ProductInfo FactsOf(const ZORIProduct_var& inProduct) {
  ZORDefault::ProductInfo facts;
  if (!ZORDefault::GetProductInfo(inProduct.GetInterface(), facts))
    throw std::logic_error("no product of a model");
  return facts;
}

std::vector<ZORIProduct_var> ChildrenOf(const ZORIProduct_var& inProduct) {
  const std::unique_ptr<ZORListValZORBaseUnknown_var> list(inProduct->GetChildren("ZORIProduct"));
  std::vector<ZORIProduct_var> children;
  for (int i = 1; i <= list->Size(); ++i) children.push_back((*list)[i]);
  return children;
}

std::vector<ZORIProduct_var> AllProducts(const ZORIProduct_var& inRoot) {
  std::vector<ZORIProduct_var> all = {inRoot};
  for (const ZORIProduct_var& child : ChildrenOf(inRoot)) {
    const auto below = AllProducts(child);
    all.insert(all.end(), below.begin(), below.end());
  }
  return all;
}

std::vector<ZORIProduct_var> Leaves(const ZORIProduct_var& inRoot) {
  std::vector<ZORIProduct_var> leaves = AllProducts(inRoot);
  std::erase_if(leaves,
                [](const ZORIProduct_var& product) { return !ChildrenOf(product).empty(); });
  return leaves;
}

std::string AliasOf(const ZORIProduct_var& inProduct) {
  return ZORIAlias_var(inProduct)->GetAlias().ConvertToChar();
}

std::string AliasPathOf(const ZORIProduct_var& inProduct) {
  const ZORIProduct_var father = inProduct->GetFatherProduct();
  if (father.IsNull()) return "";
  const std::string above = AliasPathOf(father);
  return above.empty() ? AliasOf(inProduct) : above + " --++-- " + AliasOf(inProduct);
}

ZORIProduct_var FindByAliasPath(const ZORIProduct_var& inRoot, const std::string& inPath) {
  for (const ZORIProduct_var& product : AllProducts(inRoot))
    if (AliasPathOf(product) == inPath) return product;
  return {};
}

std::string ReasonOf(const std::string& inPath) {
  try {
    OpenAnew(inPath);
  } catch (const ZORDefault::ModelError& error) {
    return error.GetReason();
  }
  return "";
}

}  // namespace products
