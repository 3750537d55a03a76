// UUIDs by libuuid.
#include <uuid/uuid.h>

#include "foundation/PluginFunction.h"
#include "toolkit/exchange/ExchangeLibrary.h"

ZOR_PLUGIN_FUNCTION void ZORNameUuid(const ZORToolkit::Uuid& inNamespace, const std::string& inName,
                                     ZORToolkit::Uuid& outUuid) {
  uuid_generate_sha1(outUuid.data(), inNamespace.data(), inName.data(), inName.size());
}
