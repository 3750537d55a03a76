// The order in which the library's process-wide objects are built.
#ifndef ZOR_STATIC_ORDER_H
#define ZOR_STATIC_ORDER_H

/// Objects of a smaller number are built earlier at load, whatever file they stand in, and released
/// later at unload. Within a number the order of the file holds.
#define ZOR_STATIC_ORDER(inNumber) __attribute__((init_priority(inNumber)))
#define ZOR_STATIC_ORDER_NAMES ZOR_STATIC_ORDER(1001)
#define ZOR_STATIC_ORDER_WRITER ZOR_STATIC_ORDER(1002)

#endif
