// Functions of a test program in the place of a library's.
#ifndef ZOR_TESTS_WINDOWS_REPLACED_FUNCTIONS_H
#define ZOR_TESTS_WINDOWS_REPLACED_FUNCTIONS_H

namespace support {

/// While it lives, a library's function is its own again.
class OriginalInPlace {
 public:
  explicit OriginalInPlace(const char* inName);
  ~OriginalInPlace();
  OriginalInPlace(const OriginalInPlace&) = delete;
  OriginalInPlace& operator=(const OriginalInPlace&) = delete;
  void* Address() const;

 private:
  const struct ReplacedFunction& function_;
};

}  // namespace support

#endif
