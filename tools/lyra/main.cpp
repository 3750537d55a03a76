#include <vector>

#include "lyra/RunLyra.h"
#include "lyra/terminal/Terminal.h"

int main(int inCount, char** inArguments) {
  std::vector<std::string> words = lyra::WordsOfCommandLine(inCount, inArguments);
  std::vector<char*> arguments;
  for (std::string& word : words) arguments.push_back(word.data());
  return lyra::RunLyra(static_cast<int>(arguments.size()), arguments.data());
}
