// Making a page, for the verbs that do.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_PUBLISH_RUN_H
#define ZOR_TOOLS_LYRA_COMMANDS_PUBLISH_RUN_H

#include <optional>

#include "lyra/terminal/Progress.h"
#include "toolkit/publishing/Publication.h"

namespace lyra {

class Output;

/// Has warnings and the progress of drawing said on standard error.
/// @param ioProgress begins once the model is open; lives as long as the options are used.
void SayOnStandardError(std::optional<DrawingProgress>& ioProgress,
                        ZORToolkit::PublicationOptions& ioOptions);

/// Says in one line what was made. Raises InputError where a picture could not be drawn or written.
int ReportPage(const ZORToolkit::Published& inMade, Output& ioOutput);
void RequireAllPictures(const ZORToolkit::Published& inMade);

}  // namespace lyra

#endif
