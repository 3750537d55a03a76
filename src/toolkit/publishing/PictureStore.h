// The folder of a publication's pictures.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURESTORE_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURESTORE_H

#include <filesystem>
#include <string>
#include <vector>

namespace ZORToolkit {

/// Pictures appear whole or not at all, and a main one after its small ones, so one that is there is
/// done. A stamp beside them says what
/// they were drawn from. Raises std::filesystem::filesystem_error for what cannot be read or made.
class PictureStore {
 public:
  /// @param inPublication the publication's folder, which has or gets the folder "pictures".
  /// @param inEnding      of main pictures and previews: ".jpg" or ".png".
  PictureStore(const std::filesystem::path& inPublication, const std::string& inEnding);

  const std::filesystem::path& Folder() const { return folder_; }
  /// Makes the folder ready. The pictures that are there stay only when they are to be gone on with
  /// and were drawn from what the stamp says.
  /// @return false when they were to stay and could not.
  bool Prepare(const std::string& inStamp, bool inGoesOn) const;

  // Names within the folder
  std::string PictureName(int inNumber) const;
  /// @param inProduct 0 or 1.
  std::string PreviewName(int inNumber, std::size_t inProduct) const;
  /// The small pictures that are there beside a main one, in their order.
  std::vector<std::string> ThumbnailNames(int inNumber) const;

  /// The name under which a main picture is drawn, and the small ones beside it.
  std::string UnfinishedName(int inNumber) const;
  /// Gives what was drawn its names.
  void Finish(int inNumber) const;

  bool Has(const std::string& inName) const;
  /// The name if there is such a picture, as the page refers to it; else empty.
  std::string Reference(const std::string& inName) const;

 private:
  std::vector<std::string> ThumbnailsBeside(const std::string& inStem) const;

  std::filesystem::path folder_;
  std::string ending_;
};

/// Removes what runs that were killed left unfinished in a publication's folder and its pictures'.
void RemoveUnfinishedFiles(const std::filesystem::path& inPublication);

}  // namespace ZORToolkit

#endif
