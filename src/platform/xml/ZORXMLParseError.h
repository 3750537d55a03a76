// The error that a malformed document raises.
#ifndef ZOR_PLATFORM_XML_ZORXMLPARSEERROR_H
#define ZOR_PLATFORM_XML_ZORXMLPARSEERROR_H

#include <cstdint>
#include <stdexcept>
#include <string>

#include "ZORPlatformExport.h"
#include "platform/ZORPlatformAdditions.h"

#if ZOR_PLATFORM_ADDITIONS
/// A document that cannot be read. what() is "SOURCE:LINE:COLUMN: REASON", without the numbers that
/// are 0.
class ZOR_PLATFORM_EXPORT ZORXMLParseError : public std::runtime_error {
 public:
  ZORXMLParseError(const std::string& inSource, std::uint64_t inLine, std::uint64_t inColumn,
                   const std::string& inReason);
  ~ZORXMLParseError() override;

  std::string source;    ///< the path, or the identifier of an in-memory document; narrow text
  std::uint64_t line;    ///< from 1; 0 when the reason has no place
  std::uint64_t column;  ///< from 1; 0 when the reason has no place
  std::string reason;    ///< one line
};
#endif

#endif
