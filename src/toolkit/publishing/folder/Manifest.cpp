#include "toolkit/publishing/folder/Manifest.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <nlohmann/json.hpp>

#include "foundation/NativePath.h"
#include "foundation/ReadWholeFile.h"
#include "toolkit/publishing/folder/PublishedFiles.h"
#include "toolkit/publishing/page/PageLibrary.h"
#include "toolkit/records/DocumentText.h"

namespace ZORToolkit {
namespace {

using Json = nlohmann::ordered_json;
constexpr char kFormat[] = "zorlyra-page/1";

Json JsonOf(const HashedFile& inFile) {
  return {{"name", inFile.name}, {"size", inFile.size}, {"sha256", inFile.sha256}};
}

Json JsonOf(const std::optional<HashedFile>& inFile) {
  return inFile ? JsonOf(*inFile) : Json(nullptr);
}

HashedFile FileFrom(const Json& inJson) {
  return {inJson.at("name").get<std::string>(), inJson.at("sha256").get<std::string>(),
          inJson.at("size").get<std::size_t>()};
}

std::optional<HashedFile> OptionalFileFrom(const Json& inJson, const char* inName) {
  const auto found = inJson.find(inName);
  if (found == inJson.end() || found->is_null()) return std::nullopt;
  return FileFrom(*found);
}

void Compare(const std::string& inName, const std::optional<HashedFile>& inOld,
             const std::optional<HashedFile>& inNew, std::vector<std::string>& ioLines) {
  if (!inOld && !inNew) return;
  if (!inOld || !inNew)
    ioLines.push_back(inName + (inOld ? ": not given any more" : ": was not given"));
  else if (inOld->sha256 != inNew->sha256)
    ioLines.push_back(inName + ": changed");
}

}  // namespace

HashedFile HashedBytes(const std::string& inName, std::string_view inBytes) {
  return {inName, Sha256Text(inBytes), inBytes.size()};
}

HashedFile HashedFileAt(const std::string& inPath) {
  const std::string name = ZORFoundation::NativePath(inPath).filename().string();
  return HashedBytes(Utf8(FromUtf8(name)), ZORFoundation::ReadWholeFile(inPath).bytes);
}

Manifest ManifestOf(const PublicationOptions& inOptions, const std::string& inPictureSettings) {
  Manifest manifest;
  manifest.version = ZOR_VERSION;
  if (!inOptions.source.empty())
    manifest.result = HashedBytes(inOptions.sourceName, inOptions.source);
  if (!inOptions.model.empty()) manifest.model = HashedFileAt(inOptions.model);
  if (!inOptions.baselineSource.empty())
    manifest.baseline = HashedBytes(inOptions.baselineName, inOptions.baselineSource);
  const std::string styleSheet = StyleSheetPath(inOptions);
  manifest.settings = {
      {"form", inOptions.isOneFile ? "one file" : "folder"},
      {"only", inOptions.filterText},
      {"styleSheet", styleSheet.empty() ? std::string() : HashedFileAt(styleSheet).sha256},
      {"geometry", inOptions.hasGeometry ? "yes" : "no"},
      {"format", inOptions.isCompact ? "WEBP" : FormatName(inOptions.format)},
      {"size", std::to_string(inOptions.size.width) + "x" + std::to_string(inOptions.size.height)},
      {"positions", inOptions.places == ProductPlaces::kModel ? "model" : "result"},
      {"pictures", inPictureSettings},
      {"language", inOptions.language}};
  return manifest;
}

std::string JsonOf(const Manifest& inManifest) {
  Json json = {{"format", kFormat},
               {"version", inManifest.version},
               {"result", JsonOf(inManifest.result)},
               {"model", JsonOf(inManifest.model)},
               {"baseline", JsonOf(inManifest.baseline)},
               {"settings", Json::object()},
               {"files", Json::array()}};
  for (const auto& [name, value] : inManifest.settings) json["settings"][name] = value;
  for (const HashedFile& file : inManifest.files) json["files"].push_back(JsonOf(file));
  return json.dump(1, ' ', true, Json::error_handler_t::replace) + "\n";
}

Manifest ManifestFrom(const std::string& inName, const std::string& inJson) {
  try {
    const Json json = Json::parse(inJson);
    if (json.at("format") != kFormat) throw Error(inName, "is no manifest of a page");
    Manifest manifest;
    manifest.version = json.at("version").get<std::string>();
    manifest.result = OptionalFileFrom(json, "result");
    manifest.model = OptionalFileFrom(json, "model");
    manifest.baseline = OptionalFileFrom(json, "baseline");
    for (const auto& [name, value] : json.at("settings").items())
      manifest.settings.emplace_back(name, value.get<std::string>());
    for (const Json& file : json.at("files")) manifest.files.push_back(FileFrom(file));
    return manifest;
  } catch (const Json::exception&) {
    throw Error(inName, "is no manifest of a page");
  }
}

std::vector<std::string> Differences(const Manifest& inOld, const Manifest& inNew) {
  std::vector<std::string> lines;
  if (inOld.version != inNew.version)
    lines.push_back("version: " + inOld.version + " became " + inNew.version);
  Compare("result", inOld.result, inNew.result, lines);
  Compare("model", inOld.model, inNew.model, lines);
  Compare("baseline", inOld.baseline, inNew.baseline, lines);
  const std::map<std::string, std::string> now(inNew.settings.begin(), inNew.settings.end());
  for (const auto& [name, value] : inOld.settings) {
    const auto found = now.find(name);
    const std::string other = found == now.end() ? "" : found->second;
    if (other != value)
      lines.push_back("setting " + name + ": \"" + value + "\" became \"" + other + "\"");
  }
  return lines;
}

}  // namespace ZORToolkit
