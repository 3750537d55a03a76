// The data of a page's script, besides what the page shows.
#ifndef ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_DATA_H
#define ZOR_TOOLKIT_PUBLISHING_PAGE_PAGE_DATA_H

#include <string>
#include <string_view>
#include <vector>

#include "toolkit/review/Group.h"

namespace ZORToolkit {

struct PageData {
  std::string document;    ///< what the result is called
  std::string hash;        ///< DocumentHash of its bytes; empty when they are not known
  std::string sha256;      ///< likewise
  bool isOneFile = false;  ///< the result and the geometry stand in the page
  bool hasGeometry = false;
};

/// JSON in ASCII that can stand in a script element.
/// @param inIsShown for each interference, whether the page has it.
std::string JsonOf(const PageData& inData, const ReviewedResult& inResult,
                   const std::vector<bool>& inIsShown);

}  // namespace ZORToolkit

#endif
