// A clash result made long.
#ifndef ZOR_BENCH_PUBLISH_REPEATEDRESULT_H
#define ZOR_BENCH_PUBLISH_REPEATEDRESULT_H

#include <cstddef>
#include <string>

/// Writes a result with as many interferences as wanted, those of another one over and over, each
/// with a name of its own.
/// @return how many differ. Raises std::runtime_error when a file cannot be read or written, or
///         there are none.
std::size_t WriteRepeatedResult(const std::string& inResult, std::size_t inCount,
                                const std::string& inPath);

#endif
