// The pictures of one publication, drawn by several machines.
#ifndef ZOR_TOOLKIT_PUBLISHING_PICTURES_SHARED_DRAWING_H
#define ZOR_TOOLKIT_PUBLISHING_PICTURES_SHARED_DRAWING_H

#include <cstddef>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "toolkit/publishing/pictures/PictureStore.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

/// What is drawn together: the pictures of one interference, under its number in the PictureStore.
struct DrawingItem {
  int number = 0;
  std::uint64_t cost = 0;  ///< expected; see DrawingCosts
};

/// For a run that draws a share of the pictures: which these are, and where others come from.
class SharedDrawing {
 public:
  SharedDrawing() = default;
  virtual ~SharedDrawing() = default;
  SharedDrawing(const SharedDrawing&) = delete;
  SharedDrawing& operator=(const SharedDrawing&) = delete;

  /// Called before anything is changed. @return the positions of the items that this run draws.
  virtual std::vector<std::size_t> Choose(const std::vector<DrawingItem>& inItems) = 0;
  /// Called once the store is ready, before anything is drawn.
  virtual void Begin(const PictureStore&) {}
  /// Called with the number of chosen items that are drawn, and the processor time of all these in
  /// seconds.
  virtual void Drawn(std::size_t, double) {}
  /// Called once all that was chosen is drawn.
  virtual void Finish(const PictureStore&) {}
  /// Whether the page is to be made then.
  virtual bool MakesPage() const { return false; }
};

/// The expected cost of drawing an interference, in triangles: those of its products, and a
/// constant for what any picture costs.
class DrawingCosts {
 public:
  std::uint64_t Of(const ResolvedInterference& inResolved);
  std::uint64_t OfAll(const ZORIProduct_var& inRoot);

 private:
  std::map<std::string, std::uint64_t> trianglesOfPath_;
};

}  // namespace ZORToolkit

#endif
