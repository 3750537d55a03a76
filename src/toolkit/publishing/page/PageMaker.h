// The functions of the page plugin.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_MAKER_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_MAKER_H

#include "toolkit/publishing/page/PageLibrary.h"

namespace ZORToolkit {

// Texts that are shipped, put into the library when it is built; see ShippedTexts.cpp.in.
extern const char kPageStyleSheet[], kPageStyle[], kPageScript[];
extern const char kReportStyleSheet[], kReportType[];

// See PageLibrary.
bool MakePage(const PageRequest& inRequest, Page& outPage);
std::string Sha256(std::string_view inBytes);
std::string Base64(std::string_view inBytes);
bool FromBase64(std::string_view inText, std::string& outBytes);
std::string Gzip(std::string_view inBytes);
bool Gunzip(std::string_view inBytes, std::size_t inMaxSize, std::string& outBytes);
std::string WebpFromPng(std::string_view inPng);
void ReorderTriangles(std::vector<std::uint32_t>& ioCorners, std::size_t inPoints);
float SimplifyMesh(const std::vector<std::array<float, 3>>& inPoints,
                   std::vector<std::uint32_t>& ioCorners, double inShare);

}  // namespace ZORToolkit

#endif
