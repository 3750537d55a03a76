#include <cstdio>
#include <new>
#include <string>
#include <vector>

#include "foundation/WindowsCalls.h"
#include "lyra/RunLyra.h"
// After the types that it needs.
#include <shellapi.h>

namespace {

/// The command line in UTF-8: the narrow words have lost what the ANSI code page lacks.
std::vector<std::string> WordsOfCommandLine(int inCount, char** inArguments) {
  int count = 0;
  LPWSTR* const words = CommandLineToArgvW(GetCommandLineW(), &count);
  if (words == nullptr) return {inArguments, inArguments + inCount};
  std::vector<std::string> texts;
  for (int i = 0; i < count; ++i) texts.push_back(ZORFoundation::Utf8Text(words[i]));
  LocalFree(words);
  return texts;
}

}  // namespace

int main(int inCount, char** inArguments) try {
  std::vector<std::string> words = WordsOfCommandLine(inCount, inArguments);
  std::vector<char*> arguments;
  for (std::string& word : words) arguments.push_back(word.data());
  return lyra::RunLyra(static_cast<int>(arguments.size()), arguments.data());
} catch (const std::bad_alloc&) {
  std::fputs("lyra: there is not enough memory\n", stderr);
  return 1;
}
