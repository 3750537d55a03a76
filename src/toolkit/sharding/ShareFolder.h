// A share of a work as a folder: what one machine did, with a manifest that says of what.
#ifndef ZOR_TOOLKIT_SHARDING_SHARE_FOLDER_H
#define ZOR_TOOLKIT_SHARDING_SHARE_FOLDER_H

#include <cstddef>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "ZORToolkitExport.h"
#include "toolkit/sharding/Shard.h"

namespace ZORToolkit {

inline constexpr char kShareFile[] = "share.json";

/// A file that the work is done on. Hashes are XXH3 of 128 bits.
struct ShareInput {
  std::string role;  ///< "result", "model", …
  std::string path;  ///< absolute; may be another one for each share
  std::string hash;
};

/// A file of the share.
struct ShareEntry {
  std::string name;  ///< below the folder
  std::size_t size = 0;
  std::string hash;
};

/// What a share says of itself: of which work it is, and what of it is done.
struct ShareManifest {
  std::string folder;  ///< as it was given; not part of the file
  std::string verb;    ///< "publish" or "detect"
  std::string version;
  Shard shard;
  std::vector<ShareInput> inputs;
  std::map<std::string, std::string> options;
  std::string plan;  ///< a hash of what there is to do and of what it is expected to cost
  bool isComplete = false;
  std::vector<int> held;  ///< numbers of the items that are done, with or without success
  std::vector<ShareEntry> files;

  /// Empty where there is none.
  std::string Option(const std::string& inName) const {
    const auto found = options.find(inName);
    return found == options.end() ? std::string() : found->second;
  }
};

/// How much of a work a share is.
struct ShareSize {
  std::size_t items = 0;
  bool wasComplete = false;  ///< there was nothing left to do
};

/// The path made absolute, and a hash of the bytes. Raises ZORFoundation::FileError.
ZOR_TOOLKIT_EXPORT ShareInput ShareInputOf(const std::string& inRole, const std::string& inPath);

/// Raises Error for a folder that holds no share.
ZOR_TOOLKIT_EXPORT ShareManifest ReadShare(const std::string& inFolder);
/// What the folder of a manifest has of the same share of the same work; nothing where it has none.
/// @param inWarn told in one line that it has another, which is to be made anew; may be empty.
ZOR_TOOLKIT_EXPORT std::optional<ShareManifest> FindShare(
    const ShareManifest& inManifest, const std::function<void(const std::string&)>& inWarn);
/// Replaces the manifest in its folder. Raises ZORFoundation::FileError.
ZOR_TOOLKIT_EXPORT void WriteShare(const ShareManifest& inManifest);

/// What another has that is not of the same work, in words: "the model is another"; empty where
/// both are. Neither the share's number nor the plan is looked at.
ZOR_TOOLKIT_EXPORT std::string WhyForeign(const ShareManifest& inManifest,
                                          const ShareManifest& inOther);

ZOR_TOOLKIT_EXPORT ShareEntry ShareEntryOf(const std::string& inFolder, const std::string& inName);
/// Names of files that are missing or whose bytes are others.
ZOR_TOOLKIT_EXPORT std::vector<std::string> DamagedFiles(const ShareManifest& inManifest);

/// All shares of one work, whole, by their numbers. Raises Error that names a share which is
/// unfinished, damaged, foreign, doubled or missing.
ZOR_TOOLKIT_EXPORT std::vector<ShareManifest> ReadAllShares(
    const std::vector<std::string>& inFolders);

}  // namespace ZORToolkit

#endif
