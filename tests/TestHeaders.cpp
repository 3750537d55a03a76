// Nothing: the target that this file is in exists for its precompiled headers.
