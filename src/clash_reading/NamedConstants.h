// The element and attribute names that the readers share.
#ifndef ZOR_CLASH_READING_NAMED_CONSTANTS_H
#define ZOR_CLASH_READING_NAMED_CONSTANTS_H

#include "platform/system/ZORUnicodeString.h"

/// All names, in the order in which they are built.
// clang-format off
#define ZOR_NAMED_CONSTANTS(X) \
  X(Name) \
  X(AttrType) \
  X(AttrValue) \
  X(Component) \
  X(Components) \
  X(Alias) \
  X(Alien) \
  X(ComponentAttribute) \
  X(ComponentAttributes) \
  X(DocumentVersionUUID) \
  X(ComponentUuid) \
  X(PartNumber) \
  X(ShapePosition) \
  X(ComponentShape) \
  X(ComponentShapes) \
  X(ComponentType) \
  X(ZORDocument) \
  X(Rx) \
  X(Ry) \
  X(Rz) \
  X(T) \
  X(Ux) \
  X(Uy) \
  X(Uz) \
  X(PRCName) \
  X(ServerMarker) \
  X(ShapeId) \
  X(ShapeName) \
  X(ShapeOnDisk) \
  X(ShapeType) \
  X(Transaction)
// clang-format on

/// One process-wide text for each name, which holds that name. Built in order when the library is
/// loaded, released in reverse order when it is unloaded.
namespace names {
#define ZOR_DECLARE_NAME(name) extern const ZORUnicodeString name;
ZOR_NAMED_CONSTANTS(ZOR_DECLARE_NAME)
#undef ZOR_DECLARE_NAME
}  // namespace names

#endif
