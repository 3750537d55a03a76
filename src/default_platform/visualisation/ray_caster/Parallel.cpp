#include "default_platform/visualisation/ray_caster/Parallel.h"

#include <algorithm>
#include <atomic>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

namespace ZORRayCaster {

void ForEach(int inThreadCount, int inCount, const std::function<void(int)>& inWork) {
  std::atomic<int> next{0};
  std::exception_ptr failure;
  std::mutex failureMutex;
  const auto work = [&] {
    try {
      for (int i = next++; i < inCount; i = next++) inWork(i);
    } catch (...) {
      next = inCount;
      const std::lock_guard lock(failureMutex);
      failure = std::current_exception();
    }
  };
  std::vector<std::thread> helpers;
  try {
    for (int i = 1; i < std::min(inThreadCount, inCount); ++i) helpers.emplace_back(work);
  } catch (const std::system_error&) {
    // No more threads to be had: those that are there do all of it.
  }
  work();
  for (std::thread& helper : helpers) helper.join();
  if (failure) std::rethrow_exception(failure);
}

}  // namespace ZORRayCaster
