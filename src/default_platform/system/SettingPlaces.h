// Where each kind of system keeps a user's settings.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_SETTINGPLACES_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_SETTINGPLACES_H

#include <string>

namespace ZORDefault {

/// Between the directories of a list in the environment.
extern const char kListSeparator;

/// The user's own settings of this software; empty when there is no place for them.
std::string UserSettingDirectory();

}  // namespace ZORDefault

#endif
