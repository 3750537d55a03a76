// Opening a model: the way in for whoever needs products.
#ifndef ZOR_DEFAULT_PLATFORM_OPENMODEL_H
#define ZOR_DEFAULT_PLATFORM_OPENMODEL_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

#include "ZORPlatformExport.h"
#include "platform/mathematics/ZORMathTransformation.h"
#include "platform/product_structure/ZORDocument.h"
#include "platform/product_structure/ZORIProduct.h"
#include "platform/system/ZORUnicodeString.h"

struct PartMesh;

namespace ZORDefault {

/// Why a model cannot be opened.
enum class ModelErrorKind {
  kFile,         ///< it does not exist, is a folder, is empty, cannot be read, changes all the time
  kFormat,       ///< of no known format, or cut off
  kUnreadable,   ///< the CAD kernel cannot read it, or finds nothing to show
  kDamaged,      ///< readable but for a part; only with ModelOptions::isStrict
  kCrash,        ///< the CAD kernel crashed
  kTimeLimit,    ///< more processor time than allowed
  kMemoryLimit,  ///< more memory than allowed
  kNoReader      ///< the program that reads models cannot be started
};

/// A model cannot be opened. what() is "PATH: REASON", one line of UTF-8.
class ZOR_PLATFORM_EXPORT ModelError : public std::runtime_error {
 public:
  ModelError(const std::string& inPath, const std::string& inReason,
             ModelErrorKind inKind = ModelErrorKind::kUnreadable);
  ~ModelError() override;
  ModelErrorKind GetKind() const { return kind_; }
  const std::string& GetPath() const { return path_; }
  const std::string& GetReason() const { return reason_; }

 private:
  std::string path_;
  std::string reason_;
  ModelErrorKind kind_;
};

/// How a model is read.
struct ModelOptions {
  /// How far triangles may lie from a part's surface, as a share of the diagonal of the part's box:
  /// above 0, at most 0.1.
  double deflection = 0.001;
  /// Keep what was read in the user's cache directory ($XDG_CACHE_HOME/zorlyra, else
  /// ~/.cache/zorlyra) and take it from there the next time. Where nothing can be written the model
  /// is opened all the same.
  bool useCache = true;
  /// A file of which the CAD kernel leaves out what it cannot read is an error, not a warning.
  bool isStrict = false;
  /// Processor time in seconds and memory in bytes that reading may take; 0: 6 s and 10 s a
  /// megabyte, 512 MB and 256 times the file's size. A model in the cache has no limits.
  double maxSeconds = 0;
  std::uint64_t maxMemory = 0;
  /// Called with the share that is done, 0 to 1, never less than before. May be empty.
  std::function<void(double inDone)> progress;
  /// Called with one line for what was repaired or left out. May be empty.
  std::function<void(const std::string& inWarning)> warn;
};

/// The document and all its products live until the last handle on any of them is released.
struct OpenedModel {
  ZORDocument_var document;
  ZORIProduct_var root;
  bool isFromCache = false;
};

/// Opens a STEP, IGES, glTF, GLB, OBJ or STL file; the content decides, then the ending. Lengths
/// become millimetres; STL and OBJ have no unit and are taken as millimetres. A file with several
/// roots gets one above them. A placement that cannot be undone, or is not finite, is read as none,
/// with a warning; a part without triangles stays in the tree.
/// @param inPath in UTF-8 on Linux.
/// The file is read by a process of its own, so that a damaged one cannot crash the caller's. Other
/// files that it names are read when they are regular files in its folder or below.
/// Raises ModelError when nothing can be shown, std::bad_alloc, and what the functions in the
/// options raise.
ZOR_PLATFORM_EXPORT OpenedModel OpenModel(const std::string& inPath,
                                          const ModelOptions& inOptions = {});

/// What is known of one product of an opened model.
struct ProductInfo {
  ZORUnicodeString alias;
  ZORUnicodeString instanceName;  ///< as the file has it; may be empty
  ZORUnicodeString partName;      ///< as the file has it; may be empty
  std::size_t part = 0;           ///< the same number for all instances of one part or assembly
  bool isAssembly = false;
  ZORMathTransformation parentFromProduct;
  ZORMathTransformation rootFromProduct;
  /// Its own, or its part's: red, green, blue, alpha.
  std::optional<std::array<std::uint8_t, 4>> colour;
  std::size_t triangles = 0;  ///< of this product alone
  double area = 0;            ///< of those triangles, square millimetres
  bool failedToTessellate = false;
  std::size_t facesWithoutTriangles = 0;
  std::shared_ptr<const PartMesh> mesh;  ///< shared by all instances; null when nothing is shown
};

/// @return false when the product is none of an opened model (or null); outInfo is untouched then.
ZOR_PLATFORM_EXPORT bool GetProductInfo(ZORIProduct* inProduct, ProductInfo& outInfo);

/// The product that an alias path leads to: the aliases from below the root down, joined by
/// " --++-- ". A component to which its file gives no name is also found by the name "=>[0:1:1:30]"
/// that other programs on the same geometry kernel write into their results.
/// @return empty when no product of the model is meant, as by an empty path.
ZOR_PLATFORM_EXPORT ZORIProduct_var FindProduct(const ZORIProduct_var& inRoot,
                                                const ZORUnicodeString& inAliasPath);

}  // namespace ZORDefault

#endif
