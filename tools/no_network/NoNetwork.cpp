// A library in the place of libcurl that has no network.
//
// The system's Xerces-C brings libcurl and, through it, some thirty libraries for protocols that a
// command reading local files never speaks. Loading them takes longer than all that `lyra info`
// does. The command finds this file first, so that it starts fast and cannot reach a network even
// in error. Every operation fails in the way that libcurl documents, and counts that callers loop
// on are written as "nothing is running".
#include <cstddef>

namespace {
constexpr int kEasyFailed = 2;   // CURLE_FAILED_INIT
constexpr int kMultiFailed = 1;  // CURLM_BAD_HANDLE
}  // namespace

#define ZOR_STAND_IN extern "C" __attribute__((visibility("default")))

ZOR_STAND_IN int curl_global_init(long) { return kEasyFailed; }
ZOR_STAND_IN void curl_global_cleanup() {}

ZOR_STAND_IN void* curl_easy_init() { return nullptr; }
ZOR_STAND_IN void curl_easy_cleanup(void*) {}
ZOR_STAND_IN int curl_easy_setopt(void*, int, ...) { return kEasyFailed; }
ZOR_STAND_IN int curl_easy_getinfo(void*, int, ...) { return kEasyFailed; }

ZOR_STAND_IN void* curl_multi_init() { return nullptr; }
ZOR_STAND_IN int curl_multi_cleanup(void*) { return kMultiFailed; }
ZOR_STAND_IN int curl_multi_add_handle(void*, void*) { return kMultiFailed; }
ZOR_STAND_IN int curl_multi_remove_handle(void*, void*) { return kMultiFailed; }

ZOR_STAND_IN int curl_multi_perform(void*, int* outRunning) {
  if (outRunning != nullptr) *outRunning = 0;
  return kMultiFailed;
}

ZOR_STAND_IN void* curl_multi_info_read(void*, int* outWaiting) {
  if (outWaiting != nullptr) *outWaiting = 0;
  return nullptr;
}

ZOR_STAND_IN int curl_multi_fdset(void*, void*, void*, void*, int* outHighest) {
  if (outHighest != nullptr) *outHighest = -1;
  return kMultiFailed;
}

ZOR_STAND_IN int curl_multi_timeout(void*, long* outMilliseconds) {
  if (outMilliseconds != nullptr) *outMilliseconds = 0;
  return kMultiFailed;
}

ZOR_STAND_IN void* curl_slist_append(void*, const char*) { return nullptr; }
ZOR_STAND_IN void curl_slist_free_all(void*) {}
