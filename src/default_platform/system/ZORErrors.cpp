#include "platform/system/ZORErrors.h"

// The errors' destructors are here so that each error has one type identity for every library that
// catches it.
ZORFatalError::ZORFatalError(const std::string& inMessage) : std::runtime_error(inMessage) {}
ZORFatalError::~ZORFatalError() = default;

ZORNullVarError::ZORNullVarError()
    : std::runtime_error("ThrowErrorNullVar: a call through a null interface handle") {}
ZORNullVarError::~ZORNullVarError() = default;

void ThrowErrorNullVar() { throw ZORNullVarError(); }
