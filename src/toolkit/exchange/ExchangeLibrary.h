// What the toolkit and its library of foreign formats say to each other. That one stands on libzip,
// libxlsxwriter and libuuid, and is loaded when the first foreign file is read or written.
#ifndef ZOR_TOOLKIT_EXCHANGE_EXCHANGE_LIBRARY_H
#define ZOR_TOOLKIT_EXCHANGE_EXCHANGE_LIBRARY_H

#include <array>
#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ZORToolkit {

// Zip archives

/// So many entries at most are read and written: as many as every reader of the format counts.
inline constexpr std::size_t kMaxArchiveEntries = 65535;

struct ArchiveEntry {
  std::string name;  ///< with slashes, whatever the archive has; no folder
  std::string bytes;
};

/// Visits the entries in the order of the archive, and reads all of them to find broken ones.
/// @param inWants  whether the bytes of an entry are needed; those of others are not kept.
/// @param inVisit  raises what it likes.
/// @return false, with a reason in one line, for what is no archive, is encrypted, damaged, too
///         large or too well compressed to be honest, or has a name that leads out of it.
typedef bool ReadArchiveFunction(const std::string& inPath,
                                 const std::function<bool(std::string_view inName)>& inWants,
                                 const std::function<void(ArchiveEntry&& inEntry)>& inVisit,
                                 std::string& outReason);
inline constexpr char kReadArchiveName[] = "ZORReadArchive";

struct NewArchiveEntry {
  std::string name;
  std::function<std::string()> make;  ///< called once, when its turn has come
  bool isCompressed = true;
};

/// Writes an archive without times: the same entries make the same bytes.
/// @return false, with a reason. What a function of an entry raises is raised here.
typedef bool WriteArchiveFunction(const std::string& inPath,
                                  std::span<const NewArchiveEntry> inEntries,
                                  std::string& outReason);
inline constexpr char kWriteArchiveName[] = "ZORWriteArchive";

// Identifiers

typedef std::array<unsigned char, 16> Uuid;
/// A name-based UUID (RFC 4122, version 5) of a text in a namespace.
typedef void NameUuidFunction(const Uuid& inNamespace, const std::string& inName, Uuid& outUuid);
inline constexpr char kNameUuidName[] = "ZORNameUuid";

/// A function of that library. Raises Error when it is not there.
void* ExchangeFunction(const char* inName);

template <class Function>
Function* FindExchangeFunction(const char* inName) {
  return reinterpret_cast<Function*>(ExchangeFunction(inName));
}

}  // namespace ZORToolkit

#endif
