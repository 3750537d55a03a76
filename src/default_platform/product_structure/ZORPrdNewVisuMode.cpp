#include <cstring>

#include "platform/product_structure/ZORIProductInSession.h"
#include "platform/system/ZORGetEnv.h"

int ZORPrdNewVisuMode() {
  const char* const mode = ZORGetEnv("ZOR_NEW_VISU_MODE");
  return mode && std::strcmp(mode, "0") == 0 ? 0 : 1;
}
