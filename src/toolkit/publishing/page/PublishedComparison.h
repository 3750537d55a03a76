// The comparison of a published result with an older one, its baseline.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_PUBLISHED_COMPARISON_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_PUBLISHED_COMPARISON_H

#include <vector>

#include "toolkit/publishing/Publication.h"
#include "toolkit/publishing/ReportWriter.h"

namespace ZORToolkit {

/// What a page shows of an interference; a word that the reader could not understand is shown as
/// the document has it.
PublishedInterference PublishedOf(const InterferenceRecord& inRecord);

/// An interference of the older result that has a picture of its own.
struct Before {
  InterferenceRecord record;
  bool isGone = false;       // the result has it no more
  std::size_t position = 0;  // among the published ones, or those that are gone
  ResolvedInterference resolved;
};

/// Fills in for each published interference what became of it since, and adds those that are gone.
/// @param inOptions with a baseline.
/// @return those that have changed or are gone.
std::vector<Before> CompareWithBaseline(const PublicationOptions& inOptions,
                                        const ReviewedResult& inReview,
                                        PublishedResult& ioPublished);

/// Resolves them in the model that they were computed with; those of which it has no product are
/// removed.
void ResolveBefore(const PublicationOptions& inOptions, const ZORIProduct_var& inRoot,
                   std::vector<Before>& ioBefore);

}  // namespace ZORToolkit

#endif
