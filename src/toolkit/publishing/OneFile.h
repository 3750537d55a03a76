// A page that is one file: what lies beside a page in a folder stands in it, as blocks at its end.
#ifndef ZOR_TOOLKIT_PUBLISHING_ONE_FILE_H
#define ZOR_TOOLKIT_PUBLISHING_ONE_FILE_H

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "ZORToolkitExport.h"

namespace ZORToolkit {

/// Bytes in a page that its script, or PublishedPage::Block, finds by name: letters, digits, "-"
/// and "_".
struct PageBlock {
  std::string name;
  std::string bytes;
  bool isPacked = false;  ///< they are compressed by gzip already
};

/// A picture that a page has once and shows wherever it refers to "#id".
struct PagePicture {
  std::string id, name;  ///< name: of its file
  std::string bytes;
  int width = 1, height = 1;  ///< only the ratio counts
};

inline constexpr char kSourceBlock[] = "result";

/// The page with pictures and blocks before the end of its body. Raises Error, by the page's name,
/// for what is no HTML page.
std::string PageWithBlocks(const std::string& inName, const std::string& inPage,
                           const std::vector<PagePicture>& inPictures,
                           const std::vector<PageBlock>& inBlocks, const std::string& inManifest);

/// A page as it was made, or as a browser saved it.
class ZOR_TOOLKIT_EXPORT PublishedPage {
 public:
  /// @param inName what errors call it.
  PublishedPage(std::string inName, std::string inBytes);

  /// The result from which it was made, byte for byte. Raises Error when the page has none, or when
  /// its hash is not that of the manifest.
  std::string Result() const;
  /// The manifest, JSON. Raises Error when the page has none.
  std::string ManifestText() const;
  /// The bytes of a picture by the name of its file.
  std::optional<std::string> Picture(const std::string& inName) const;
  /// The bytes of a block, decompressed; nothing when the page has none of that name.
  std::optional<std::string> Block(const std::string& inName) const;
  /// As it was packed.
  std::optional<std::string> PackedBlock(const std::string& inName) const;

 private:
  std::optional<std::string_view> ElementText(const std::string& inStart) const;

  std::string name_, bytes_;
};

}  // namespace ZORToolkit

#endif
