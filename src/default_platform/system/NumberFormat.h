// Checking the C formats of one number.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_NUMBERFORMAT_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_NUMBERFORMAT_H

#include <cstddef>
#include <optional>

namespace ZORDefault {

enum class NumberKind { kInt, kDouble };
enum class FormatUse { kPrint, kScan };

/// @return the position of the conversion letter when the format holds, beside plain text and "%%",
/// exactly one conversion and that is of one number of this kind; else nothing. Refused are "*"
/// (it takes or drops an argument), lengths of other types, and widths past four digits.
std::optional<std::size_t> FindConversion(const char* inFormat, NumberKind inKind, FormatUse inUse);

}  // namespace ZORDefault

#endif
