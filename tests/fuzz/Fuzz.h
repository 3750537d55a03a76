// What the fuzz harnesses share. Each is one file with the entry that libFuzzer calls; where that is
// missing, Driver.cpp takes its place.
#ifndef ZOR_TESTS_FUZZ_FUZZ_H
#define ZOR_TESTS_FUZZ_FUZZ_H

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

/// The entry: one input. @return 0.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize);

namespace fuzz {

inline std::string Text(const std::uint8_t* inBytes, std::size_t inSize) {
  return std::string(inBytes, inBytes + inSize);
}

/// Ends the program as a finding unless something holds.
inline void Require(bool inHolds, const std::string& inWhat) {
  if (inHolds) return;
  std::fprintf(stderr, "FINDING: %s\n", inWhat.c_str());
  std::abort();
}

}  // namespace fuzz

#endif
