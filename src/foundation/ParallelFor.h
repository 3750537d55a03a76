// A loop shared among threads.
#ifndef ZOR_FOUNDATION_PARALLELFOR_H
#define ZOR_FOUNDATION_PARALLELFOR_H

#include <algorithm>
#include <atomic>
#include <exception>
#include <mutex>
#include <system_error>
#include <thread>
#include <vector>

namespace ZORFoundation {

/// Calls inBody for 0 to inCount - 1, each once, in no particular order. The calling thread takes
/// part; with one thread no other is started. The first exception is rethrown here.
template <class Body>
void ParallelFor(int inThreadCount, int inCount, const Body& inBody) {
  std::atomic<int> next{0};
  std::exception_ptr failure;
  std::mutex failureMutex;
  const auto work = [&] {
    try {
      for (int i = next++; i < inCount; i = next++) inBody(i);
    } catch (...) {
      next = inCount;
      const std::lock_guard lock(failureMutex);
      failure = std::current_exception();
    }
  };
  std::vector<std::thread> workers;
  try {
    for (int i = 1; i < std::min(inThreadCount, inCount); ++i) workers.emplace_back(work);
  } catch (const std::system_error&) {
    // The system allows no more threads: the existing ones do all the work.
  }
  work();
  for (std::thread& worker : workers) worker.join();
  if (failure) std::rethrow_exception(failure);
}

}  // namespace ZORFoundation

#endif
