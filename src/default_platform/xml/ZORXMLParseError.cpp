#include "platform/xml/ZORXMLParseError.h"

namespace {
std::string Message(const std::string& inSource, std::uint64_t inLine, std::uint64_t inColumn,
                    const std::string& inReason) {
  std::string place = inSource;
  if (inLine != 0) place.append(":").append(std::to_string(inLine));
  if (inColumn != 0) place.append(":").append(std::to_string(inColumn));
  return place.append(": ").append(inReason);
}
}  // namespace

ZORXMLParseError::ZORXMLParseError(const std::string& inSource, std::uint64_t inLine,
                                   std::uint64_t inColumn, const std::string& inReason)
    : std::runtime_error(Message(inSource, inLine, inColumn, inReason)),
      source(inSource),
      line(inLine),
      column(inColumn),
      reason(inReason) {}

ZORXMLParseError::~ZORXMLParseError() = default;
