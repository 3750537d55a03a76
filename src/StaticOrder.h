// The order in which the library's process-wide objects are built.
#ifndef ZOR_STATIC_ORDER_H
#define ZOR_STATIC_ORDER_H

/// Objects with a smaller number are constructed earlier at load and destroyed later at unload,
/// across files. Objects with the same number follow the order within their file.
#define ZOR_STATIC_ORDER(inNumber) __attribute__((init_priority(inNumber)))
#define ZOR_STATIC_ORDER_NAMES ZOR_STATIC_ORDER(1001)
#define ZOR_STATIC_ORDER_WRITER ZOR_STATIC_ORDER(1002)

#endif
