// Which topics a clash result becomes in BCF: the writer's plan, and what the way back compares
// with; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_BCF_BCF_TOPICS_H
#define ZOR_TOOLKIT_EXCHANGE_BCF_BCF_TOPICS_H

#include <string>
#include <vector>

#include "toolkit/review/Group.h"

namespace ZORToolkit {

/// Lower-case GUIDs that are always the same for the same name.
std::string GuidNamed(const std::string& inName);
/// The GUID of a component as IFC writes it, in 22 characters: that of the product's own
/// identifier, if it is one, else one made of its identity.
std::string IfcGuidOf(const std::string& inProductId);

struct PlannedComment {
  std::string guid, text;
};

struct PlannedTopic {
  std::string id;  ///< stable: of the interference, or of the group
  std::string guid;
  std::string groupLabel;    ///< empty for an interference
  std::vector<int> members;  ///< positions in ReviewedResult::interferences
  int representative = -1;   ///< the one that is shown
  /// "Relevant", "Irrelevant" or "Not inspected"; that also where members differ.
  std::string status;
  bool hasOneStatus = true;
  std::vector<std::string> labels;  ///< the violated rules
  std::vector<PlannedComment> comments;
};

/// @param inIds  those of StableIds.
/// @param inGrouping null for a topic for each interference.
std::vector<PlannedTopic> PlanTopics(const ReviewedResult& inResult,
                                     const std::vector<std::string>& inIds,
                                     const GroupOptions* inGrouping);

}  // namespace ZORToolkit

#endif
