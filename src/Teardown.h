// Cleaning up through calls that may raise errors.
#ifndef ZOR_TEARDOWN_H
#define ZOR_TEARDOWN_H

#include <cstddef>
#include <functional>
#include <utility>
#include <vector>

/// The cleanup steps of one operation, calls of the platform that may raise errors. A destructor
/// cannot pass these on, so Run is called on the normal path. If an error leaves the operation
/// early, the destructor makes the remaining steps and drops what they raise: the first error is
/// the one that reaches the caller.
class Teardown {
 public:
  Teardown() = default;
  ~Teardown() {
    while (next_ < steps_.size()) {
      try {
        Run();
      } catch (...) {
        continue;  // with the step after the one that failed
      }
    }
  }
  Teardown(const Teardown&) = delete;
  Teardown& operator=(const Teardown&) = delete;

  void Add(std::function<void()> inStep) { steps_.push_back(std::move(inStep)); }
  /// Makes the remaining steps in the order in which they were added.
  void Run() {
    while (next_ < steps_.size()) steps_[next_++]();
  }

 private:
  std::vector<std::function<void()>> steps_;
  std::size_t next_ = 0;
};

#endif
