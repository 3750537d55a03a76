// UUIDs by libuuid.
#include <uuid/uuid.h>

#include "toolkit/exchange/ExchangeLibrary.h"

extern "C" __attribute__((visibility("default"))) void ZORNameUuid(
    const ZORToolkit::Uuid& inNamespace, const std::string& inName, ZORToolkit::Uuid& outUuid) {
  uuid_generate_sha1(outUuid.data(), inNamespace.data(), inName.data(), inName.size());
}
