// A publication whose pictures several machines draw: shares of it, and the whole put together.
#ifndef ZOR_TOOLKIT_SHARDING_PUBLICATION_SHARE_H
#define ZOR_TOOLKIT_SHARDING_PUBLICATION_SHARE_H

#include <functional>
#include <vector>

#include "toolkit/publishing/Publication.h"
#include "toolkit/sharding/Plan.h"
#include "toolkit/sharding/ShareFolder.h"

namespace ZORToolkit {

/// Draws one share of a publication's pictures.
/// @param inManifest says where and of what: all but its plan and its files.
/// @param inOptions  as for Publish; form, folder and sharing are not looked at.
/// Raises what Publish does; pictures that are whole stay for a run that goes on.
ZOR_TOOLKIT_EXPORT ShareSize PublishShare(ClashDocument& ioResult, PublicationOptions inOptions,
                                          ShareManifest inManifest,
                                          const std::function<ZORIProduct_var()>& inOpenModel);

/// Publishes with the pictures of all shares: what one machine would make, byte for byte. Pictures
/// of a format that the shares have not are drawn, with a warning.
/// @param inShares as ReadAllShares gives them.
/// Raises what Publish does, and Error, with nothing changed, when there is something else to draw
/// here than the shares say.
ZOR_TOOLKIT_EXPORT Published GatherPublication(ClashDocument& ioResult,
                                               PublicationOptions inOptions,
                                               const std::vector<ShareManifest>& inShares,
                                               const std::function<ZORIProduct_var()>& inOpenModel);

/// Draws a few of the pictures, for a plan; they do not stay.
ZOR_TOOLKIT_EXPORT WorkSample
SamplePublication(ClashDocument& ioResult, PublicationOptions inOptions,
                  const std::function<ZORIProduct_var()>& inOpenModel);

}  // namespace ZORToolkit

#endif
