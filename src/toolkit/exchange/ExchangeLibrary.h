// The interface between the toolkit and its plugin for foreign formats, which stands on libzip,
// libxlsxwriter, libuuid and readers of pictures. It is loaded when the first foreign file is read
// or written.
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

/// So many entries at most are read and written: more serve to keep a reader busy.
inline constexpr std::size_t kMaxArchiveEntries = 99999;
/// More than these are counted in an extension of the format, which old tools do not know (zip64).
inline constexpr std::size_t kMaxPlainArchiveEntries = 65535;

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

// Pictures

/// The bytes of a PNG or JPEG picture as PNG, made smaller where a side is longer than inMaxSide.
/// @return false for what is no such picture, or one of more than 16,384 pixels a side.
typedef bool PngFromPictureFunction(const std::string& inPicture, std::size_t inMaxSide,
                                    std::string& outPng);
inline constexpr char kPngFromPictureName[] = "ZORPngFromPicture";

// Spreadsheets

struct SheetColumn {
  std::string header;
  double width = 10;  ///< characters
  bool isHidden = false, isEditable = false;
};

/// Cells that may hold some words only, or are coloured by the word that they hold.
struct SheetWords {
  std::size_t column = 0;
  std::vector<std::string> words;
  std::vector<std::uint32_t> colours;  ///< 0xRRGGBB of each word; empty for none
  bool isChoice = false;               ///< a list of the words is offered, and others are refused
};

/// Bars beside a list of words and numbers.
struct SheetChart {
  std::string title;
  std::size_t firstRow = 0, lastRow = 0, wordColumn = 0, numberColumn = 1, row = 0, column = 0;
};

struct SheetLayout {
  std::string name;
  std::vector<SheetColumn> columns;  ///< with a frozen header and a filter
  std::size_t rows = 0;              ///< below the header
  std::vector<SheetWords> words;
  std::vector<SheetChart> charts;
  double rowHeight = 0;  ///< points; 0 for the usual
};

/// Writes sheet after sheet, row after row from the top: nothing is kept of a row but on disk.
class SpreadsheetWriter {
 public:
  virtual ~SpreadsheetWriter() = default;
  virtual void AddSheet(const SheetLayout& inLayout) = 0;
  // Of the last sheet; rows from 0, below the header
  virtual void Text(std::size_t inRow, std::size_t inColumn, const std::string& inText) = 0;
  virtual void Number(std::size_t inRow, std::size_t inColumn, double inNumber) = 0;
  /// A PNG or JPEG picture, made as much smaller as the scale says.
  virtual void Picture(std::size_t inRow, std::size_t inColumn, const std::string& inPath,
                       double inScale) = 0;
  /// @return a reason why the file is not written; empty when it is.
  virtual std::string Finish() = 0;
};

/// @param inTime of creation, seconds since 1970.
typedef SpreadsheetWriter* NewSpreadsheetFunction(const std::string& inPath, std::int64_t inTime);
inline constexpr char kNewSpreadsheetName[] = "ZORNewSpreadsheet";

/// The longest text of a cell, in bytes of UTF-8 that are surely no more characters than fit.
inline constexpr std::size_t kMaxCellText = 32767;
inline constexpr std::size_t kMaxSheetRows = 1048575;

/// A function of that library. Raises Error when it is not there.
void* ExchangeFunction(const char* inName);

template <class Function>
Function* FindExchangeFunction(const char* inName) {
  return reinterpret_cast<Function*>(ExchangeFunction(inName));
}

}  // namespace ZORToolkit

#endif
