// Work that several machines share: the options of its verbs, plans, and gathering.
#ifndef ZOR_TOOLS_LYRA_COMMANDS_SHARES_H
#define ZOR_TOOLS_LYRA_COMMANDS_SHARES_H

#include <optional>
#include <string>
#include <vector>

#include "lyra/Arguments.h"
#include "lyra/commands/Model.h"
#include "lyra/terminal/Output.h"
#include "toolkit/sharding/Plan.h"
#include "toolkit/sharding/ShareFolder.h"

namespace lyra {

/// The options of a verb whose work can be shared.
struct ShareOptions {
  std::string shard;
  std::optional<long long> shares;
  bool plan = false, json = false;

  void Declare(Arguments& ioArguments);
  /// Raises UsageError.
  std::optional<ZORToolkit::Shard> Get() const;
};

/// Prints how long the shares will take and how much memory: as much as was needed here.
int PrintPlan(const char* inVerb, const ZORToolkit::WorkSample& inSample,
              const ShareOptions& inOptions, Output& ioOutput);

/// A manifest of a share that is to be made in this folder; inputs and options are to be added.
ZORToolkit::ShareManifest NewShare(const char* inVerb, const std::string& inFolder,
                                   const ZORToolkit::Shard& inShard);
/// What is said once a share is there.
std::string ShareLine(const ZORToolkit::ShareManifest& inManifest,
                      const ZORToolkit::ShareSize& inSize);
/// Lists as texts, and back.
std::string ListText(const std::vector<std::string>& inTexts);
std::vector<std::string> ListFrom(const std::string& inText);

struct GatherOptions {
  std::vector<std::string> folders;
  std::string output, result, model;
  std::optional<long long> jobs;
  bool resume = false;
  ModelReading reading;
};

/// One input of all shares, as it is now. Raises InputError when it is another than theirs.
/// @param inPath where it has been moved to, or empty.
/// @return its path; empty when the shares have none.
std::string InputOfShares(const ZORToolkit::ShareManifest& inShare, const char* inRole,
                          const std::string& inPath = {});

// What the verbs of shared work do with all shares, by number
int GatherPublish(const std::vector<ZORToolkit::ShareManifest>& inShares,
                  const GatherOptions& inOptions, Output& ioOutput);
int GatherDetect(const std::vector<ZORToolkit::ShareManifest>& inShares,
                 const GatherOptions& inOptions, Output& ioOutput);

}  // namespace lyra

#endif
