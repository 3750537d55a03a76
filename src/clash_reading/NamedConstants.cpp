#include "clash_reading/NamedConstants.h"

#include "StaticOrder.h"

namespace names {
#define ZOR_DEFINE_NAME(name) const ZORUnicodeString name ZOR_STATIC_ORDER_NAMES(#name);
ZOR_NAMED_CONSTANTS(ZOR_DEFINE_NAME)
#undef ZOR_DEFINE_NAME
}  // namespace names

namespace {

// The narrow forms are made while the library is loaded, so that readers on different threads only
// ever read these objects.
struct NarrowForms {
  NarrowForms() {
#define ZOR_MAKE_NARROW_FORM(name) names::name.ConvertToChar();
    ZOR_NAMED_CONSTANTS(ZOR_MAKE_NARROW_FORM)
#undef ZOR_MAKE_NARROW_FORM
  }
} narrowForms ZOR_STATIC_ORDER_NAMES;

}  // namespace
