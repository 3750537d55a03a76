// A variable of the environment for as long as a test needs it.
#ifndef ZOR_TESTS_SUPPORT_SCOPED_VARIABLE_H
#define ZOR_TESTS_SUPPORT_SCOPED_VARIABLE_H

#include <cstdlib>
#include <optional>
#include <string>

#ifdef _WIN32
extern "C" __declspec(dllimport) int __stdcall SetEnvironmentVariableA(const char*, const char*);
#endif

namespace support {

/// Sets a variable of the environment and restores its former state at the end.
class ScopedVariable {
 public:
  ScopedVariable(const char* inName, const std::string& inValue) : name_(inName) {
    if (const char* const former = std::getenv(inName)) former_ = former;
    Set(inValue.c_str());
  }
  ~ScopedVariable() { Set(former_ ? former_->c_str() : nullptr); }
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
#ifdef _WIN32
  void Set(const char* inValue) {
    _putenv_s(name_, inValue == nullptr ? "" : inValue);
    SetEnvironmentVariableA(name_,
                            inValue);  // an empty value too, which the C library takes for none
  }
#else
  void Set(const char* inValue) {
    if (inValue == nullptr)
      unsetenv(name_);
    else
      setenv(name_, inValue, 1);
  }
#endif

  const char* name_;
  std::optional<std::string> former_;
};

}  // namespace support

#endif
