// A variable of the environment for as long as a test needs it.
#ifndef ZOR_TESTS_SUPPORT_SCOPED_VARIABLE_H
#define ZOR_TESTS_SUPPORT_SCOPED_VARIABLE_H

#include <cstdlib>
#include <optional>
#include <string>

namespace support {

/// Sets a variable of the environment and restores its former state at the end.
class ScopedVariable {
 public:
  ScopedVariable(const char* inName, const std::string& inValue) : name_(inName) {
    if (const char* const former = std::getenv(inName)) former_ = former;
    setenv(inName, inValue.c_str(), 1);
  }
  ~ScopedVariable() {
    if (former_)
      setenv(name_, former_->c_str(), 1);
    else
      unsetenv(name_);
  }
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
  const char* name_;
  std::optional<std::string> former_;
};

}  // namespace support

#endif
