#include <cstdio>
#include <new>
#include <string>
#include <vector>

#include "foundation/Process.h"
#include "lyra/RunLyra.h"

int main(int inCount, char** inArguments) try {
  std::vector<std::string> words = ZORFoundation::WordsOfCommandLine(inCount, inArguments);
  std::vector<char*> arguments;
  for (std::string& word : words) arguments.push_back(word.data());
  return lyra::RunLyra(static_cast<int>(arguments.size()), arguments.data());
} catch (const std::bad_alloc&) {
  std::fputs("lyra: there is not enough memory\n", stderr);
  return 1;
}
