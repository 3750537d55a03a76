// The platform's 1-based lists.
#ifndef ZOR_PLATFORM_SYSTEM_ZORLISTVAL_H
#define ZOR_PLATFORM_SYSTEM_ZORLISTVAL_H

#include <cstddef>
#include <vector>

#include "platform/ZORPlatformAdditions.h"
#include "platform/system/ZORErrors.h"

/// A list of values whose positions run from 1 to Size(). A position outside raises ZORFatalError.
template <class Value>
class ZORListVal {
 public:
  int Size() const { return static_cast<int>(values_.size()); }
  void Append(const Value& inValue) { values_.push_back(inValue); }
  const Value& operator[](int inPosition) const { return values_[Checked(inPosition)]; }

#if ZOR_PLATFORM_ADDITIONS
  Value& operator[](int inPosition) { return values_[Checked(inPosition)]; }
  void RemoveAll() { values_.clear(); }
#endif

 private:
  std::size_t Checked(int inPosition) const {
    if (inPosition < 1 || inPosition > Size())
      throw ZORFatalError("AssertionFailed:iPos > 0 && iPos <= _Size");
    return static_cast<std::size_t>(inPosition) - 1;
  }

  std::vector<Value> values_;
};

#endif
