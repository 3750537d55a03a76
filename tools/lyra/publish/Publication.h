// What is published of a result: its interferences with their pictures.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_PUBLICATION_H
#define ZOR_TOOLS_LYRA_PUBLISH_PUBLICATION_H

#include <array>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "lyra/ListFilter.h"
#include "lyra/Picture.h"
#include "lyra/publish/PictureStore.h"
#include "lyra/publish/PublishedInterference.h"
#include "toolkit/records/ClashDocument.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace lyra {

/// An interference that is published.
struct Entry {
  ZORToolkit::InterferenceRecord record;
  ZORToolkit::ResolvedInterference resolved;  // once it is looked up
  PublishedInterference facts;
};

struct PictureStyle {
  PictureFormat format = PictureFormat::kJpeg;
  PictureSize size;
  std::optional<int> zoom;  // in the place of the setting "PictureZoom"
};

/// The interferences of a result that a filter accepts. The document is changed on the way to a
/// report: the others leave it, and pictures are referred to only when they are part of the
/// publication.
class Publication {
 public:
  Publication(ZORToolkit::ClashDocument& ioResult, const ListFilter& inFilter);

  const std::vector<Entry>& Entries() const { return entries_; }
  /// A number that differs when what the result says of any interference does.
  std::string Fingerprint() const;

  /// Says which products the model has, and their colours. Warns of what it lacks.
  void LookUp(const ZORIProduct_var& inRoot, ZORToolkit::ProductPlaces inPlaces);
  /// Draws the pictures that are not there yet. @return how many interferences got none although
  /// the model has one of their products.
  std::size_t Draw(const PictureStore& inStore, const PictureStyle& inStyle, int inProcesses);
  /// Makes the document what is published.
  void Finish(ZORToolkit::ClashDocument& ioResult);

 private:
  std::size_t TakeReferences(const PictureStore& inStore);

  std::vector<Entry> entries_;
  std::vector<ZORToolkit::ElementHandle> others_;
  std::uint64_t hash_;
};

}  // namespace lyra

#endif
