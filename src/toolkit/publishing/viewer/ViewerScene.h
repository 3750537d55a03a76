// The geometry of a model for the viewer of a page.
#ifndef ZOR_TOOLKIT_PUBLISHING_VIEWER_VIEWER_SCENE_H
#define ZOR_TOOLKIT_PUBLISHING_VIEWER_VIEWER_SCENE_H

#include <map>
#include <memory>
#include <string>
#include <vector>

#include "toolkit/publishing/OneFile.h"
#include "toolkit/publishing/pictures/PictureCamera.h"
#include "toolkit/scenes/InterferenceScenes.h"

namespace ZORToolkit {

/// Each part once, its instances, and for each interference its picture's products and camera.
class ViewerScene {
 public:
  /// @param inRoot of an opened model.
  ViewerScene(const ZORIProduct_var& inRoot, PictureSize inSize);
  ~ViewerScene();
  ViewerScene(const ViewerScene&) = delete;
  ViewerScene& operator=(const ViewerScene&) = delete;

  /// @param inKey what the page calls the interference.
  void Add(const std::string& inKey, const ResolvedInterference& inResolved,
           const PictureCamera& inCamera);

  /// "scene", JSON, and "part-0", "part-1", …; compressed. Parts without an instance have none.
  /// @param inMaxSize of all blocks as base64; above it triangles are left out, and the scene says
  /// so.
  std::vector<PageBlock> Blocks(std::size_t inMaxSize) const;
  bool IsEmpty() const;

 private:
  struct Content;
  std::unique_ptr<Content> content_;
};

}  // namespace ZORToolkit

#endif
