// The number of interferences that a result set declares.
#ifndef ZOR_CLASH_READING_DECLARED_COUNT_H
#define ZOR_CLASH_READING_DECLARED_COUNT_H

#include "platform/xml/DOM_Node.h"

/// The "NbInterf" of a result set read as a floating number and truncated toward zero; 0 when it is
/// missing or no number, the nearest int when it is beyond the range of int.
int TruncatedDeclaredCount(const DOM_Node& inResultSet);

#endif
