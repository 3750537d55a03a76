// The C locale, for as long as a scope lasts.
#ifndef ZOR_DEFAULT_PLATFORM_SYSTEM_CLOCALE_H
#define ZOR_DEFAULT_PLATFORM_SYSTEM_CLOCALE_H

namespace ZORDefault {

/// While one of these lives, the C library's functions called by this thread use the C locale: a
/// decimal separator is the point, whatever the application chose. Other threads are not touched.
class CLocaleScope {
 public:
  CLocaleScope();
  ~CLocaleScope();
  CLocaleScope(const CLocaleScope&) = delete;
  CLocaleScope& operator=(const CLocaleScope&) = delete;

 private:
  void* previous_;
};

}  // namespace ZORDefault

#endif
