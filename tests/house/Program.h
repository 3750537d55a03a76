// Runs another program and keeps what it printed.
#ifndef ZOR_TESTS_HOUSE_PROGRAM_H
#define ZOR_TESTS_HOUSE_PROGRAM_H

#include <string>
#include <vector>

namespace house {
/// The lines that a shell command prints to its output. @throw std::runtime_error when it fails.
std::vector<std::string> LinesOf(const std::string& inCommand);
}  // namespace house

#endif
