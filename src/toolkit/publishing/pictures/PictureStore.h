// The folder of a publication's pictures.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURESTORE_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_PICTURESTORE_H

#include <filesystem>
#include <set>
#include <string>
#include <vector>

#include "toolkit/publishing/folder/WorkFolder.h"

namespace ZORToolkit {

/// Pictures appear whole or not at all, and a main one after its small ones, so one that is there
/// is done. A stamp beside them says what they were drawn from and lists them: a picture that is
/// not listed is somebody else's, and is neither replaced nor removed. Raises Error,
/// ZORFoundation::FileError, and std::filesystem::filesystem_error for what cannot be read or made.
class PictureStore {
 public:
  /// @param inPublication the publication's folder, which has or gets the folder "pictures".
  /// @param inEnding      of main pictures and previews: ".jpg" or ".png".
  PictureStore(const std::filesystem::path& inPublication, const std::string& inEnding);

  /// Where pictures are drawn, under the names that they will have.
  const std::string& DrawingFolder() const { return work_.Path(); }
  /// Prepares the folder. Existing pictures are kept only where the run resumes and they were drawn
  /// from what the stamp says. Raises Error, with nothing changed, where somebody else's picture
  /// stands in the place of one of these interferences.
  /// @return false when they were to be kept and could not.
  bool Prepare(const std::string& inStamp, bool inGoesOn, const std::set<std::string>& inNumbers);
  /// Writes the final list of pictures, in order.
  void Settle(const std::string& inStamp) const;

  // Names within the folder, by the number of the interference: 0 is the overview of all; those of
  // the baseline are negative.
  std::string PictureName(int inNumber) const;
  /// @param inProduct 0 or 1.
  std::string PreviewName(int inNumber, std::size_t inProduct) const;
  /// The existing small pictures of a main one, in their order.
  std::vector<std::string> ThumbnailNames(int inNumber) const;

  /// Moves what was drawn into place: a main picture with its small ones, or a preview.
  void Finish(int inNumber) const;
  void FinishPreview(int inNumber, std::size_t inProduct) const;

  /// Moves the pictures of these names from the drawing folder into place.
  void TakeOver(const std::vector<std::string>& inNames) const;

  bool Has(const std::string& inName) const;
  /// The name if there is such a picture, as the page refers to it; else empty.
  std::string Reference(const std::string& inName) const;

 private:
  std::vector<std::string> ThumbnailsIn(const std::filesystem::path& inFolder, int inNumber) const;
  std::set<std::string> PicturesOf(const std::set<std::string>& inNumbers) const;
  void WriteStamp(const std::string& inStamp, const std::set<std::string>& inNames) const;

  std::filesystem::path shownFolder_, folder_;  // as given, absolute
  std::string ending_;
  WorkFolder work_;
};

}  // namespace ZORToolkit

#endif
