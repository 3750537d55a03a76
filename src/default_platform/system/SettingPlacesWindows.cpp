#include "default_platform/system/SettingPlaces.h"
#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {

const char kListSeparator = ';';  // a colon follows the letter of a drive

std::string UserSettingDirectory() {
  const char* const roaming = ZORGetEnv("APPDATA");
  return roaming && *roaming != '\0' ? std::string(roaming) + "/zorlyra" : std::string();
}

}  // namespace ZORDefault
