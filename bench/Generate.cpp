// zor_generate COUNT [--components] > FILE: a clash document of any size.
#include <charconv>
#include <iostream>
#include <string_view>

#include "ClashDocumentGenerator.h"

int main(int inCount, char** inArguments) {
  const std::string_view number = inCount > 1 ? inArguments[1] : "";
  std::size_t count = 0;
  const auto [end, error] = std::from_chars(number.data(), number.data() + number.size(), count);
  const bool components = inCount == 3 && std::string_view(inArguments[2]) == "--components";
  if (error != std::errc() || end != number.data() + number.size() ||
      !(inCount == 2 || components)) {
    std::cerr << "usage: zor_generate COUNT [--components] > FILE\n";
    return 2;
  }
  components ? WriteComponentsDocument(count, 1, std::cout)
             : WriteClashDocument(count, 1, std::cout);
  std::cout.flush();
  return std::cout ? 0 : 1;
}
