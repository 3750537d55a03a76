// Zip archives as other programs write them, good and bad.
#ifndef ZOR_TESTS_TOOLKIT_EXCHANGE_WRITTEN_ARCHIVE_H
#define ZOR_TESTS_TOOLKIT_EXCHANGE_WRITTEN_ARCHIVE_H

#include <cstdint>
#include <map>
#include <string>
#include <utility>
#include <vector>

/// Names and bytes, in order.
using Entries = std::vector<std::pair<std::string, std::string>>;

/// @return the path of a new archive, which the next one of that name replaces.
std::string WriteArchive(const std::string& inName, const Entries& inEntries,
                         bool inIsEncrypted = false);
/// An archive of empty entries, as many as wanted, with the extension for many (zip64).
std::string WriteEmptyEntries(const std::string& inName, std::size_t inCount);
/// @return the path of a new file.
std::string WriteBytes(const std::string& inName, const std::string& inBytes);
std::string ReadBytes(const std::string& inPath);
std::map<std::string, std::string> ReadArchive(const std::string& inPath);

/// The official schemas and cases, which lie in a folder beside the project; empty without it.
std::string OfficialFolder();

#endif
