// Models that tests open.
#ifndef ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_OPENEDMODELS_H
#define ZOR_TESTS_DEFAULT_PLATFORM_PRODUCT_STRUCTURE_OPENEDMODELS_H

#include <optional>
#include <string>
#include <vector>

#include "default_platform/OpenModel.h"
#include "support/ScopedVariable.h"

namespace products {

/// A new empty folder for one test, removed at its end.
class Folder {
 public:
  Folder();
  ~Folder();
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;
  const std::string& GetPath() const { return path_; }
  /// Writes a file into the folder. @return its path.
  std::string Write(const std::string& inName, const std::string& inBytes) const;

 private:
  std::string path_;
};

/// A cache directory of its own for one test.
class OwnCache {
 public:
  /// The one entry in the cache; "" when there is none or more than one.
  std::string GetOnlyEntry() const;
  std::string GetDirectory() const { return folder_.GetPath() + "/zorlyra"; }

 private:
  Folder folder_;
  support::ScopedVariable variable_{"XDG_CACHE_HOME", folder_.GetPath()};
};

std::string ReadAll(const std::string& inPath);

/// A model of the samples.
std::string Sample(const std::string& inName);
/// A model of the samples, else of the directory ZOR_MODEL_DIR, else of shared/data/assemblies
/// beside this project; nothing when it is in none of them.
std::optional<std::string> FindModel(const std::string& inName);

/// Opens without the cache.
ZORDefault::OpenedModel OpenAnew(const std::string& inPath);
ZORDefault::ProductInfo FactsOf(const ZORIProduct_var& inProduct);
std::vector<ZORIProduct_var> ChildrenOf(const ZORIProduct_var& inProduct);
/// The product and all below it, a father before its children.
std::vector<ZORIProduct_var> AllProducts(const ZORIProduct_var& inRoot);
std::vector<ZORIProduct_var> Leaves(const ZORIProduct_var& inRoot);
std::string AliasOf(const ZORIProduct_var& inProduct);
/// The aliases from below the root down to the product, joined by " --++-- ".
std::string AliasPathOf(const ZORIProduct_var& inProduct);
/// The product below a root that an alias path leads to; empty when there is none.
ZORIProduct_var FindByAliasPath(const ZORIProduct_var& inRoot, const std::string& inPath);
/// Why a model cannot be opened; "" when it can.
std::string ReasonOf(const std::string& inPath);

}  // namespace products

#endif
