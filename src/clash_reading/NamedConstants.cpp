#include "clash_reading/NamedConstants.h"

#include "StaticOrder.h"

namespace names {
const ZORUnicodeString Name ZOR_STATIC_ORDER_NAMES("Name");
const ZORUnicodeString AttrType ZOR_STATIC_ORDER_NAMES("AttrType");
const ZORUnicodeString AttrValue ZOR_STATIC_ORDER_NAMES("AttrValue");
const ZORUnicodeString Component ZOR_STATIC_ORDER_NAMES("Component");
const ZORUnicodeString Components ZOR_STATIC_ORDER_NAMES("Components");
const ZORUnicodeString Alias ZOR_STATIC_ORDER_NAMES("Alias");
const ZORUnicodeString Alien ZOR_STATIC_ORDER_NAMES("Alien");
const ZORUnicodeString ComponentAttribute ZOR_STATIC_ORDER_NAMES("ComponentAttribute");
const ZORUnicodeString ComponentAttributes ZOR_STATIC_ORDER_NAMES("ComponentAttributes");
const ZORUnicodeString DocumentVersionUUID ZOR_STATIC_ORDER_NAMES("DocumentVersionUUID");
const ZORUnicodeString ComponentUuid ZOR_STATIC_ORDER_NAMES("ComponentUuid");
const ZORUnicodeString PartNumber ZOR_STATIC_ORDER_NAMES("PartNumber");
const ZORUnicodeString ShapePosition ZOR_STATIC_ORDER_NAMES("ShapePosition");
const ZORUnicodeString ComponentShape ZOR_STATIC_ORDER_NAMES("ComponentShape");
const ZORUnicodeString ComponentShapes ZOR_STATIC_ORDER_NAMES("ComponentShapes");
const ZORUnicodeString ComponentType ZOR_STATIC_ORDER_NAMES("ComponentType");
const ZORUnicodeString ZORDocument ZOR_STATIC_ORDER_NAMES("ZORDocument");
const ZORUnicodeString Rx ZOR_STATIC_ORDER_NAMES("Rx");
const ZORUnicodeString Ry ZOR_STATIC_ORDER_NAMES("Ry");
const ZORUnicodeString Rz ZOR_STATIC_ORDER_NAMES("Rz");
const ZORUnicodeString T ZOR_STATIC_ORDER_NAMES("T");
const ZORUnicodeString Ux ZOR_STATIC_ORDER_NAMES("Ux");
const ZORUnicodeString Uy ZOR_STATIC_ORDER_NAMES("Uy");
const ZORUnicodeString Uz ZOR_STATIC_ORDER_NAMES("Uz");
const ZORUnicodeString PRCName ZOR_STATIC_ORDER_NAMES("PRCName");
const ZORUnicodeString ServerMarker ZOR_STATIC_ORDER_NAMES("ServerMarker");
const ZORUnicodeString ShapeId ZOR_STATIC_ORDER_NAMES("ShapeId");
const ZORUnicodeString ShapeName ZOR_STATIC_ORDER_NAMES("ShapeName");
const ZORUnicodeString ShapeOnDisk ZOR_STATIC_ORDER_NAMES("ShapeOnDisk");
const ZORUnicodeString ShapeType ZOR_STATIC_ORDER_NAMES("ShapeType");
const ZORUnicodeString Transaction ZOR_STATIC_ORDER_NAMES("Transaction");
}  // namespace names

namespace {

// The narrow forms are made while the library is loaded, so that readers on different threads only
// ever read these objects.
struct NarrowForms {
  NarrowForms() {
    using namespace names;
    for (const ZORUnicodeString* name : {&Name,
                                         &AttrType,
                                         &AttrValue,
                                         &Component,
                                         &Components,
                                         &Alias,
                                         &Alien,
                                         &ComponentAttribute,
                                         &ComponentAttributes,
                                         &DocumentVersionUUID,
                                         &ComponentUuid,
                                         &PartNumber,
                                         &ShapePosition,
                                         &ComponentShape,
                                         &ComponentShapes,
                                         &ComponentType,
                                         &ZORDocument,
                                         &Rx,
                                         &Ry,
                                         &Rz,
                                         &T,
                                         &Ux,
                                         &Uy,
                                         &Uz,
                                         &PRCName,
                                         &ServerMarker,
                                         &ShapeId,
                                         &ShapeName,
                                         &ShapeOnDisk,
                                         &ShapeType,
                                         &Transaction})
      name->ConvertToChar();
  }
} narrowForms ZOR_STATIC_ORDER_NAMES;

}  // namespace
