// A 1-based list of component handles.
#ifndef ZOR_PLATFORM_SYSTEM_ZORLISTVALZORBASEUNKNOWN_VAR_H
#define ZOR_PLATFORM_SYSTEM_ZORLISTVALZORBASEUNKNOWN_VAR_H

#include "platform/system/ZORInterfaceHandle.h"
#include "platform/system/ZORListVal.h"

typedef ZORListVal<ZORBaseUnknown_var> ZORListValZORBaseUnknown_var;

#endif
