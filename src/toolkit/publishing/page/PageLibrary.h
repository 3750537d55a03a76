// The interface between the toolkit and its page plugin, which stands on libxslt, zlib, Nettle,
// libwebp and meshoptimizer. It is loaded when the first page is made or read.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_LIBRARY_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_LIBRARY_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace ZORToolkit {

struct PageRequest {
  std::string document;        // XML; empty: the style sheet is only read
  std::string styleSheet;      // the text of a style sheet; empty: the page's own
  std::string styleSheetName;  // what errors call it
};

struct Page {
  std::string bytes;
  std::string reason;    // in one line, why there is no page
  std::string messages;  // messages of the style sheet
};

struct PageLibrary {
  /// Applies a style sheet to a document. A style sheet reads and writes no file and reaches no
  /// network; it is all in one text. Characters that change the direction of writing reach it as
  /// \u{HEX}. @return false, with a reason, when there is no page.
  bool (*makePage)(const PageRequest& inRequest, Page& outPage);

  // Texts that are shipped
  const char *pageStyle, *pageScript;         // for the page's head and end
  const char *reportStyleSheet, *reportType;  // that lie beside a report

  // Codings
  std::string (*sha256)(std::string_view inBytes);  // 32 bytes
  std::string (*base64)(std::string_view inBytes);
  bool (*fromBase64)(std::string_view inText, std::string& outBytes);
  std::string (*gzip)(std::string_view inBytes);  // the same bytes on every run
  bool (*gunzip)(std::string_view inBytes, std::size_t inMaxSize, std::string& outBytes);

  /// A picture of PNG as one of WebP (VP8, lossy), a third as large; empty when it cannot be read.
  std::string (*webpFromPng)(std::string_view inPng);

  // Meshes
  /// Reorders the corners of triangles so that near ones follow one another.
  void (*reorder)(std::vector<std::uint32_t>& ioCorners, std::size_t inPoints);
  /// Leaves out triangles, at most down to a share of them.
  /// @return how far the surface moved at most, as a share of the mesh's largest side.
  float (*simplify)(const std::vector<std::array<float, 3>>& inPoints,
                    std::vector<std::uint32_t>& ioCorners, double inShare);
};

typedef const PageLibrary* PageLibraryFunction();
inline constexpr char kPageLibraryName[] = "ZORPageLibrary";

/// The library, loaded at the first call. Raises Error when it cannot be.
const PageLibrary& LoadPageLibrary();

/// 64 hexadecimal digits.
std::string Sha256Text(std::string_view inBytes);

}  // namespace ZORToolkit

#endif
