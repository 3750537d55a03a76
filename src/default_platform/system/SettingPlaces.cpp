#include "default_platform/system/SettingPlaces.h"

#include "platform/system/ZORGetEnv.h"

namespace ZORDefault {

const char kListSeparator = ':';

// The rules of XDG base directories: a relative path here is ignored.
std::string UserSettingDirectory() {
  const char* const configuration = ZORGetEnv("XDG_CONFIG_HOME");
  if (configuration && *configuration == '/') return std::string(configuration) + "/zorlyra";
  const char* const home = ZORGetEnv("HOME");
  return home && *home != '\0' ? std::string(home) + "/.config/zorlyra" : std::string();
}

}  // namespace ZORDefault
