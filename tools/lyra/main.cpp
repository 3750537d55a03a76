#include "lyra/RunLyra.h"

int main(int inCount, char** inArguments) { return lyra::RunLyra(inCount, inArguments); }
