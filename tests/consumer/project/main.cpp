#include <ZORClashParsing.h>

#include <cstdio>

int main(int inCount, char** inArguments) {
  if (inCount != 2) return 2;
  ZORClashParsing reader(inArguments[1]);
  ZORUnicodeString kind, reference, version, result;
  if (reader.LoadSequence(kind, reference, version) != S_OK) return 1;

  int count = 0;
  reader.GetClashGeneralInfos(result, count);
  std::printf("%s %s: %d interferences\n", kind.ConvertToChar(), version.ConvertToChar(), count);
}
