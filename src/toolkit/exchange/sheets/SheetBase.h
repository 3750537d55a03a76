// What a row of a sheet was when it was written; for the toolkit's own sources.
#ifndef ZOR_TOOLKIT_EXCHANGE_SHEETS_SHEET_BASE_H
#define ZOR_TOOLKIT_EXCHANGE_SHEETS_SHEET_BASE_H

#include <sstream>
#include <string>
#include <string_view>

#include "foundation/Hash.h"

namespace ZORToolkit {

inline constexpr char kBaseHeader[] = "Base";

/// White space counts as one blank, and not at all at the ends: tools rewrap texts.
inline std::string Collapsed(std::string_view inText) {
  std::istringstream words{std::string(inText)};
  std::string text;
  for (std::string word; words >> word;) text.append(text.empty() ? "" : " ").append(word);
  return text;
}

inline std::string CommentKey(std::string_view inComment) {
  return inComment.empty() ? ""
                           : ZORFoundation::HexText(ZORFoundation::Hash64Of(Collapsed(inComment)));
}

/// The status and what tells one comment from another.
inline std::string BaseOf(std::string_view inStatus, std::string_view inComment) {
  return std::string(inStatus).append("|").append(CommentKey(inComment));
}

}  // namespace ZORToolkit

#endif
