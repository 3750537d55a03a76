// The element and attribute names that the readers share.
#ifndef ZOR_CLASH_READING_NAMED_CONSTANTS_H
#define ZOR_CLASH_READING_NAMED_CONSTANTS_H

#include "platform/system/ZORUnicodeString.h"

/// One process-wide text a name, built in this order when the library is loaded and released in
/// reverse order when it is unloaded. Each holds the text that it is called by.
namespace names {
extern const ZORUnicodeString Name;
extern const ZORUnicodeString AttrType;
extern const ZORUnicodeString AttrValue;
extern const ZORUnicodeString Component;
extern const ZORUnicodeString Components;
extern const ZORUnicodeString Alias;
extern const ZORUnicodeString Alien;
extern const ZORUnicodeString ComponentAttribute;
extern const ZORUnicodeString ComponentAttributes;
extern const ZORUnicodeString DocumentVersionUUID;
extern const ZORUnicodeString ComponentUuid;
extern const ZORUnicodeString PartNumber;
extern const ZORUnicodeString ShapePosition;
extern const ZORUnicodeString ComponentShape;
extern const ZORUnicodeString ComponentShapes;
extern const ZORUnicodeString ComponentType;
extern const ZORUnicodeString ZORDocument;
extern const ZORUnicodeString Rx;
extern const ZORUnicodeString Ry;
extern const ZORUnicodeString Rz;
extern const ZORUnicodeString T;
extern const ZORUnicodeString Ux;
extern const ZORUnicodeString Uy;
extern const ZORUnicodeString Uz;
extern const ZORUnicodeString PRCName;
extern const ZORUnicodeString ServerMarker;
extern const ZORUnicodeString ShapeId;
extern const ZORUnicodeString ShapeName;
extern const ZORUnicodeString ShapeOnDisk;
extern const ZORUnicodeString ShapeType;
extern const ZORUnicodeString Transaction;
}  // namespace names

#endif
