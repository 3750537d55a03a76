#include "toolkit/scenes/ModelLimits.h"

#include <algorithm>
#include <string>

#include "platform/system/ZORSettingRepository.h"
#include "toolkit/Error.h"

namespace ZORToolkit {

long long ModelLimit(const char* inName, const std::optional<long long>& inGiven,
                     const char* inSetting) {
  constexpr long long kMaxLimit = 1'000'000;
  if (inGiven && (*inGiven < 1 || *inGiven > kMaxLimit))
    throw UsageError(std::string(inName) + ": 1 to " + std::to_string(kMaxLimit));
  if (inGiven) return *inGiven;
  int limit = 0;
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("ModelReading");
  if (settings == nullptr || FAILED(settings->ReadSetting(inSetting, &limit, 1))) return 0;
  return std::max(0, limit);
}

}  // namespace ZORToolkit
