#include "toolkit/sharding/ShareFolder.h"

#include <algorithm>
#include <filesystem>
#include <nlohmann/json.hpp>

#include "foundation/AtomicFile.h"
#include "foundation/Hash.h"
#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/Error.h"

namespace fs = std::filesystem;

namespace ZORToolkit {
namespace {

using Json = nlohmann::ordered_json;
constexpr char kFormat[] = "zorlyra-share/1";

std::string PathOf(const std::string& inFolder, const std::string& inName) {
  return (ZORFoundation::NativePath(inFolder) / inName).string();
}

std::string HashText(const std::string& inBytes) {
  return ZORFoundation::HexText(ZORFoundation::Hash128Of(inBytes));
}

/// A manifest can lead to no file outside its folder.
bool IsBelow(const std::string& inName) {
  const fs::path path = ZORFoundation::NativePath(inName);
  return !inName.empty() && path.is_relative() && std::ranges::find(path, "..") == path.end();
}

Json JsonOf(const ShareManifest& inManifest) {
  Json json = {{"format", kFormat},
               {"verb", inManifest.verb},
               {"version", inManifest.version},
               {"shard", {{"number", inManifest.shard.number}, {"count", inManifest.shard.count}}},
               {"inputs", Json::array()},
               {"options", Json::object()},
               {"plan", inManifest.plan},
               {"complete", inManifest.isComplete},
               {"held", inManifest.held},
               {"files", Json::array()}};
  for (const ShareInput& input : inManifest.inputs)
    json["inputs"].push_back({{"role", input.role}, {"path", input.path}, {"hash", input.hash}});
  for (const auto& [name, value] : inManifest.options) json["options"][name] = value;
  for (const ShareEntry& file : inManifest.files)
    json["files"].push_back({{"name", file.name}, {"size", file.size}, {"hash", file.hash}});
  return json;
}

ShareManifest ManifestFrom(const Json& inJson) {
  ShareManifest manifest;
  manifest.verb = inJson.at("verb").get<std::string>();
  manifest.version = inJson.at("version").get<std::string>();
  const Json& shard = inJson.at("shard");
  const auto read = ShardFrom(shard.at("number").dump() + "/" + shard.at("count").dump());
  if (!read || inJson.at("format") != kFormat) throw Error("");
  manifest.shard = *read;
  for (const Json& input : inJson.at("inputs"))
    manifest.inputs.push_back({input.at("role").get<std::string>(),
                               input.at("path").get<std::string>(),
                               input.at("hash").get<std::string>()});
  for (const auto& [name, value] : inJson.at("options").items())
    manifest.options[name] = value.get<std::string>();
  manifest.plan = inJson.at("plan").get<std::string>();
  manifest.isComplete = inJson.at("complete").get<bool>();
  manifest.held = inJson.at("held").get<std::vector<int>>();
  for (const Json& file : inJson.at("files")) {
    manifest.files.push_back({file.at("name").get<std::string>(),
                              file.at("size").get<std::size_t>(),
                              file.at("hash").get<std::string>()});
    if (!IsBelow(manifest.files.back().name)) throw Error("");
  }
  return manifest;
}

std::string Called(const Shard& inShard) {
  return "share " + std::to_string(inShard.number) + "/" + std::to_string(inShard.count);
}

/// The share of whose work most are: of several works the first.
const ShareManifest& Usual(const std::vector<ShareManifest>& inShares) {
  std::size_t best = 0, most = 0;
  for (std::size_t i = 0; i < inShares.size(); ++i) {
    const auto count =
        static_cast<std::size_t>(std::ranges::count_if(inShares, [&](const ShareManifest& inOther) {
          return WhyForeign(inShares[i], inOther).empty();
        }));
    if (count > most) best = i;
    most = std::max(most, count);
    if (2 * most > inShares.size()) break;
  }
  return inShares[best];
}

void RequireOneWork(const std::vector<ShareManifest>& inShares) {
  const ShareManifest& usual = Usual(inShares);
  for (const ShareManifest& share : inShares)
    if (const std::string why = WhyForeign(usual, share); !why.empty())
      throw Error(share.folder + ": is a foreign share: " + why + " than in " + usual.folder);
}

void RequireAll(const std::vector<ShareManifest>& inSorted) {
  const Shard& first = inSorted.front().shard;
  std::string missing;
  std::uint32_t next = 1, count = 0;
  const auto miss = [&](std::uint32_t inEnd) {
    for (; next < inEnd; ++next)
      if (++count <= 10)
        missing.append(" ")
            .append(std::to_string(next))
            .append("/")
            .append(std::to_string(first.count));
  };
  for (const ShareManifest& share : inSorted) {
    miss(share.shard.number);
    ++next;
  }
  miss(first.count + 1);
  if (count > 10) missing += " and " + std::to_string(count - 10) + " more";
  if (count > 0)
    throw Error((count == 1 ? "a share is missing:" : "shares are missing:") + missing);
}

}  // namespace

ShareInput ShareInputOf(const std::string& inRole, const std::string& inPath) {
  const std::string bytes = ZORFoundation::ReadWholeFile(inPath).bytes;
  return {inRole, fs::absolute(ZORFoundation::NativePath(inPath)).lexically_normal().string(),
          HashText(bytes)};
}

ShareManifest ReadShare(const std::string& inFolder) {
  const std::string path = PathOf(inFolder, kShareFile);
  if (!fs::exists(ZORFoundation::NativePath(path)))
    throw Error(inFolder + ": is no share: there is no " + kShareFile);
  const std::string bytes = ZORFoundation::ReadWholeFile(path).bytes;
  try {
    ShareManifest manifest = ManifestFrom(Json::parse(bytes));
    manifest.folder = inFolder;
    return manifest;
  } catch (const Json::exception&) {
  } catch (const Error&) {
  }
  throw Error(path + ": is damaged: it is no manifest of a share");
}

std::optional<ShareManifest> FindShare(const ShareManifest& inManifest,
                                       const std::function<void(const std::string&)>& inWarn) {
  if (!fs::exists(ZORFoundation::NativePath(PathOf(inManifest.folder, kShareFile))))
    return std::nullopt;
  std::string why;
  try {
    ShareManifest found = ReadShare(inManifest.folder);
    why = WhyForeign(inManifest, found);
    if (why.empty() && found.shard.number == inManifest.shard.number) return found;
    if (why.empty()) why = "it is " + Called(found.shard) + ", another";
    why = inManifest.folder + ": held a foreign share: " + why + " than is asked for";
  } catch (const Error& error) {
    why = error.what();
  }
  if (inWarn) inWarn(why + "; it is made anew");
  return std::nullopt;
}

void WriteShare(const ShareManifest& inManifest) {
  ZORFoundation::WriteWholeFile(
      PathOf(inManifest.folder, kShareFile),
      JsonOf(inManifest).dump(1, ' ', true, Json::error_handler_t::replace) + "\n");
}

std::string WhyForeign(const ShareManifest& inManifest, const ShareManifest& inOther) {
  if (inManifest.verb != inOther.verb) return "it is of lyra " + inOther.verb + ", other";
  if (inManifest.version != inOther.version)
    return "it was made by version " + inOther.version + ", another";
  if (inManifest.shard.count != inOther.shard.count)
    return "it is one of " + std::to_string(inOther.shard.count) + ", another number";
  std::map<std::string, std::string> own, other;
  for (const ShareInput& input : inManifest.inputs) own[input.role] = input.hash;
  for (const ShareInput& input : inOther.inputs) other[input.role] = input.hash;
  for (const auto& [role, hash] : own)
    if (other[role] != hash) return "its " + role + " is another";
  for (const auto& [role, hash] : other)
    if (own[role] != hash) return "its " + role + " is another";
  for (const auto& [name, value] : inManifest.options)
    if (inOther.Option(name) != value)
      return "its option " + name + " is \"" + inOther.Option(name) + "\", another";
  for (const auto& [name, value] : inOther.options)
    if (inManifest.Option(name) != value)
      return "its option " + name + " is \"" + value + "\", another";
  return {};
}

ShareEntry ShareEntryOf(const std::string& inFolder, const std::string& inName) {
  const std::string bytes = ZORFoundation::ReadWholeFile(PathOf(inFolder, inName)).bytes;
  return {inName, bytes.size(), HashText(bytes)};
}

std::vector<std::string> DamagedFiles(const ShareManifest& inManifest) {
  std::vector<std::string> names;
  for (const ShareEntry& entry : inManifest.files) {
    const auto file = ZORFoundation::TryReadWholeFile(PathOf(inManifest.folder, entry.name));
    if (!file || file->bytes.size() != entry.size || HashText(file->bytes) != entry.hash)
      names.push_back(entry.name);
  }
  return names;
}

std::vector<ShareManifest> ReadAllShares(const std::vector<std::string>& inFolders) {
  std::vector<ShareManifest> shares;
  for (const std::string& folder : inFolders) shares.push_back(ReadShare(folder));
  RequireOneWork(shares);
  std::ranges::stable_sort(shares, {}, [](const ShareManifest& s) { return s.shard.number; });
  for (std::size_t i = 1; i < shares.size(); ++i)
    if (shares[i - 1].shard.number == shares[i].shard.number)
      throw Error(Called(shares[i].shard) + " is there twice: " + shares[i - 1].folder + " and " +
                  shares[i].folder);
  RequireAll(shares);
  for (const ShareManifest& share : shares) {
    if (!share.isComplete)
      throw Error(share.folder + ": " + Called(share.shard) +
                  " is unfinished: --resume goes on with it");
    if (const auto damaged = DamagedFiles(share); !damaged.empty())
      throw Error(PathOf(share.folder, damaged.front()) + ": is missing or damaged: " +
                  Called(share.shard) + " must be done again, with --resume");
    if (share.plan != shares.front().plan)
      throw Error(share.folder + ": is a foreign share: it was cut otherwise than " +
                  shares.front().folder);
  }
  return shares;
}

}  // namespace ZORToolkit
