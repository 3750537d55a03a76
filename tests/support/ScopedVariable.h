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

/// Sets a variable of the environment, or unsets it, and restores its former state at the end.
class ScopedVariable {
 public:
  ScopedVariable(const char* inName, const std::optional<std::string>& inValue) : name_(inName) {
    if (const char* const former = std::getenv(inName)) former_ = former;
    Set(inValue);
  }
  ~ScopedVariable() { Set(former_); }
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
#ifdef _WIN32
  void Set(const std::optional<std::string>& inValue) {
    _putenv_s(name_, inValue ? inValue->c_str() : "");
    // An empty value too, which the C library takes for none.
    SetEnvironmentVariableA(name_, inValue ? inValue->c_str() : nullptr);
  }
#else
  void Set(const std::optional<std::string>& inValue) {
    if (inValue)
      setenv(name_, inValue->c_str(), 1);
    else
      unsetenv(name_);
  }
#endif

  const char* name_;
  std::optional<std::string> former_;
};

}  // namespace support

#endif
