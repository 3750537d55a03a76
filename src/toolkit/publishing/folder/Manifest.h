// What a publication was made from, to tell later what has changed.
#ifndef ZOR_TOOLKIT_PUBLISHING_FOLDER_MANIFEST_H
#define ZOR_TOOLKIT_PUBLISHING_FOLDER_MANIFEST_H

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "toolkit/publishing/Publication.h"

namespace ZORToolkit {

inline constexpr char kManifestFile[] = "manifest.json";

/// A file by its content. The hash is SHA-256, as 64 hexadecimal digits.
struct HashedFile {
  std::string name;
  std::string sha256;
  std::size_t size = 0;
};

HashedFile HashedBytes(const std::string& inName, std::string_view inBytes);
/// Raises ZORFoundation::FileError.
HashedFile HashedFileAt(const std::string& inPath);

/// The same inputs make the same manifest: it holds no time and no path.
struct Manifest {
  std::string version;
  std::optional<HashedFile> result, baseline, model;
  std::vector<std::pair<std::string, std::string>> settings;
  std::vector<HashedFile> files;  ///< pictures and geometry, by name
};

/// The manifest of the options, without files.
/// @param inPictureSettings what else decides how pictures look.
Manifest ManifestOf(const PublicationOptions& inOptions, const std::string& inPictureSettings);

std::string JsonOf(const Manifest& inManifest);
/// @param inName what errors call it. Raises Error for what is no manifest.
Manifest ManifestFrom(const std::string& inName, const std::string& inJson);

/// The differences, a line each, such as "result: changed".
std::vector<std::string> Differences(const Manifest& inOld, const Manifest& inNew);

}  // namespace ZORToolkit

#endif
