// Windows makes UUIDs by chance and of the clock only: those of names are RFC 4122's, 4.3, on its SHA-1.
#include <algorithm>

#include "foundation/PluginFunction.h"
#include "foundation/WindowsCalls.h"
#include "toolkit/exchange/ExchangeLibrary.h"
// After the types that it needs.
#include <bcrypt.h>

ZOR_PLUGIN_FUNCTION void ZORNameUuid(const ZORToolkit::Uuid& inNamespace, const std::string& inName,
                                     ZORToolkit::Uuid& outUuid) {
  std::vector<unsigned char> bytes(inNamespace.begin(), inNamespace.end());
  bytes.insert(bytes.end(), inName.begin(), inName.end());
  std::array<unsigned char, 20> hash{};
  BCRYPT_ALG_HANDLE algorithm = nullptr;
  BCryptOpenAlgorithmProvider(&algorithm, BCRYPT_SHA1_ALGORITHM, nullptr, 0);
  BCryptHash(algorithm, nullptr, 0, bytes.data(), static_cast<ULONG>(bytes.size()), hash.data(),
             static_cast<ULONG>(hash.size()));
  BCryptCloseAlgorithmProvider(algorithm, 0);
  std::copy_n(hash.begin(), outUuid.size(), outUuid.begin());
  outUuid[6] = static_cast<unsigned char>((outUuid[6] & 0x0F) | 0x50);
  outUuid[8] = static_cast<unsigned char>((outUuid[8] & 0x3F) | 0x80);
}
