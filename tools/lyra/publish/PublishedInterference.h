// What a published page knows of an interference besides the report.
#ifndef ZOR_TOOLS_LYRA_PUBLISH_PUBLISHEDINTERFERENCE_H
#define ZOR_TOOLS_LYRA_PUBLISH_PUBLISHEDINTERFERENCE_H

#include <array>
#include <string>
#include <vector>

namespace lyra {

struct PublishedProduct {
  std::string colour;   // "#rrggbb" as in the picture; empty when it has none of its own
  std::string preview;  // relative to the page; empty when there is none
  bool isMissing = false;
};

/// Texts in UTF-8.
struct PublishedInterference {
  int number = 0;  // in the whole result, from 1
  std::string type, status;
  std::string picture;  // relative to the page; empty when there is none
  std::vector<std::string> thumbnails;
  std::string whyAsInModel;  // why the picture does not have the result's placements; else empty
  std::array<PublishedProduct, 2> products;
};

}  // namespace lyra

#endif
